#include "webdata/simple_cipher.h"

namespace quorvel {

namespace {

int SixBitValue(char16_t c) {
    if (c >= u'0' && c <= u'9') return c - 48;
    if (c >= u'?' && c <= u'Z') return c - 53;
    if (c >= u'a' && c <= u'z') return c - 59;
    return -1;
}

char16_t FromSixBitValue(int v) {
    if (v >= 0 && v <= 9) return static_cast<char16_t>(v + 48);
    if (v >= 10 && v <= 37) return static_cast<char16_t>(v + 53);
    if (v >= 38 && v <= 63) return static_cast<char16_t>(v + 59);
    return static_cast<char16_t>(v);
}

} // namespace

QString ExpandKey(const QString& key) {
    QString expanded = key;
    if (expanded.isEmpty()) return expanded;
    while (expanded.size() <= 50)
        expanded += expanded;
    return expanded;
}

std::optional<QString> EncryptSimple(const QString& text, const QString& key) {
    QString out = text;
    for (qsizetype i = 0; i < out.size(); ++i) {
        const int v = SixBitValue(out.at(i).unicode());
        if (v < 0) continue;
        if (i >= key.size()) return std::nullopt;
        out[i] = QChar(FromSixBitValue(v ^ key.at(i).unicode()));
    }
    return out;
}

} // namespace quorvel
