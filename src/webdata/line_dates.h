#pragma once
// The date of one data-file line in each of the nine layouts.

#include "support/date_value.h"

#include <QString>
#include <QStringList>

namespace quorvel {

enum DataType : int {
    kNoDate = 0,
    kDateTime = 1,
    kDateComma = 2, // "Date,Time"
    kYmdhm = 3,
    kCsi = 4,
    kCimis = 5,
    kGemini = 6,
    kDecagon = 7,
    kTeksmart = 8,
};

// "[no date]", "DateTime", ... "Teksmart", by index.
const QStringList& DataTypeNames();

struct LineDate {
    bool found = false;   // a date was read, or the type reads none
    bool hasDate = false; // value holds the line's date
    DateValue value = 0;
    QString firstField; // field 0, with quotes removed
};

// The fields of a line: separated by tab when it has one, else by comma when it
// has one, else by space; double quotes removed.
QStringList LineFields(const QString& line);

// Reads the date of a line. A missing field or a field that is not a number
// where one is needed throws WebDataError. Types other than 1 to 8 read no
// date and count as found; a line of fewer than two fields, or whose date lies
// outside the calendar, is not found.
LineDate DateOfLine(const QString& line, int dataType);

// Whether the types reads a date from each line (1 to 8).
inline bool ReadsDates(int dataType) {
    return dataType >= kDateTime && dataType <= kTeksmart;
}

// From 1 January 100 to 31 December 9999; a date outside is no date.
bool InCalendar(DateValue value);

} // namespace quorvel
