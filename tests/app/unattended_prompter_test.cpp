// Nobody answers in "/S" mode or in the command-line run: every box answers
// at once (or through the window's timed box) and is written to the log.

#include "app/run/unattended_prompter.h"
#include "common/recorders.h"
#include "common/temp_home.h"
#include "support/program_home.h"

#include <QFile>

#include <gtest/gtest.h>

#include <ostream>

namespace quorvel {
namespace {

using testing::RecordingPrompter;
using testing::TempHome;

struct BoxCase {
    const char* name;
    bool system; // the waiting box (SystemMsgBox) or the timed one
    int buttons;
    int answer; // without a window
    const char* logged;
};
// The case's name in test listings.
void PrintTo(const BoxCase& c, std::ostream* out) {
    *out << c.name;
}

class UnattendedBoxTest : public ::testing::TestWithParam<BoxCase> {
protected:
    UnattendedBoxTest() { ProgramHome::SetFolder(home.Path()); }
    ~UnattendedBoxTest() override { ProgramHome::SetFolder({}); }
    QString Log() const {
        QFile f(ProgramHome::LogFile());
        return f.open(QIODevice::ReadOnly) ? QString::fromUtf8(f.readAll()) : QString();
    }
    TempHome home;
};

TEST_P(UnattendedBoxTest, AnswersAtOnceAndLogsTheMessage) {
    const BoxCase& c = GetParam();
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

INSTANTIATE_TEST_SUITE_P(
    Boxes, UnattendedBoxTest,
    ::testing::Values(
        BoxCase{"TimedOkIsOk", false, kButtonsOk, kAnswerOk,
                "Message: Line one | line two (answered OK)"},
        BoxCase{"TimedYesNoTakesItsDefault", false, kButtonsYesNo, kAnswerYes, "(answered Yes)"},
        BoxCase{"TimedRetryCancelTakesItsDefault", false, kButtonsRetryCancel, kAnswerRetry,
                "(answered Retry)"},
        BoxCase{"DebugQuestionIsAnsweredNo", true, kButtonsYesNo | kIconQuestion, kAnswerNo,
                "(answered No)"},
        BoxCase{"WaitingOkCancelIsCancelled", true, kButtonsOkCancel, kAnswerCancel,
                "(answered Cancel)"},
        BoxCase{"WaitingOkIsOk", true, kButtonsOk | kIconExclamation, kAnswerOk, "(answered OK)"}),
    [](const auto& info) { return std::string(info.param.name); });

TEST(UnattendedWindowBoxTest, TheWindowsTimedBoxShowsEveryMessageWithOkOnlyForWaitingOnes) {
    TempHome home;
    ProgramHome::SetFolder(home.Path());
    RecordingPrompter timed;
    timed.Script(kAnswerNo);
    UnattendedPrompter prompter(&timed);
    EXPECT_EQ(prompter.MyMsgBox("Retry the file?", kButtonsYesNo), kAnswerNo); // its answer
    EXPECT_EQ(prompter.SystemMsgBox("Do you want to debug ?", kButtonsYesNo | kIconQuestion),
              kAnswerNo);
    ASSERT_EQ(timed.shown.size(), 2u);
    EXPECT_EQ(timed.shown[1].message, "Do you want to debug ?");
    EXPECT_EQ(timed.shown[1].buttons & 7, kButtonsOk);
    ProgramHome::SetFolder({});
}

} // namespace
} // namespace quorvel
