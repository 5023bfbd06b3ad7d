#include "webdata/output_file.h"

#include "webdata/last_line.h"
#include "webdata/webdata_error.h"

#include <QFileInfo>

namespace quorvel {

namespace {
constexpr qsizetype kGather = 256 * 1024;
}

OutputFile::~OutputFile() {
    try {
        Close();
    } catch (const WebDataError&) {
        // Nothing left to tell anyone at this point.
    }
}

void OutputFile::Open(const QString& path, bool& created) {
    Close();
    created = !QFileInfo::exists(path);
    bool needsLineEnd = false;
    if (!created) {
        const std::optional<LastLine> last = ReadLastLine(path);
        needsLineEnd = last && !last->endsWithLineEnd;
    }
    file_.setFileName(path);
    const QIODevice::OpenMode mode = created ? QIODevice::WriteOnly : QIODevice::Append;
    if (!file_.open(mode)) throw WebDataError(file_.errorString() + QStringLiteral(": ") + path);
    pending_.reserve(static_cast<std::size_t>(kGather) + 4096);
    if (needsLineEnd) pending_.append("\r\n");
}

void OutputFile::WriteLine(QByteArrayView line) {
    pending_.append(line.data(), static_cast<std::size_t>(line.size()));
    pending_.append("\r\n", 2);
    if (pending_.size() >= static_cast<std::size_t>(kGather)) Flush();
}

void OutputFile::WriteLines(QByteArrayView lines) {
    if (lines.size() < kGather) {
        pending_.append(lines.data(), static_cast<std::size_t>(lines.size()));
        if (pending_.size() >= static_cast<std::size_t>(kGather)) Flush();
        return;
    }
    // A long run goes out as it is, after what was gathered before it.
    Flush();
    if (file_.write(lines.data(), lines.size()) != lines.size())
        throw WebDataError(file_.errorString() + QStringLiteral(": ") + file_.fileName());
}

void OutputFile::Flush() {
    if (pending_.empty()) return;
    const qint64 size = static_cast<qint64>(pending_.size());
    const qint64 written = file_.write(pending_.data(), size);
    const bool ok = written == size && file_.flush();
    pending_.clear();
    if (!ok) throw WebDataError(file_.errorString() + QStringLiteral(": ") + file_.fileName());
}

void OutputFile::Close() {
    if (!file_.isOpen()) return;
    try {
        Flush();
        if (!file_.flush())
            throw WebDataError(file_.errorString() + QStringLiteral(": ") + file_.fileName());
    } catch (const WebDataError&) {
        file_.close();
        throw;
    }
    file_.close();
}

} // namespace quorvel
