#include "webdata/output_file.h"

#include "support/replacing_file.h"
#include "webdata/append_note.h"
#include "webdata/last_line.h"
#include "webdata/webdata_error.h"

#include <QFile>
#include <QFileInfo>

namespace quorvel {

namespace {
// Short writes are gathered up to this size ...
constexpr qsizetype kGather = 256 * 1024;
// ... and a run of records this long goes out as it is, without a copy.
constexpr qsizetype kRunAsItIs = 32 * 1024;
} // namespace

OutputFile::OutputFile() = default;

OutputFile::~OutputFile() {
    try {
        Abandon();
    } catch (const WebDataError&) {
        // Nothing left to tell anyone at this point.
    }
}

void OutputFile::Open(const QString& path, Mode mode, bool& created) {
    Abandon();
    path_ = path;
    created = !QFileInfo::exists(path);
    pending_.clear();
    pending_.reserve(static_cast<std::size_t>(kGather) + 4096);
    if (mode == Mode::kReplace) {
        auto file = std::make_unique<ReplacingFile>(path);
        if (!file->Open()) throw WebDataError(file->ErrorText());
        replace_ = std::move(file);
        return;
    }
    bool needsLineEnd = false;
    if (!created) {
        const std::optional<LastLine> last = ReadLastLine(path);
        needsLineEnd = last && !last->endsWithLineEnd;
    }
    auto file = std::make_unique<QFile>(path);
    // Unbuffered: what write() reports is what reached the file.
    if (!file->open(QIODevice::WriteOnly | QIODevice::Append | QIODevice::Unbuffered))
        throw WebDataError(file->errorString() + QStringLiteral(": ") + path);
    whole_ = file->size();
    // Without the note a kill could leave a torn record; the append still goes
    // on, since a failed write is cut back all the same.
    noted_ = append_note::Begin(path, whole_);
    append_ = std::move(file);
    if (needsLineEnd) pending_.append("\r\n");
}

void OutputFile::WriteLine(QByteArrayView line) {
    pending_.append(line.data(), static_cast<std::size_t>(line.size()));
    pending_.append("\r\n", 2);
    if (pending_.size() >= static_cast<std::size_t>(kGather)) Flush();
}

void OutputFile::WriteLines(QByteArrayView lines) {
    if (lines.size() < kRunAsItIs) {
        pending_.append(lines.data(), static_cast<std::size_t>(lines.size()));
        if (pending_.size() >= static_cast<std::size_t>(kGather)) Flush();
        return;
    }
    // After what was gathered before it.
    Flush();
    Write(lines.data(), lines.size());
}

void OutputFile::Write(const char* bytes, qint64 size) {
    const bool written = append_ ? append_->write(bytes, size) == size
                                 : replace_->Write(QByteArrayView(bytes, size));
    if (!written) Fail();
    whole_ += size;
}

void OutputFile::Flush() {
    if (pending_.empty() || !IsOpen()) return;
    Write(pending_.data(), static_cast<qint64>(pending_.size()));
    pending_.clear();
}

// Cuts an append back to its last whole record, or drops a replacing file,
// then reports.
void OutputFile::Fail() {
    QString why;
    if (append_) {
        why = append_->errorString() + QStringLiteral(": ") + path_;
        append_->resize(whole_);
        append_->close();
        if (noted_) append_note::End(path_);
    } else if (replace_) {
        why = replace_->ErrorText();
        replace_->Cancel();
    }
    append_.reset();
    replace_.reset();
    pending_.clear();
    throw WebDataError(why);
}

void OutputFile::Finish() {
    if (replace_) {
        if (!replace_->Commit()) Fail();
    } else {
        append_->close();
        if (noted_) append_note::End(path_);
    }
    append_.reset();
    replace_.reset();
}

void OutputFile::Close() {
    if (!IsOpen()) return;
    Flush();
    Finish();
}

void OutputFile::Abandon() {
    if (replace_) {
        replace_->Cancel();
        replace_.reset();
        pending_.clear();
        return;
    }
    if (!append_) return;
    Flush();
    Finish();
}

} // namespace quorvel
