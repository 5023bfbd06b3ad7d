#include "support/ini_store.h"

#include "support/replacing_file.h"
#include "support/text_lines.h"

#include <QFile>

#include <optional>

namespace quorvel {

namespace {

// The file as it is on disk: lines the program does not change are written
// back byte for byte, with their own line ends.
struct IniText {
    std::vector<ByteLine> lines;
    QByteArray eol = "\n"; // for lines the program adds: the file's first line end
};

IniText ReadLines(const QString& path) {
    IniText text;
    QFile file(path);
    if (!file.open(QIODevice::ReadOnly)) return text;
    text.lines = SplitByteLines(file.readAll());
    for (const ByteLine& line : text.lines) {
        if (!line.end.isEmpty()) {
            text.eol = line.end;
            break;
        }
    }
    return text;
}

QString TextOf(const ByteLine& line) {
    return DecodeLine(line.text);
}

// The section name when the line opens one.
std::optional<QString> SectionOf(const QString& line) {
    const QString t = line.trimmed();
    if (t.startsWith(u'[') && t.contains(u']')) return t.mid(1, t.indexOf(u']') - 1).trimmed();
    return std::nullopt;
}

bool IsKeyLine(const QString& line, const QString& key) {
    const QString t = line.trimmed();
    if (t.startsWith(u';')) return false;
    const qsizetype eq = t.indexOf(u'=');
    return eq > 0 && t.left(eq).trimmed().compare(key, Qt::CaseInsensitive) == 0;
}

QString ValueOf(const QString& line) {
    QString v = line.mid(line.indexOf(u'=') + 1).trimmed();
    if (v.size() >= 2 &&
        ((v.front() == u'"' && v.back() == u'"') || (v.front() == u'\'' && v.back() == u'\'')))
        v = v.mid(1, v.size() - 2);
    return v;
}

// Index range [first, end) of a section's body, or nullopt when it is missing.
std::optional<std::pair<qsizetype, qsizetype>> FindSection(const std::vector<ByteLine>& lines,
                                                           const QString& section) {
    const auto count = static_cast<qsizetype>(lines.size());
    for (qsizetype i = 0; i < count; ++i) {
        const auto name = SectionOf(TextOf(lines[i]));
        if (!name || name->compare(section, Qt::CaseInsensitive) != 0) continue;
        qsizetype end = i + 1;
        while (end < count && !SectionOf(TextOf(lines[end])))
            ++end;
        return std::make_pair(i + 1, end);
    }
    return std::nullopt;
}

bool IsBlank(const ByteLine& line) {
    return line.text.trimmed().isEmpty();
}

// Puts a line in at index, ending the line before it when that one had no end.
void InsertLine(IniText& text, qsizetype index, const QByteArray& bytes) {
    if (index > 0 && text.lines[index - 1].end.isEmpty()) text.lines[index - 1].end = text.eol;
    text.lines.insert(text.lines.begin() + index, ByteLine{bytes, text.eol});
}

QByteArray Joined(const IniText& text) {
    QByteArray bytes;
    for (const ByteLine& line : text.lines)
        bytes += line.text + line.end;
    return bytes;
}

} // namespace

IniStore::IniStore(QString path) : path_(std::move(path)) {}

QString IniStore::Read(const QString& section, const QString& key, const QString& fallback) const {
    const IniText text = ReadLines(path_);
    if (const auto range = FindSection(text.lines, section)) {
        for (qsizetype i = range->first; i < range->second; ++i) {
            const QString line = TextOf(text.lines[i]);
            if (IsKeyLine(line, key)) return ValueOf(line).left(kMaxValueLength);
        }
    }
    return fallback.left(kMaxValueLength);
}

namespace {

// Puts key=value into the section of text: the key's line when it has one,
// else a new line after the section's last non-blank line (a new section at
// the end when there is none).
void SetEntry(IniText& text, const QString& section, const QString& key, const QString& value) {
    // A line break inside a value would start a new line of the file.
    QString clean = value;
    clean.replace(u'\r', u' ').replace(u'\n', u' ');
    const QByteArray entry = (key + u'=' + clean).toUtf8();

    if (const auto range = FindSection(text.lines, section)) {
        qsizetype insertAt = range->first;
        for (qsizetype i = range->first; i < range->second; ++i) {
            if (IsKeyLine(TextOf(text.lines[i]), key)) {
                text.lines[i].text = entry;
                return;
            }
            if (!IsBlank(text.lines[i])) insertAt = i + 1;
        }
        InsertLine(text, insertAt, entry);
        return;
    }
    if (!text.lines.empty() && !IsBlank(text.lines.back()))
        InsertLine(text, static_cast<qsizetype>(text.lines.size()), {});
    InsertLine(text, static_cast<qsizetype>(text.lines.size()), (u'[' + section + u']').toUtf8());
    InsertLine(text, static_cast<qsizetype>(text.lines.size()), entry);
}

} // namespace

bool IniStore::Write(const QString& section, const QString& key, const QString& value) {
    return WriteAll(section, {{key, value}});
}

bool IniStore::WriteAll(const QString& section, const std::vector<IniEntry>& entries) {
    IniText text = ReadLines(path_);
    for (const IniEntry& entry : entries)
        SetEntry(text, section, entry.key, entry.value);
    // The settings hold a password: a new file is for its owner's eyes only.
    const auto error =
        ReplaceFileContents(path_, Joined(text), QFileDevice::ReadOwner | QFileDevice::WriteOwner);
    lastError_ = error.value_or(QString());
    return !error;
}

LocalSettings::LocalSettings(QString path) : store_(std::move(path)) {}

QString LocalSettings::GetLocalSetting(const QString& key, const QString& fallback) const {
    const QString value = store_.Read(QStringLiteral("General"), key, fallback);
    if (value.compare(QLatin1String("Null"), Qt::CaseInsensitive) == 0) return {};
    return value;
}

namespace {

QString StoredValue(const QString& value) {
    return value.isEmpty() ? QStringLiteral("Null") : value;
}

} // namespace

bool LocalSettings::SaveLocalSetting(const QString& key, const QString& value) {
    return store_.Write(QStringLiteral("General"), key, StoredValue(value));
}

bool LocalSettings::SaveLocalSettings(const std::vector<IniEntry>& entries) {
    std::vector<IniEntry> stored;
    stored.reserve(entries.size());
    for (const IniEntry& entry : entries)
        stored.push_back({entry.key, StoredValue(entry.value)});
    return store_.WriteAll(QStringLiteral("General"), stored);
}

} // namespace quorvel
