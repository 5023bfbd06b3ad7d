// The login steps against the reference service: the configuration file, the
// user's details and the user's file list, with the line ends a service on
// Windows or on Linux may use.

#include "app/account_login.h"
#include "app/app_services.h"
#include "app/file_list.h"
#include "app/file_record.h"
#include "app/locations.h"
#include "common/recorders.h"
#include "common/reference_service.h"
#include "common/temp_home.h"
#include "support/program_home.h"
#include "transfer/ftp.h"

#include <QDir>
#include <QFile>

#include <gtest/gtest.h>

#include <iostream>

namespace quorvel::testing {
namespace {

const QByteArray kListLines[] = {" 1 ~1~Site 1~site1.dat~1~2~1~1~0~1~0~~~0",
                                 " 2 ~1~Weather~weather.csv~2~2~1~1~0~1~0~~~0"};

class LoginTest : public ::testing::Test {
protected:
    void SetUp() override {
        ProgramHome::SetFolder(home.Path());
        ASSERT_TRUE(service.AddUser({.name = "ann",
                                     .password = "p&ss word",
                                     .displayName = "Ann Example",
                                     .dataFolder = "/srv/ann-data"}))
            << service.LastError().toStdString();
        ASSERT_TRUE(service.Start()) << service.LastError().toStdString();
        services.SetViews(&trace, nullptr, nullptr);
        fields.cfgUrl = service.CfgUrl("ann");
        fields.userId = "ann";
        fields.password = "p&ss word";
        fields.applicationFolder = home.Path();
        fields.dataFolder = home.File("data");
    }
    void TearDown() override {
        ftpClose();
        ProgramHome::SetFolder({});
        if (HasFailure()) std::cerr << "Service log:\n" << service.Log().toStdString();
    }
    QString CfgPath() const { return QDir(service.DataRoot()).filePath("cfg/ann.cfg"); }
    QByteArray Cfg() const {
        QFile f(CfgPath());
        return f.open(QIODevice::ReadOnly) ? f.readAll() : QByteArray();
    }
    void ServeCfg(const QByteArray& bytes) {
        QFile f(CfgPath());
        ASSERT_TRUE(f.open(QIODevice::WriteOnly | QIODevice::Truncate));
        f.write(bytes);
    }
    // The five lines the service wrote, joined with the given line end.
    QByteArray CfgWith(const QList<QByteArray>& written, const char* lineEnd, int lines) const {
        QList<QByteArray> parts = written;
        while (parts.size() < lines)
            parts << "extra line";
        return parts.mid(0, lines).join(lineEnd) + lineEnd;
    }

