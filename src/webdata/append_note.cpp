#include "webdata/append_note.h"

#include <QDir>
#include <QFile>
#include <QFileInfo>

#include <algorithm>

namespace quorvel::append_note {

namespace {

constexpr qint64 kBlock = 4096;

std::optional<qint64> ReadNote(const QString& dataFile) {
    QFile note(NotePath(dataFile));
    if (!note.open(QIODevice::ReadOnly)) return std::nullopt;
    const QByteArray text = note.read(32);
    bool ok = false;
    const qint64 length = text.trimmed().toLongLong(&ok);
    // A note cut short while it was written: no record was appended yet.
    if (!ok || !text.endsWith('\n') || length < 0) return -1;
    return length;
}

// Just past the last LF in [from, end) of the file, or from when there is none.
std::optional<qint64> AfterLastLineEnd(QFile& file, qint64 from, qint64 end) {
    QByteArray block;
    while (end > from) {
        const qint64 start = std::max(from, end - kBlock);
        if (!file.seek(start)) return std::nullopt;
        block = file.read(end - start);
        if (block.size() != end - start) return std::nullopt;
        const qsizetype lf = block.lastIndexOf('\n');
        if (lf >= 0) return start + lf + 1;
        end = start;
    }
    return from;
}

} // namespace

QString NotePath(const QString& dataFile) {
    const QFileInfo info(dataFile);
    return info.dir().filePath(QStringLiteral(".") + info.fileName() +
                               QStringLiteral(".appending"));
}

bool Begin(const QString& dataFile, qint64 lengthBefore) {
    QFile note(NotePath(dataFile));
    if (!note.open(QIODevice::WriteOnly | QIODevice::Truncate)) return false;
    const QByteArray text = QByteArray::number(lengthBefore) + '\n';
    const bool ok = note.write(text) == text.size() && note.flush();
    note.close();
    if (!ok) note.remove();
    return ok;
}

void End(const QString& dataFile) {
    QFile::remove(NotePath(dataFile));
}

std::optional<qint64> WholeLength(const QString& dataFile) {
    const std::optional<qint64> before = ReadNote(dataFile);
    if (!before) return std::nullopt;
    QFile file(dataFile);
    if (!file.open(QIODevice::ReadOnly)) return std::nullopt;
    const qint64 size = file.size();
    // A note cut short, or a file that is no longer the one appended to.
    if (*before < 0 || size <= *before) return size;
    return AfterLastLineEnd(file, *before, size);
}

bool Repair(const QString& dataFile) {
    const std::optional<qint64> whole = WholeLength(dataFile);
    if (!whole) {
        // A note without its data file has nothing left to say.
        if (!QFileInfo::exists(dataFile)) End(dataFile);
        return true;
    }
    QFile file(dataFile);
    if (file.size() > *whole && !file.resize(*whole)) return false;
    End(dataFile);
    return true;
}

} // namespace quorvel::append_note
