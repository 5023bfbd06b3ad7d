#include "support/ini_store.h"

#include <QFile>
#include <QFileInfo>
#include <QSaveFile>
#include <QStringList>

namespace quorvel {

namespace {

struct IniText {
    QStringList lines;
    QString eol = QStringLiteral("\n");
};

IniText ReadLines(const QString& path) {
    IniText text;
    QFile file(path);
    if (!file.open(QIODevice::ReadOnly)) return text;
    const QString all = QString::fromUtf8(file.readAll());
    if (all.contains(QLatin1String("\r\n"))) text.eol = QStringLiteral("\r\n");
    text.lines = all.split(u'\n');
    for (QString& line : text.lines)
        if (line.endsWith(u'\r')) line.chop(1);
    if (!text.lines.isEmpty() && text.lines.back().isEmpty()) text.lines.removeLast();
    return text;
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
std::optional<std::pair<qsizetype, qsizetype>> FindSection(const QStringList& lines,
                                                           const QString& section) {
    for (qsizetype i = 0; i < lines.size(); ++i) {
        const auto name = SectionOf(lines[i]);
        if (!name || name->compare(section, Qt::CaseInsensitive) != 0) continue;
        qsizetype end = i + 1;
        while (end < lines.size() && !SectionOf(lines[end]))
            ++end;
        return std::make_pair(i + 1, end);
    }
    return std::nullopt;
}

} // namespace

IniStore::IniStore(QString path) : path_(std::move(path)) {}

QString IniStore::Read(const QString& section, const QString& key, const QString& fallback) const {
    const IniText text = ReadLines(path_);
    if (const auto range = FindSection(text.lines, section)) {
        for (qsizetype i = range->first; i < range->second; ++i)
            if (IsKeyLine(text.lines[i], key)) return ValueOf(text.lines[i]).left(kMaxValueLength);
    }
    return fallback.left(kMaxValueLength);
}

bool IniStore::Write(const QString& section, const QString& key, const QString& value) {
    IniText text = ReadLines(path_);
    // A line break inside a value would start a new line of the file.
    QString clean = value;
    clean.replace(u'\r', u' ').replace(u'\n', u' ');
    const QString entry = key + u'=' + clean;

    if (const auto range = FindSection(text.lines, section)) {
        qsizetype insertAt = range->first;
        bool replaced = false;
        for (qsizetype i = range->first; i < range->second; ++i) {
            if (IsKeyLine(text.lines[i], key)) {
                text.lines[i] = entry;
                replaced = true;
                break;
            }
            if (!text.lines[i].trimmed().isEmpty()) insertAt = i + 1;
        }
        if (!replaced) text.lines.insert(insertAt, entry);
    } else {
        if (!text.lines.isEmpty() && !text.lines.back().trimmed().isEmpty())
            text.lines << QString();
        text.lines << u'[' + section + u']' << entry;
    }

    const bool isNew = !QFileInfo::exists(path_);
    QSaveFile file(path_);
    if (!file.open(QIODevice::WriteOnly)) return false;
    if (isNew) file.setPermissions(QFileDevice::ReadOwner | QFileDevice::WriteOwner);
    file.write((text.lines.join(text.eol) + text.eol).toUtf8());
    return file.commit();
}

LocalSettings::LocalSettings(QString path) : store_(std::move(path)) {}

QString LocalSettings::GetLocalSetting(const QString& key, const QString& fallback) const {
    const QString value = store_.Read(QStringLiteral("General"), key, fallback);
    if (value.compare(QLatin1String("Null"), Qt::CaseInsensitive) == 0) return {};
    return value;
}

bool LocalSettings::SaveLocalSetting(const QString& key, const QString& value) {
    return store_.Write(QStringLiteral("General"), key,
                        value.isEmpty() ? QStringLiteral("Null") : value);
}

} // namespace quorvel