    TempHome home;
    ReferenceService service;
    RecordingTraceView trace;
    AppServices services;
    AccountLogin login{services, trace};
    AccountFields fields;
};

TEST_F(LoginTest, TheFiveLinesOfAnyLineEndFillTheFtpAndWebFields) {
    QList<QByteArray> written;
    for (const QByteArray& line : Cfg().split('\n'))
        if (!line.trimmed().isEmpty()) written << line.trimmed();
    struct Case {
        const char* lineEnd;
        int lines;
        bool ok;
    };
    const Case cases[] = {
        {"\r\n", 5, true}, {"\n", 5, true}, {"\r", 5, true}, {"\r\n", 6, true}, {"\n", 4, false}};
    const AccountFields start = fields;
    for (const Case& c : cases) {
        SCOPED_TRACE(QByteArray(c.lineEnd).toHex().toStdString() + " " + std::to_string(c.lines));
        fields = start;
        ServeCfg(CfgWith(written, c.lineEnd, c.lines));
        EXPECT_EQ(login.GetSecureFTPDetails(fields), c.ok) << login.LastError().toStdString();
        EXPECT_EQ(fields.gotSecure, c.ok);
        if (!c.ok) {
            EXPECT_TRUE(login.LastError().contains("4 of its 5 lines"))
                << login.LastError().toStdString();
            EXPECT_TRUE(fields.ftpServer.isEmpty());
            continue;
        }
        EXPECT_EQ(fields.ftpServer, service.FtpServer());
        EXPECT_EQ(fields.ftpUserId, "ann");
        EXPECT_EQ(fields.ftpPassword, service.FtpPassword("ann")); // deciphered
        EXPECT_EQ(fields.httpServer, service.HttpHostPort());
        EXPECT_EQ(fields.webFolder, service.WebFolder());
    }
}

TEST_F(LoginTest, AMissingCfgFileFailsWithTheReasonAndATickedBoxSkipsTheFetch) {
    fields.cfgUrl = service.CfgUrl("nobody");
    EXPECT_FALSE(login.GetSecureFTPDetails(fields));
    EXPECT_FALSE(login.LastError().isEmpty());
    EXPECT_FALSE(fields.gotSecure);

    fields.gotSecure = true; // "Got Secure" ticked: nothing is fetched
    EXPECT_TRUE(login.GetSecureFTPDetails(fields));
    EXPECT_TRUE(fields.ftpServer.isEmpty());
}

TEST_F(LoginTest, UserDetailsFillTheFoldersOnlyWhenTheAdministratorGivesThem) {
    ASSERT_TRUE(login.GetSecureFTPDetails(fields)) << login.LastError().toStdString();
    AccountFields byUser = fields;
    byUser.foldersFromAdministrator = false;
    byUser.userFolder = "mine";

    ASSERT_TRUE(login.GetUserDetails(fields, {})) << login.LastError().toStdString();
    EXPECT_TRUE(fields.gotPHP);
    EXPECT_EQ(fields.userName, "Ann Example");
    EXPECT_EQ(fields.userFolderOnSite, "/ann");
    EXPECT_EQ(fields.userFolder, "/ann");
    EXPECT_EQ(fields.userCurrentFolder, "current");
    EXPECT_EQ(fields.dataFolder, "/srv/ann-data");
    // A ticked box reports failure and asks nothing.
    const AccountFields before = fields;
    EXPECT_FALSE(login.GetUserDetails(fields, {}));
    EXPECT_EQ(fields, before);

    ASSERT_TRUE(login.GetUserDetails(byUser, {}));
    EXPECT_EQ(byUser.userName, "Ann Example");
    EXPECT_EQ(byUser.userFolder, "mine");
    EXPECT_EQ(byUser.dataFolder, home.File("data"));
    EXPECT_TRUE(trace.traces.contains("GetUserDetails, but skip setting local folders"));
}

TEST_F(LoginTest, AFailedLoginLeavesNoDetailsOfAnEarlierOne) {
    ASSERT_TRUE(login.GetSecureFTPDetails(fields));
    ASSERT_TRUE(login.GetUserDetails(fields, {}));
    fields.gotPHP = false;
    fields.password = "wrong";
    EXPECT_FALSE(login.GetUserDetails(fields, {}));
    EXPECT_FALSE(login.LastError().isEmpty());
    EXPECT_TRUE(fields.userName.isEmpty());
    EXPECT_TRUE(fields.userFolder.isEmpty());
    EXPECT_TRUE(fields.userCurrentFolder.isEmpty());
    EXPECT_FALSE(fields.gotPHP);
}

TEST_F(LoginTest, TheServicesListOfAnyLineEndReplacesTheOneInMemory) {
    ASSERT_TRUE(login.GetSecureFTPDetails(fields));
    ASSERT_TRUE(login.GetUserDetails(fields, {}));
    for (const char* lineEnd : {"\r\n", "\n", "\r"}) {
        SCOPED_TRACE(QByteArray(lineEnd).toHex().toStdString());
        service.PlaceFile("ann", "files.txt", kListLines[0] + lineEnd + kListLines[1] + lineEnd);
        fields.gotFileList = false;
        trace.traces.clear();
        FileList list;
        ASSERT_TRUE(login.GetFileListFromServer(fields, {}, list))
            << login.LastError().toStdString();
        EXPECT_TRUE(login.LoadErrors().empty());
        ASSERT_EQ(list.Count(), 2);
        EXPECT_EQ(list.At(0).Name, "Site 1");
        EXPECT_EQ(list.At(1).FileName, "weather.csv");
        EXPECT_TRUE(list.ListChanged);
        EXPECT_EQ(list.LoadedFile, home.Path() + "/files.txt");
        EXPECT_TRUE(fields.gotFileList);
        EXPECT_TRUE(trace.traces.contains("Got file list"));
    }
}

TEST_F(LoginTest, AFailedListFetchKeepsTheListAndATickedBoxFetchesNothing) {
    ASSERT_TRUE(login.GetSecureFTPDetails(fields));
    ASSERT_TRUE(login.GetUserDetails(fields, {}));
    FileList list;
    service.PlaceFile("ann", "files.txt", kListLines[0] + "\r\n");
    ASSERT_TRUE(login.GetFileListFromServer(fields, {}, list));
    ASSERT_EQ(list.Count(), 1);

    service.PlaceFile("ann", "files.txt", kListLines[0] + "\r\n" + kListLines[1] + "\r\n");
    EXPECT_TRUE(login.GetFileListFromServer(fields, {}, list));
    EXPECT_EQ(list.Count(), 1); // "Got file list" was ticked

    fields.gotFileList = false;
    fields.userFolder = "/nobody";
    EXPECT_FALSE(login.GetFileListFromServer(fields, {}, list));
    EXPECT_EQ(list.Count(), 1);
    EXPECT_FALSE(fields.gotFileList);
}

struct AddressCase {
    const char* server;
    const char* userFolder;
    const char* address;
};

TEST(FileListAddressTest, OneSlashBetweenServerAndFolder) {
    const AddressCase cases[] = {
        {"127.0.0.1:8080", "/ann", "127.0.0.1:8080/ann/files.txt"},
        {"127.0.0.1:8080/", "/ann", "127.0.0.1:8080/ann/files.txt"},
        {"http://example.org/", "ann", "http://example.org/ann/files.txt"},
        {"example.org", "ann\\2024\\", "example.org/ann/2024/files.txt"},
        {"example.org", "", "example.org/files.txt"},
        {"example.org/", "", "example.org/files.txt"},
    };
    for (const AddressCase& c : cases)
        EXPECT_EQ(FileListAddress(c.server, c.userFolder), c.address)
            << c.server << " + " << c.userFolder;
}

TEST(LocationFolderTest, TheServicesLeadingSlashDoesNotDoubleTheSeparator) {
    LocationFolders folders;
    folders.data = "/home/ann/DATA/";
    folders.user = "/ann";
    folders.userCurrent = "current";
    EXPECT_EQ(GetLocationFolder(folders, kLocationUser, kOnThisPc), "/home/ann/DATA/ann");
    EXPECT_EQ(GetLocationFolder(folders, kLocationUserCurrent, kOnThisPc),
              "/home/ann/DATA/ann/current");
    folders.data = "/home/ann/DATA";
    EXPECT_EQ(GetLocationFolder(folders, kLocationUser, kOnThisPc), "/home/ann/DATA/ann");
}

} // namespace
} // namespace quorvel::testing
