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
// A text or key holding a character above code 255 is refused, never changed
// into another one: the error box says which character, and the result is
// empty. Check with Uncipherable() first where a box is not wanted.
QString crypt(const QString& text, const QString& keyText);

// Empty when every character of the text can be enciphered; else why not,
// naming the first character that cannot.
QString Uncipherable(const QString& text);
QByteArray CryptBytes(const QByteArray& data, const QByteArray& key); // plain RC4

QString HexToText(const QString& hex);
QString TextToHex(const QString& text); // upper-case pairs, the inverse of HexToText
QString DecryptHex(const QString& hex, const QString& keyText);
QString EncryptHex(const QString& text, const QString& keyText); // refuses as crypt() does
QString ReverseText(const QString& text);

} // namespace quorvel
