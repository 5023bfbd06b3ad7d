// Nobody answers in "/S" mode or in the command-line run: every box answers
// at once (or through the window's timed box) and is written to the log.

#include "app/run/unattended_prompter.h"
#include "common/recorders.h"
#include "common/temp_home.h"
#include "support/program_home.h"

#include <QFile>

#include <gtest/gtest.h>

namespace quorvel {
namespace {

using testing::RecordingPrompter;
using testing::TempHome;

QString Log() {
    QFile f(ProgramHome::LogFile());
    return f.open(QIODevice::ReadOnly) ? QString::fromUtf8(f.readAll()) : QString();
}

TEST(UnattendedBoxTest, AnswersAtOnceAndLogsTheMessage) {
    struct Case {
        bool system; // the waiting box (SystemMsgBox) or the timed one
        int buttons;
        int answer; // without a window
        const char* logged;
    };
    const Case cases[] = {
        {false, kButtonsOk, kAnswerOk, "Message: Line one | line two (answered OK)"},
        {false, kButtonsYesNo, kAnswerYes, "(answered Yes)"}, // the box's default
        {false, kButtonsRetryCancel, kAnswerRetry, "(answered Retry)"},
        {true, kButtonsYesNo | kIconQuestion, kAnswerNo, "(answered No)"}, // "debug ?"
        {true, kButtonsOkCancel, kAnswerCancel, "(answered Cancel)"},
        {true, kButtonsOk | kIconExclamation, kAnswerOk, "(answered OK)"},
    };
    for (const Case& c : cases) {
        SCOPED_TRACE(std::string(c.system ? "waiting " : "timed ") + c.logged);
        TempHome home; // a log of its own
        UnattendedPrompter prompter;
        QStringList watched;
        prompter.SetWatcher([&](const QString& m) { watched << m; });
        const QString message = QStringLiteral("Line one\r\n  line two");
        const int answer = c.system ? prompter.SystemMsgBox(message, c.buttons)
                                    : prompter.MyMsgBox(message, c.buttons);
        EXPECT_EQ(answer, c.answer);
        EXPECT_TRUE(Log().contains(QString::fromUtf8(c.logged))) << Log().toStdString();
        EXPECT_EQ(watched, QStringList{message});
    }
}

TEST(UnattendedWindowBoxTest, TheWindowsTimedBoxShowsEveryMessageWithOkOnlyForWaitingOnes) {
    TempHome home;
    RecordingPrompter timed;
    timed.Script(kAnswerNo);
    UnattendedPrompter prompter(&timed);
    EXPECT_EQ(prompter.MyMsgBox("Retry the file?", kButtonsYesNo), kAnswerNo); // its answer
    EXPECT_EQ(prompter.SystemMsgBox("Do you want to debug ?", kButtonsYesNo | kIconQuestion),
              kAnswerNo);
    ASSERT_EQ(timed.shown.size(), 2u);
    EXPECT_EQ(timed.shown[1].message, "Do you want to debug ?");
    EXPECT_EQ(timed.shown[1].buttons & 7, kButtonsOk);
}

} // namespace
} // namespace quorvel
