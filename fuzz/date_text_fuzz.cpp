// The date of a data-file line in every layout, and the date texts: whatever
// the line, a date read lies in the calendar, and its text reads back to the
// same text.
#include "fuzz_input.h"
#include "support/date_text.h"
#include "support/program_home.h"
#include "webdata/date_texts.h"
#include "webdata/line_dates.h"
#include "webdata/webdata_error.h"

#include <QCoreApplication>
#include <QFile>
#include <QTemporaryDir>

#include <cstdlib>

namespace {

void CheckDate(quorvel::DateValue value) {
    if (value == 0) return;
    if (!quorvel::InCalendar(value)) std::abort();
    // The text reads back to a value that gives the same text again.
    const QString iso = quorvel::FormatDateIso(value);
    const std::optional<quorvel::DateValue> back = quorvel::ParseDateText(iso);
    if (!back || quorvel::FormatDateIso(*back) != iso) std::abort();
    const QString shown = quorvel::FormatDateLong(value);
    if (quorvel::FormatDateLong(*back) != shown) std::abort();
}

} // namespace

extern "C" int LLVMFuzzerInitialize(int* argc, char*** argv) {
    static QCoreApplication app(*argc, *argv);
    static QTemporaryDir home; // unreadable texts are written to the log here
    quorvel::ProgramHome::SetFolder(home.path());
    return 0;
}

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
    static int runs = 0;
    if (++runs % 1000 == 0) QFile::remove(quorvel::ProgramHome::LogFile());
    quorvel::fuzz::Input input(data, size);
    const int type = input.Byte() % 10;
    const QString line = QString::fromUtf8(input.Rest());
    try {
        const quorvel::LineDate date = quorvel::DateOfLine(line, type);
        if (date.hasDate) CheckDate(date.value);
        if (date.hasDate != (date.found && quorvel::ReadsDates(type))) std::abort();
    } catch (const quorvel::WebDataError&) {
        // A missing field or a number that does not fit: reported by the caller.
    }
    const quorvel::DateValue value = quorvel::DateTimeValue(line);
    if (quorvel::InCalendar(value)) CheckDate(value);
    quorvel::FormatDateLong(value);
    quorvel::FormatDateIso(value);
    return 0;
}
