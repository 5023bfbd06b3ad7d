#pragma once
// Note: `crypt` shares its name with the C library's crypt(3); call it qualified
// (quorvel::crypt) where <unistd.h> may be in scope.
// RC4 over single-byte character codes, used for the FTP password that a
// configuration file carries as hexadecimal text.

#include <QByteArray>
#include <QString>

namespace quorvel {

// RC4 with key = keyText + the program's fixed key part; the same call
// enciphers and deciphers. Characters are handled as codes 0-255 (Latin-1).
QString crypt(const QString& text, const QString& keyText);
QByteArray CryptBytes(const QByteArray& data, const QByteArray& key); // plain RC4

QString HexToText(const QString& hex);
QString TextToHex(const QString& text); // upper-case pairs, the inverse of HexToText
QString DecryptHex(const QString& hex, const QString& keyText);
QString EncryptHex(const QString& text, const QString& keyText);
QString ReverseText(const QString& text);

} // namespace quorvel
