#include "webdata/chunk_decoder.h"

#include <algorithm>
#include <utility>

namespace quorvel {

namespace {
// Size, chunk-end and trailer lines are short; anything longer is not chunked coding.
constexpr qsizetype kControlLineLimit = 8192;
constexpr std::int64_t kChunkLimit = std::int64_t{1} << 40;

// A trailer field is "name: value" with a token for its name.
bool IsField(QByteArrayView line) {
    const qsizetype colon = line.indexOf(':');
    if (colon <= 0) return false;
    for (const char c : line.first(colon)) {
        const bool token = (c >= '0' && c <= '9') || (c >= 'a' && c <= 'z') ||
                           (c >= 'A' && c <= 'Z') || QByteArrayView("!#$%&'*+-.^_`|~").contains(c);
        if (!token) return false;
    }
    return true;
}

int HexDigit(char c) {
    if (c >= '0' && c <= '9') return c - '0';
    if (c >= 'a' && c <= 'f') return c - 'a' + 10;
    if (c >= 'A' && c <= 'F') return c - 'A' + 10;
    return -1;
}
} // namespace

void ChunkDecoder::Reset() {
    stage_ = Stage::Size;
    remaining_ = 0;
    line_.clear();
    givenBack_.clear();
}

QByteArray ChunkDecoder::TakeGivenBack() {
    return std::exchange(givenBack_, QByteArray());
}

ChunkDecoder::Result ChunkDecoder::EndOfLine(QByteArrayView whole) {
    QByteArrayView line = whole;
    if (line.endsWith('\r')) line.chop(1);
    switch (stage_) {
    case Stage::Size: {
        std::int64_t size = 0;
        qsizetype digits = 0;
        for (; digits < line.size(); ++digits) {
            const int d = HexDigit(line[digits]);
            if (d < 0) break;
            size = size * 16 + d;
            if (size > kChunkLimit) return Result::Invalid;
        }
        const QByteArrayView rest = line.sliced(digits).trimmed();
        if (digits == 0 || (!rest.isEmpty() && !rest.startsWith(';'))) return Result::Invalid;
        remaining_ = size;
        stage_ = size == 0 ? Stage::Trailer : Stage::Data;
        return Result::NeedMore;
    }
    case Stage::DataEnd:
        if (!line.isEmpty()) return Result::Invalid;
        stage_ = Stage::Size;
        return Result::NeedMore;
    case Stage::Trailer:
        if (line.isEmpty() || !IsField(line)) {
            if (!line.isEmpty()) givenBack_ = whole.toByteArray() + '\n';
            stage_ = Stage::Done;
            return Result::Done;
        }
        return Result::NeedMore;
    case Stage::Data:
    case Stage::Done:
        break;
    }
    return Result::Invalid;
}

ChunkDecoder::Result ChunkDecoder::Decode(QByteArrayView input, QByteArray& output,
                                          qsizetype& consumed) {
    consumed = 0;
    while (consumed < input.size()) {
        if (stage_ == Stage::Done) return Result::Done;
        if (stage_ == Stage::Data) {
            const qsizetype take =
                static_cast<qsizetype>(std::min<std::int64_t>(remaining_, input.size() - consumed));
            output.append(input.sliced(consumed, take));
            consumed += take;
            remaining_ -= take;
            if (remaining_ == 0) stage_ = Stage::DataEnd;
            continue;
        }
        const QByteArrayView rest = input.sliced(consumed);
        const qsizetype lf = rest.indexOf('\n');
        if (lf < 0) {
            line_.append(rest);
            consumed = input.size();
            return line_.size() > kControlLineLimit ? Result::Invalid : Result::NeedMore;
        }
        line_.append(rest.first(lf));
        consumed += lf + 1;
        const QByteArray line = std::exchange(line_, QByteArray());
        const Result r = EndOfLine(line);
        if (r != Result::NeedMore) return r;
    }
    return stage_ == Stage::Done ? Result::Done : Result::NeedMore;
}

} // namespace quorvel
