#include "support/text_lines.h"

#include <QStringDecoder>

namespace quorvel {

std::vector<ByteLine> SplitByteLines(QByteArrayView bytes) {
    std::vector<ByteLine> lines;
    qsizetype start = 0;
    for (qsizetype i = 0; i < bytes.size(); ++i) {
        const char c = bytes[i];
        if (c != '\r' && c != '\n') continue;
        const qsizetype endLength =
            c == '\r' && i + 1 < bytes.size() && bytes[i + 1] == '\n' ? 2 : 1;
        lines.push_back({bytes.sliced(start, i - start).toByteArray(),
                         bytes.sliced(i, endLength).toByteArray()});
        i += endLength - 1;
        start = i + 1;
    }
    if (start < bytes.size()) lines.push_back({bytes.sliced(start).toByteArray(), {}});
    return lines;
}

bool IsValidUtf8(QByteArrayView bytes) {
    QStringDecoder utf8(QStringConverter::Utf8, QStringConverter::Flag::Stateless);
    // The decoder works only when its result is taken.
    const QString text = utf8.decode(bytes);
    return !utf8.hasError();
}

QString DecodeLine(QByteArrayView line) {
    QStringDecoder utf8(QStringConverter::Utf8, QStringConverter::Flag::Stateless);
    QString text = utf8.decode(line);
    return utf8.hasError() ? QString::fromLatin1(line) : text;
}

} // namespace quorvel
