// Request texts, escaping, addresses and the object's character substitution.
#include "webdata/request.h"
#include "webdata/simple_cipher.h"

#include <gtest/gtest.h>

namespace quorvel {
namespace {

RequestFields Fields() {
    RequestFields f;
    f.commandIndex = 2;
    f.command = QStringLiteral("GETDATA");
    f.host = QStringLiteral("H");
    f.webFolder = QStringLiteral("/wd");
    f.agent = QStringLiteral("TALUQuorvel");
    return f;
}

TEST(Request, EmptyValuesAreLeftOutAndNoValueCanBreakOrExtendTheRequest) {
    RequestFields f = Fields();
    EXPECT_EQ(RequestLines(f).first(),
              QStringLiteral("GET http://H/wd/wd.php?cmd=GETDATA&dt=0&filelocation=0 HTTP/1.1"));
    f.password = QStringLiteral("a&b c\r\nX: 1");
    f.user = QStringLiteral("ann\tx\"y%");
    const QString line = RequestLines(f).first();
    EXPECT_TRUE(line.contains(
        QStringLiteral("?cmd=GETDATA&user=ann%09x%22y%25&pwd=a%26b%20c%0D%0AX%3A%201&")));
    EXPECT_EQ(line.count(QLatin1Char(' ')), 2);
    EXPECT_EQ(URLEncode(QStringLiteral("2006-05-01 10:20:30")),
              QStringLiteral("2006-05-01%2010%3A20%3A30"));
}

TEST(Request, FolderPathsAndHostsWithPorts) {
    const QString folders[][2] = {
        {"/wd", "/wd/"}, {"wd", "wd/"}, {"/wd/", "/wd/"}, {"\\wd", "/wd/"}, {"", ""}};
    for (const auto& [folder, path] : folders)
        EXPECT_EQ(FolderPath(folder), path) << folder.toStdString();
    const QString hosts[][2] = {{"example.org", "example.org 80"},
                                {"127.0.0.1:8080", "127.0.0.1 8080"},
                                {"[::1]:81", "::1 81"},
                                {"host:http", "host:http 80"},
                                {"host:99999", "host:99999 80"}};
    for (const auto& [text, split] : hosts) {
        const HostPort h = SplitHostPort(text, 80);
        EXPECT_EQ(h.host + QLatin1Char(' ') + QString::number(h.port), split);
    }
}

TEST(SimpleCipher, KeyIsDoubledPastFiftyCharactersAndOnlyAlphabetCharactersNeedOne) {
    EXPECT_EQ(ExpandKey(QString(51, QLatin1Char('k'))).size(), 51);
    EXPECT_EQ(ExpandKey(QString(50, QLatin1Char('k'))).size(), 100);
    EXPECT_EQ(ExpandKey(QString()), QString());
    EXPECT_FALSE(EncryptSimple(QStringLiteral("--a"), QStringLiteral("12")).has_value());
    EXPECT_EQ(EncryptSimple(QStringLiteral("a--"), QStringLiteral("1")), QStringLiteral("L--"));
}

} // namespace
} // namespace quorvel
