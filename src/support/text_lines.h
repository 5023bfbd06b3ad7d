#pragma once
// Lines of a text file as bytes, for files whose lines the program must give
// back exactly as it found them (settings, file lists). A line ends at CR LF,
// LF or a lone CR; each line keeps the end it had. Each line is decoded on its
// own: UTF-8 where it is valid UTF-8, else Latin-1, so one line written by an
// older program does not change how the others read.

#include <QByteArray>
#include <QByteArrayView>
#include <QString>

#include <vector>

namespace quorvel {

struct ByteLine {
    QByteArray text; // without the line end
    QByteArray end;  // "\r\n", "\n", "\r" or empty for a last line without one
};

std::vector<ByteLine> SplitByteLines(QByteArrayView bytes);

bool IsValidUtf8(QByteArrayView bytes);
// UTF-8 when valid, else Latin-1 (every byte one character).
QString DecodeLine(QByteArrayView line);

} // namespace quorvel
