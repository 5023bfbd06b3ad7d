#pragma once
// A main window started in a temporary program folder, with recorders as the
// process's ports and the file dialogs answered by the test.

#include "app/ui/frm_web_data_client.h"
#include "common/recorders.h"
#include "common/temp_home.h"

#include <QStringList>

#include <gtest/gtest.h>

#include <ostream>

#include <memory>
#include <vector>

QT_BEGIN_NAMESPACE
// Readable texts in failure reports.
inline void PrintTo(const QString& text, std::ostream* out) {
    *out << '"' << text.toStdString() << '"';
}
inline void PrintTo(const QStringList& list, std::ostream* out) {
    *out << '{' << list.join(QStringLiteral(", ")).toStdString() << '}';
}
QT_END_NAMESPACE

namespace quorvel::testing {

class WindowTest : public ::testing::Test {
protected:
    WindowTest();
    ~WindowTest() override;

    // Writes settings before the start ("GetFileList", "0" ...).
    void Setting(const QString& key, const QString& value);
    // Writes files.txt in the program folder, one record line per entry.
    void WriteList(const QStringList& lines, const QString& name = QStringLiteral("files.txt"));
    // A record line for a file in the application folder.
    static QString Line(const QString& name, const QString& fileName, int download = 1,
                        int upload = 0);
    // Lets the user edit the list: the list and the folders come from the user.
    void UserMaintainsList();
    // Starts with a list the user maintains: "A" for a.csv and so on.
    frm_WebDataClient& StartWith(const QStringList& names);

    // Builds, loads and shows the window and lets its first activation run.
    frm_WebDataClient& Start(const QStringList& arguments = {});
    // Closes the window (as the user would) and forgets it.
    void Close();
    // Lets queued events run (no waiting for time to pass).
    static void Pump();

    WindowControls& C() { return window->Controls(); }
    void Select(int row);
    QStringList ListNames() const;
    static void ExpectEnabled(std::initializer_list<QWidget*> widgets, bool enabled);
    // The messages of the boxes shown so far.
    QStringList Boxes() const;
    // A server text for a loopback port that nobody listens on.
    static QString DeadServer();
    // Answers the next file dialogs with these paths (empty: cancelled).
    void AnswerDialogs(const QStringList& files);
    // Answers the next unsaved-changes questions (QMessageBox::Save, Discard,
    // Cancel), then Save.
    void AnswerUnsaved(std::initializer_list<int> answers) { unsavedAnswers.assign(answers); }

    TempHome home;
    RecordingPorts ports;
    std::unique_ptr<frm_WebDataClient> window;
    QStringList dialogAnswer;
    int dialogsShown = 0;
    std::vector<int> unsavedAnswers;
    QStringList unsavedAsked; // the list names the questions named
    QStringList infoShown;    // "title|text" of each informing box
};

} // namespace quorvel::testing
