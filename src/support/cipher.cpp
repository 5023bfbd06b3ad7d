#include "support/cipher.h"

#include "support/error_box.h"

#include <array>

namespace quorvel {

namespace {

// Stored reversed; crypt() turns it round each time so the key never sits whole in memory.
constexpr char kStoredKeyPart[] = "tsiomhcral";

int HexDigit(QChar c) {
    const char ch = c.toLatin1();
    if (ch >= '0' && ch <= '9') return ch - '0';
    if (ch >= 'a' && ch <= 'f') return ch - 'a' + 10;
    if (ch >= 'A' && ch <= 'F') return ch - 'A' + 10;
    return -1;
}

} // namespace

QByteArray CryptBytes(const QByteArray& data, const QByteArray& key) {
    if (data.isEmpty() || key.isEmpty()) return key.isEmpty() ? QByteArray() : data;
    std::array<unsigned char, 256> s{};
    for (int n = 0; n < 256; ++n)
        s[n] = static_cast<unsigned char>(n);
    unsigned j = 0;
    for (int n = 0; n < 256; ++n) {
        j = (j + s[n] + static_cast<unsigned char>(key[n % key.size()])) & 0xFF;
        std::swap(s[n], s[j]);
    }
    QByteArray out(data.size(), Qt::Uninitialized);
    unsigned i = 0;
    j = 0;
    for (qsizetype k = 0; k < data.size(); ++k) {
        i = (i + 1) & 0xFF;
        j = (j + s[i]) & 0xFF;
        std::swap(s[i], s[j]);
        const unsigned t = (s[i] + s[j]) & 0xFF;
        out[k] = static_cast<char>(static_cast<unsigned char>(data[k]) ^ s[t]);
    }
    return out;
}

QString ReverseText(const QString& text) {
    QString out;
    out.reserve(text.size());
    for (qsizetype i = text.size(); i > 0; --i)
        out += text[i - 1];
    return out;
}

QString Uncipherable(const QString& text) {
    for (qsizetype i = 0; i < text.size(); ++i) {
        // A character beyond Latin-1 would turn into "?" and encipher as one.
        const char32_t code = text.at(i).isHighSurrogate() && i + 1 < text.size()
                                  ? QChar::surrogateToUcs4(text.at(i), text.at(i + 1))
                                  : text.at(i).unicode();
        if (code > 0xFF) {
            return QStringLiteral("The text cannot be enciphered: its character \"") +
                   QString::fromUcs4(&code, 1) + QStringLiteral("\" (code ") +
                   QString::number(code) +
                   QStringLiteral(") is not one of the 256 Latin-1 characters the cipher carries");
        }
    }
    return {};
}

QString crypt(const QString& text, const QString& keyText) {
    if (text.isEmpty()) return {};
    const QString key = keyText + ReverseText(QLatin1String(kStoredKeyPart));
    for (const QString& part : {text, key}) {
        if (const QString why = Uncipherable(part); !why.isEmpty()) {
            ShowErrorBox(why, QStringLiteral("crypt"));
            return {};
        }
    }
    return QString::fromLatin1(CryptBytes(text.toLatin1(), key.toLatin1()));
}

QString HexToText(const QString& hex) {
    QString out;
    for (qsizetype p = 0; p < hex.size(); p += 2) {
        // Like reading "&H" + pair: leading hex digits count, anything else reads as 0.
        int value = 0;
        for (qsizetype k = p; k < std::min(p + 2, hex.size()); ++k) {
            const int d = HexDigit(hex[k]);
            if (d < 0) break;
            value = value * 16 + d;
        }
        out += QChar(value);
    }
    return out;
}

QString TextToHex(const QString& text) {
    return QString::fromLatin1(text.toLatin1().toHex().toUpper());
}

QString DecryptHex(const QString& hex, const QString& keyText) {
    return crypt(HexToText(hex), keyText);
}

QString EncryptHex(const QString& text, const QString& keyText) {
    return TextToHex(crypt(text, keyText));
}

} // namespace quorvel
