#pragma once
// Reads a fuzz input: a few leading bytes choose how a case runs, the rest is
// the data. Shared by the targets and built with both drivers (libFuzzer and
// the replay driver of the test suite).

#include <QByteArray>
#include <QList>

#include <cstddef>
#include <cstdint>

namespace quorvel::fuzz {

class Input {
public:
    Input(const std::uint8_t* data, std::size_t size)
        : data_(reinterpret_cast<const char*>(data), static_cast<qsizetype>(size)) {}
    // The next leading byte, 0 once the input is used up.
    std::uint8_t Byte() { return pos_ < data_.size() ? std::uint8_t(data_[pos_++]) : 0; }
    QByteArray Rest() const { return data_.mid(pos_); }

private:
    QByteArray data_;
    qsizetype pos_ = 0;
};

// Cuts bytes into pieces whose sizes follow a pattern drawn from seed; the
// same bytes and seed always give the same pieces.
inline QList<QByteArray> Pieces(const QByteArray& bytes, std::uint8_t seed) {
    QList<QByteArray> out;
    std::uint32_t state = seed * 2654435761u + 1;
    for (qsizetype pos = 0; pos < bytes.size();) {
        state = state * 1103515245u + 12345u;
        const qsizetype n = 1 + qsizetype((state >> 16) % 37);
        out << bytes.mid(pos, n);
        pos += n;
    }
    return out;
}

} // namespace quorvel::fuzz
