#include "support/log_file.h"

#include "support/date_value.h"
#include "support/error_box.h"
#include "support/program_home.h"

#include <QFile>

namespace quorvel {

bool AppendLogLine(const QString& file, const QString& text) {
    QFile log(file);
    if (!log.open(QIODevice::WriteOnly | QIODevice::Append)) return false;
    const QByteArray line =
        (FormatDate(NowValue(), kPatternIso) + u':' + text + QStringLiteral("\r\n")).toUtf8();
    return log.write(line) == line.size();
}

void WriteLogFile(const QString& text) {
    const QString file = ProgramHome::LogFile();
    if (!AppendLogLine(file, text))
        ShowErrorBox(QStringLiteral("Could not write to the log file"), file);
}

} // namespace quorvel
