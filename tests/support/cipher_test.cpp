#include "support/cipher.h"

#include "common/recorders.h"

#include <QProcess>
#include <QRegularExpression>

#include <gtest/gtest.h>

using namespace quorvel;

TEST(Rc4, PublishedTestVectors) {
    EXPECT_EQ(CryptBytes("Plaintext", "Key").toHex(), QByteArray("bbf316e8d940af0ad3"));
    EXPECT_EQ(CryptBytes("pedia", "Wiki").toHex(), QByteArray("1021bf0420"));
    EXPECT_EQ(CryptBytes("Attack at dawn", "Secret").toHex(),
              QByteArray("45a01f645fc35b383552544b9bf5"));
}

TEST(Crypt, IsItsOwnInverseWithTheFixedKeyPartAfterTheCallerKey) {
    QString all;
    for (int c = 0; c < 256; ++c)
        all += QChar(c);
    const QString once = crypt(all, "abc");
    EXPECT_NE(once, all);
    EXPECT_EQ(crypt(once, "abc"), all);
    EXPECT_NE(crypt(all, "abd"), once); // the caller's key matters
    EXPECT_TRUE(quorvel::crypt(QString(), "key").isEmpty());
    // The fixed key part is always appended, so an empty key still enciphers.
    const QString c = quorvel::crypt(QString("password"), "");
    EXPECT_NE(c, QString("password"));
    EXPECT_EQ(quorvel::crypt(c, ""), QString("password"));
    // The key is the caller's text followed by the reversed stored part.
    const QByteArray expected = CryptBytes("secret", QByteArray("k") + "larchmoist");
    EXPECT_EQ(quorvel::crypt(QString("secret"), "k").toLatin1(), expected);
}

TEST(HexText, PairsOddLengthNonHexAndEncipheredRoundTrip) {
    EXPECT_EQ(HexToText("414243"), QString("ABC"));
    EXPECT_EQ(HexToText("41424"), QString("AB") + QChar(4));
    EXPECT_EQ(HexToText("zz41"), QString(QChar(0)) + "A");
    EXPECT_EQ(HexToText(""), QString());
    EXPECT_EQ(TextToHex(QString("AB") + QChar(0xFF)), QString("4142FF"));
    const QString hex = EncryptHex("s3cr&t pass", "tlu");
    EXPECT_TRUE(QRegularExpression("^[0-9A-F]+$").match(hex).hasMatch()) << hex.toStdString();
    EXPECT_EQ(DecryptHex(hex, "tlu"), QString("s3cr&t pass"));
    EXPECT_EQ(ReverseText("abc"), QString("cba"));
}

TEST(Crypt, CharactersBeyondLatin1AreRefusedNotTurnedIntoQuestionMarks) {
    quorvel::testing::RecordingPorts ports;
    const QString euro = QString::fromUtf8("pa\u20acss");
    EXPECT_NE(EncryptHex(euro, "tlu"), EncryptHex("pa?ss", "tlu"));
    EXPECT_EQ(quorvel::crypt(euro, "tlu"), QString());
    ASSERT_EQ(ports.prompter.shown.size(), 2u); // one box for each refused call
    EXPECT_EQ(ports.prompter.shown[0].message,
              QString::fromUtf8("The text cannot be enciphered: its character \"\u20ac\" (code "
                                "8364) is not one of the 256 Latin-1 characters the cipher "
                                "carries\r\ncrypt"));
    EXPECT_FALSE(ports.prompter.shown[0].timed);
    // A character outside the basic plane is named whole.
    EXPECT_TRUE(Uncipherable(QString::fromUtf8("\U0001F600")).contains("(code 128512)"));
    // Latin-1 text, the only kind older files hold, still goes both ways.
    const QString latin1 = QString::fromUtf8("p\u00e4\u00df\u00ff");
    EXPECT_TRUE(Uncipherable(latin1).isEmpty());
    EXPECT_EQ(DecryptHex(EncryptHex(latin1, "tlu"), "tlu"), latin1);
    EXPECT_EQ(ports.prompter.shown.size(), 2u);
}

TEST(EncipherSwitch, RefusesTextItCannotCarryWithExitCode2) {
    struct Case {
        QString text;
        int exitCode;
    };
    for (const Case& c :
         {Case{QString::fromUtf8("pa\u20acss"), 2}, Case{QString::fromUtf8("p\u00e4ss"), 0}}) {
        QProcess quorvelProcess;
        quorvelProcess.start(QStringLiteral(QUORVEL_EXECUTABLE), {"--encipher", c.text});
        ASSERT_TRUE(quorvelProcess.waitForFinished(30000));
        EXPECT_EQ(quorvelProcess.exitCode(), c.exitCode) << c.text.toStdString();
        const QString out = QString::fromUtf8(quorvelProcess.readAllStandardOutput()).trimmed();
        const QString err = QString::fromUtf8(quorvelProcess.readAllStandardError());
        if (c.exitCode == 0) {
            EXPECT_EQ(DecryptHex(out, "tlu"), c.text);
            EXPECT_TRUE(err.isEmpty()) << err.toStdString();
        } else {
            EXPECT_TRUE(out.isEmpty());
            EXPECT_TRUE(err.startsWith(QString::fromUtf8(
                "--encipher: The text cannot be enciphered: its character \"\u20ac\"")))
                << err.toStdString();
        }
    }
}
