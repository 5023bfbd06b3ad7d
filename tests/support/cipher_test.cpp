#include "support/cipher.h"

#include <QRegularExpression>

#include <gtest/gtest.h>

using namespace quorvel;

TEST(Rc4, PublishedTestVectors) {
    EXPECT_EQ(CryptBytes("Plaintext", "Key").toHex(), QByteArray("bbf316e8d940af0ad3"));
    EXPECT_EQ(CryptBytes("pedia", "Wiki").toHex(), QByteArray("1021bf0420"));
    EXPECT_EQ(CryptBytes("Attack at dawn", "Secret").toHex(),
              QByteArray("45a01f645fc35b383552544b9bf5"));
}

TEST(Crypt, IsItsOwnInverseForEveryCharacterCode) {
    QString all;
    for (int c = 0; c < 256; ++c)
        all += QChar(c);
    const QString once = crypt(all, "abc");
    EXPECT_NE(once, all);
    EXPECT_EQ(crypt(once, "abc"), all);
    EXPECT_NE(crypt(all, "abd"), once); // the caller's key matters
}

TEST(Crypt, EmptyTextAndEmptyKey) {
    EXPECT_TRUE(quorvel::crypt(QString(), "key").isEmpty());
    // The fixed key part is always appended, so an empty key still enciphers.
    const QString c = quorvel::crypt(QString("password"), "");
    EXPECT_NE(c, QString("password"));
    EXPECT_EQ(quorvel::crypt(c, ""), QString("password"));
}

TEST(Crypt, UsesTheFixedKeyPartAfterTheCallerKey) {
    // The key is the caller's text followed by the reversed stored part.
    const QByteArray expected = CryptBytes("secret", QByteArray("k") + "larchmoist");
    EXPECT_EQ(quorvel::crypt(QString("secret"), "k").toLatin1(), expected);
}

TEST(HexText, PairsOddLengthAndNonHex) {
    EXPECT_EQ(HexToText("414243"), QString("ABC"));
    EXPECT_EQ(HexToText("41424"), QString("AB") + QChar(4));
    EXPECT_EQ(HexToText("zz41"), QString(QChar(0)) + "A");
    EXPECT_EQ(HexToText(""), QString());
    EXPECT_EQ(TextToHex(QString("AB") + QChar(0xFF)), QString("4142FF"));
}

TEST(HexText, EncipheredPasswordRoundTrip) {
    const QString hex = EncryptHex("s3cr&t pass", "tlu");
    EXPECT_TRUE(QRegularExpression("^[0-9A-F]+$").match(hex).hasMatch()) << hex.toStdString();
    EXPECT_EQ(DecryptHex(hex, "tlu"), QString("s3cr&t pass"));
    EXPECT_EQ(ReverseText("abc"), QString("cba"));
}
