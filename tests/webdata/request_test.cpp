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
    f.user = QStringLiteral("U");
    f.password = QStringLiteral("P");
    f.file = QStringLiteral("site1.dat");
    f.dateFormat = 1;
    f.fileLocation = 2;
    f.date = QStringLiteral("2006-05-01 10:20:30");
    f.host = QStringLiteral("H");
    f.webFolder = QStringLiteral("/wd");
    f.agent = QStringLiteral("TALUQuorvel");
    return f;
}

TEST(Request, GetDataIsFourLines) {
    EXPECT_EQ(RequestLines(Fields()),
              (QStringList{QStringLiteral("GET http://H/wd/wd.php?cmd=GETDATA&user=U&pwd=P&"
                                          "file=site1%2Edat&dt=1&filelocation=2&"
                                          "date=2006-05-01%2010%3A20%3A30 HTTP/1.1"),
                           QStringLiteral("Host: H"), QStringLiteral("User-Agent: TALUQuorvel"),
                           QString()}));
}

TEST(Request, EmptyValuesAreLeftOutButNumbersNever) {
    RequestFields f = Fields();
    f.user.clear();
    f.password.clear();
    f.file.clear();
    f.date.clear();
    f.dateFormat = 0;
    f.fileLocation = 0;
    EXPECT_EQ(RequestLines(f).first(),
              QStringLiteral("GET http://H/wd/wd.php?cmd=GETDATA&dt=0&filelocation=0 HTTP/1.1"));
}

TEST(Request, ValuesCannotBreakOrExtendTheRequest) {
    RequestFields f = Fields();
    f.password = QStringLiteral("a&b c\r\nX: 1");
    f.user = QStringLiteral("ann\tx\"y%");
    const QString line = RequestLines(f).first();
    EXPECT_TRUE(line.contains(QStringLiteral("&user=ann%09x%22y%25&pwd=a%26b%20c%0D%0AX%3A%201&")));
    EXPECT_EQ(line.count(QLatin1Char(' ')), 2);
}

TEST(Request, FolderPaths) {
    EXPECT_EQ(FolderPath(QStringLiteral("/wd")), QStringLiteral("/wd/"));
    EXPECT_EQ(FolderPath(QStringLiteral("wd")), QStringLiteral("wd/"));
    EXPECT_EQ(FolderPath(QStringLiteral("/wd/")), QStringLiteral("/wd/"));
    EXPECT_EQ(FolderPath(QStringLiteral("\\wd")), QStringLiteral("/wd/"));
    EXPECT_EQ(FolderPath(QString()), QString());
    RequestFields f = Fields();
    f.webFolder.clear();
    EXPECT_TRUE(RequestLines(f).first().startsWith(QStringLiteral("GET http://Hwd.php?")));
}

TEST(Request, HostMayCarryAPort) {
    const HostPort plain = SplitHostPort(QStringLiteral("example.org"), 80);
    EXPECT_EQ(plain.host, QStringLiteral("example.org"));
    EXPECT_EQ(plain.port, 80);
    const HostPort withPort = SplitHostPort(QStringLiteral("127.0.0.1:8080"), 80);
    EXPECT_EQ(withPort.host, QStringLiteral("127.0.0.1"));
    EXPECT_EQ(withPort.port, 8080);
    const HostPort v6 = SplitHostPort(QStringLiteral("[::1]:81"), 80);
    EXPECT_EQ(v6.host, QStringLiteral("::1"));
    EXPECT_EQ(v6.port, 81);
    EXPECT_EQ(SplitHostPort(QStringLiteral("host:http"), 80).host, QStringLiteral("host:http"));
    EXPECT_EQ(SplitHostPort(QStringLiteral("host:99999"), 80).port, 80);
}

TEST(Request, UrlEncodeEscapesExactlyTheSpecialCharacters) {
    EXPECT_EQ(URLEncode(QStringLiteral("2006-05-01 10:20:30")),
              QStringLiteral("2006-05-01%2010%3A20%3A30"));
    EXPECT_EQ(URLEncode(QStringLiteral("0")), QStringLiteral("0"));
    EXPECT_EQ(URLEncode(QStringLiteral("a-b")), QStringLiteral("a-b"));
    EXPECT_EQ(URLEncode(QStringLiteral(" !#%&()+,./:;<>=?@\\\t\"")),
              QStringLiteral("%20%21%23%25%26%28%29%2B%2C%2E%2F%3A%3B%3C%3E%3D%3F%40%5C%09%22"));
    EXPECT_EQ(URLEncode(QStringLiteral("é~_*\r")), QStringLiteral("é~_*\r"));
}

TEST(SimpleCipher, KeyIsDoubledPastFiftyCharacters) {
    EXPECT_EQ(ExpandKey(QStringLiteral("583640917")).size(), 72);
    EXPECT_EQ(ExpandKey(QString(51, QLatin1Char('k'))).size(), 51);
    EXPECT_EQ(ExpandKey(QString(50, QLatin1Char('k'))).size(), 100);
    EXPECT_EQ(ExpandKey(QString()), QString());
}

TEST(SimpleCipher, IsItsOwnInverseWithTheDefaultKey) {
    const QString key = ExpandKey(QStringLiteral("583640917"));
    const QString text = QStringLiteral("Secret Pass-word 42?zZ");
    const std::optional<QString> once = EncryptSimple(text, key);
    ASSERT_TRUE(once.has_value());
    EXPECT_NE(*once, text);
    EXPECT_EQ(once->at(6), QLatin1Char(' '));
    EXPECT_EQ(once->at(11), QLatin1Char('-'));
    EXPECT_EQ(EncryptSimple(*once, key), text);
}

TEST(SimpleCipher, FailsBeyondTheKeyOnlyForAlphabetCharacters) {
    EXPECT_FALSE(EncryptSimple(QStringLiteral("--a"), QStringLiteral("12")).has_value());
    EXPECT_EQ(EncryptSimple(QStringLiteral("a--"), QStringLiteral("1")), QStringLiteral("L--"));
}

} // namespace
} // namespace quorvel
