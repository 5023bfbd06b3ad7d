#include "window_fixture.h"

#include "support/ini_store.h"
#include "support/program_home.h"

#include <QApplication>
#include <QDir>
#include <QMessageBox>
#include <QTcpServer>

namespace quorvel::testing {

WindowTest::WindowTest() {
    // The autostart entry of "Run at StartUp" goes below the temporary folder.
    qputenv("XDG_CONFIG_HOME", home.Path().toUtf8());
}

WindowTest::~WindowTest() {
    if (window) window->close();
    window.reset();
    qunsetenv("XDG_CONFIG_HOME");
}

QStringList WindowTest::Boxes() const {
    QStringList shown;
    for (const auto& box : ports.prompter.shown)
        shown << box.message;
    return shown;
}

QString WindowTest::DeadServer() {
    QTcpServer probe;
    probe.listen(QHostAddress::LocalHost);
    return QStringLiteral("127.0.0.1:%1").arg(probe.serverPort());
}

void WindowTest::Setting(const QString& key, const QString& value) {
    LocalSettings(ProgramHome::SettingsFile()).SaveLocalSetting(key, value);
}

void WindowTest::WriteList(const QStringList& lines, const QString& name) {
    home.Write(name, (lines.join(QStringLiteral("\r\n")) + QStringLiteral("\r\n")).toUtf8());
}

QString WindowTest::Line(const QString& name, const QString& fileName, int download, int upload) {
    return QStringLiteral(" 0 ~1~%1~%2~0~0~0~0~0~%3~%4~~~0")
        .arg(name, fileName)
        .arg(download)
        .arg(upload);
}

void WindowTest::UserMaintainsList() {
    Setting(QStringLiteral("GetFileList"), QStringLiteral("0"));
    Setting(QStringLiteral("GetLocalFolders"), QStringLiteral("0"));
}

frm_WebDataClient& WindowTest::StartWith(const QStringList& names) {
    UserMaintainsList();
    QStringList lines;
    for (const QString& name : names)
        lines << Line(name, name.toLower() + ".csv");
    WriteList(lines);
    return Start();
}

frm_WebDataClient& WindowTest::Start(const QStringList& arguments) {
    window = std::make_unique<frm_WebDataClient>(arguments);
    FileDialogs dialogs;
    auto answer = [this](auto&&...) {
        ++dialogsShown;
        return dialogAnswer;
    };
    dialogs.openFiles = answer;
    dialogs.openFile = [answer](auto&&... args) { return answer(args...).value(0); };
    dialogs.saveFile = dialogs.openFile;
    dialogs.saveChanges = [this](QWidget*, const QString& name) {
        unsavedAsked << name;
        if (unsavedAnswers.empty()) return int(QMessageBox::Save);
        const int answer = unsavedAnswers.front();
        unsavedAnswers.erase(unsavedAnswers.begin());
        return answer;
    };
    dialogs.about = [this](QWidget*, const QString& title, const QString& text) {
        infoShown << title + "|" + text;
    };
    window->SetFileDialogs(dialogs);
    window->Form_Load();
    window->show();
    Pump();
    return *window;
}

void WindowTest::Close() {
    window->close();
    window.reset();
}

void WindowTest::Pump() {
    for (int i = 0; i < 3; ++i)
        QApplication::processEvents();
}

void WindowTest::Select(int row) {
    C().Lst_Files->setCurrentRow(row);
}

QStringList WindowTest::ListNames() const {
    QStringList names;
    for (int i = 0; i < window->Controls().Lst_Files->count(); ++i)
        names << window->Controls().Lst_Files->item(i)->text();
    return names;
}

void WindowTest::ExpectEnabled(std::initializer_list<QWidget*> widgets, bool enabled) {
    for (QWidget* w : widgets)
        EXPECT_EQ(w->isEnabled(), enabled) << w->objectName().toStdString();
}

void WindowTest::AnswerDialogs(const QStringList& files) {
    dialogAnswer = files;
}

} // namespace quorvel::testing
