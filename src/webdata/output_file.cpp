#include "webdata/output_file.h"

#include "webdata/append_note.h"
#include "webdata/last_line.h"
#include "webdata/webdata_error.h"

#include <QFile>
#include <QFileInfo>
#include <QSaveFile>

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
    mode_ = mode;
    path_ = path;
    created = !QFileInfo::exists(path);
    pending_.clear();
    pending_.reserve(static_cast<std::size_t>(kGather) + 4096);
    if (mode == Mode::kReplace) {
        auto file = std::make_unique<QSaveFile>(path);
        if (!file->open(QIODevice::WriteOnly))
            throw WebDataError(file->errorString() + QStringLiteral(": ") + path);
        device_ = std::move(file);
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
    device_ = std::move(file);
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
    if (device_->write(lines.data(), lines.size()) != lines.size()) Fail(device_->errorString());
    whole_ += lines.size();
}

void OutputFile::Flush() {
    if (pending_.empty() || !device_) return;
    const qint64 size = static_cast<qint64>(pending_.size());
    const qint64 written = device_->write(pending_.data(), size);
    pending_.clear();
    if (written != size) Fail(device_->errorString());
    whole_ += size;
}

// Cuts an append back to its last whole record, or drops a replacing file,
// then reports.
void OutputFile::Fail(const QString& why) {
    const QString path = path_;
    if (auto* file = dynamic_cast<QFile*>(device_.get())) {
        file->resize(whole_);
        file->close();
        if (noted_) append_note::End(path);
    } else if (auto* save = dynamic_cast<QSaveFile*>(device_.get())) {
        save->cancelWriting();
    }
    device_.reset();
    pending_.clear();
    throw WebDataError(why + QStringLiteral(": ") + path);
}

void OutputFile::Finish() {
    if (auto* save = dynamic_cast<QSaveFile*>(device_.get())) {
        if (!save->commit()) Fail(save->errorString());
    } else {
        device_->close();
        if (noted_) append_note::End(path_);
    }
    device_.reset();
}

void OutputFile::Close() {
    if (!device_) return;
    Flush();
    Finish();
}

void OutputFile::Abandon() {
    if (!device_) return;
    if (mode_ == Mode::kReplace) {
        static_cast<QSaveFile*>(device_.get())->cancelWriting();
        device_.reset();
        pending_.clear();
        return;
    }
    Flush();
    Finish();
}

} // namespace quorvel
