// "Login" in the window against the reference service: its three messages,
// the "Got ..." boxes, and a second press that fetches everything again.

#include "window_fixture.h"

#include "common/reference_service.h"
#include "transfer/ftp.h"

#include <QMessageBox>

#include <iostream>

namespace quorvel::testing {
namespace {

const QByteArray kList = " 1 ~1~Site 1~site1.dat~1~2~1~1~0~1~0~~~0\r\n";

class WindowLoginTest : public WindowTest {
protected:
    void SetUp() override {
        ASSERT_TRUE(
            service.AddUser({.name = "ann", .password = "p&ss word", .displayName = "Ann Example"}))
            << service.LastError().toStdString();
        service.PlaceFile("ann", "files.txt", kList);
        ASSERT_TRUE(service.Start()) << service.LastError().toStdString();
        WriteAccount();
    }
    // The account as the settings hold it before a start.
    void WriteAccount() {
        Setting("CFG_URL", service.CfgUrl("ann"));
        Setting("UserID", "ann");
        Setting("Password", "p&ss word");
        Setting("DataFolder", home.File("data"));
    }
    void TearDown() override {
        ftpClose();
        if (HasFailure()) std::cerr << "Service log:\n" << service.Log().toStdString();
    }
    void Login() {
        ports.prompter.shown.clear();
        window->Flags().InMessage = false;
        C().Cmd_Login->click();
    }

    ReferenceService service;
};

TEST_F(WindowLoginTest, OneMessageAndTheBoxesOfTheStepsThatSucceeded) {
    struct Case {
        bool cfgThere;
        const char* password;
        bool administrator; // "Folders from..." = "Administrator"
        const char* box;    // the message shown; "%1" stands for the CFG address
        bool gotSecure, gotPHP, gotFileList;
    };
    const char* welcome = "Ann Example - welcome to Quorvel";
    const Case cases[] = {
        {true, "p&ss word", true, welcome, true, true, true},
        {true, "p&ss word", false, welcome, true, true, false}, // folders from the user: no list
        {false, "p&ss word", true, "Could not get details from: %1", false, false, false},
        {true, "wrong", true, "Login failed", true, false, false},
    };
    for (const Case& c : cases) {
        SCOPED_TRACE(c.box + std::string(c.administrator ? "" : " (user's folders)"));
        WriteAccount();
        Start();
        const QString cfg = c.cfgThere ? service.CfgUrl("ann") : service.CfgUrl("nobody");
        C().Txt_CFG_URL->setText(cfg);
        C().Txt_Password->setText(c.password);
        C().Opt_GetLocalFolders->SetIndex(c.administrator ? 1 : 0);
        Login();
        EXPECT_EQ(Boxes(), QStringList{QString::fromUtf8(c.box).replace("%1", cfg)});
        EXPECT_EQ(C().Chk_GotSecure->isChecked(), c.gotSecure);
        EXPECT_EQ(C().Chk_GotPHP->isChecked(), c.gotPHP);
        EXPECT_EQ(C().Chk_GotFileList->isChecked(), c.gotFileList);
        if (c.gotSecure) {
            EXPECT_EQ(C().Txt_ftpPassword->text(), service.FtpPassword("ann"));
        }
        // A refused user leaves no name of the login at start-up behind.
        if (c.gotSecure && !c.gotPHP) {
            EXPECT_TRUE(C().Lbl_UserName->text().isEmpty());
        }
        AnswerUnsaved({QMessageBox::Discard});
        Close();
    }
}

TEST_F(WindowLoginTest, StartUpSignsInAndEveryLoginFetchesTheListAgain) {
    Start();
    // The start-up steps: no box, every "Got ..." ticked, the service's list shown.
    EXPECT_TRUE(Boxes().isEmpty()) << Boxes().join(" | ").toStdString();
    EXPECT_TRUE(C().Chk_GotSecure->isChecked() && C().Chk_GotPHP->isChecked() &&
                C().Chk_GotFileList->isChecked());
    EXPECT_EQ(ListNames(), QStringList{"Site 1"});
    EXPECT_EQ(C().Txt_UserFolder->text(), "/ann");

    service.PlaceFile("ann", "files.txt",
                      kList + " 2 ~1~Weather~weather.csv~2~2~1~1~0~1~0~~~0\r\n");
    // "Get" beside "Got file list" does nothing while the box is ticked.
    C().Cmd_GetFileList->click();
    EXPECT_EQ(ListNames(), QStringList{"Site 1"});
    Login();
    EXPECT_EQ(ListNames(), (QStringList{"Site 1", "Weather"}));
}

} // namespace
} // namespace quorvel::testing
