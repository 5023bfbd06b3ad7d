#include "app/run/unattended_prompter.h"

#include "app/run/run_prompter.h"
#include "support/log_file.h"
#include "support/program_home.h"

#include <QRegularExpression>

namespace quorvel {

namespace {

QString AnswerName(int answer) {
    switch (answer) {
    case kAnswerOk:
        return QStringLiteral("OK");
    case kAnswerCancel:
        return QStringLiteral("Cancel");
    case kAnswerRetry:
        return QStringLiteral("Retry");
    case kAnswerYes:
        return QStringLiteral("Yes");
    case kAnswerNo:
        return QStringLiteral("No");
    default:
        return QString::number(answer);
    }
}

} // namespace

QString UnattendedPrompter::LogLine(const QString& message, int answer) {
    static const QRegularExpression lineEnds(QStringLiteral("\\s*(\r\n|\n|\r)\\s*"));
    return QStringLiteral("Message: ") + QString(message).replace(lineEnds, QStringLiteral(" | ")) +
           QStringLiteral(" (answered ") + AnswerName(answer) + u')';
}

int UnattendedPrompter::Note(const QString& message, int answer) {
    // Straight to the file: a log that cannot be written must not raise a
    // box that comes back here.
    AppendLogLine(ProgramHome::LogFile(), LogLine(message, answer));
    if (watcher_) watcher_(message);
    return answer;
}

int UnattendedPrompter::MyMsgBox(const QString& message, int buttons) {
    const int answer = timed_ ? timed_->MyMsgBox(message, buttons) : DefaultAnswer(buttons);
    return Note(message, answer);
}

int UnattendedPrompter::SystemMsgBox(const QString& message, int buttons) {
    if (timed_) timed_->MyMsgBox(message, kButtonsOk | (buttons & ~7));
    return Note(message, QuietAnswer(buttons));
}

} // namespace quorvel
