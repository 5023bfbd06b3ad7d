#pragma once
// An INI file with the private-profile behaviour: sections and keys compared
// without regard to case. A write changes only the line of its key: every
// other line goes back byte for byte, with its own line end (CR LF, LF or a
// lone CR). Each line reads as UTF-8 where valid, else as Latin-1. The file is
// replaced only by a completely written copy and created readable by its owner
// only.

#include <QString>

#include <vector>

namespace quorvel {

struct IniEntry {
    QString key;
    QString value;
};

class IniStore {
public:
    explicit IniStore(QString path);

    const QString& Path() const { return path_; }

    // The value, at most 255 characters; the default when the file or key is missing.
    QString Read(const QString& section, const QString& key, const QString& fallback) const;
    // Creates the file, the section or the key as needed; false when it failed,
    // with the reason in LastError() and the file as it was.
    bool Write(const QString& section, const QString& key, const QString& value);
    // Sets every entry, in order, with one replacement of the file.
    bool WriteAll(const QString& section, const std::vector<IniEntry>& entries);
    // Names the file and gives the system's reason; empty after a good write.
    const QString& LastError() const { return lastError_; }

    static constexpr int kMaxValueLength = 255;

private:
    QString path_;
    QString lastError_;
};

// The settings of section "General": an empty value is stored as "Null" and
// "Null" in any letter case reads back as empty.
class LocalSettings {
public:
    explicit LocalSettings(QString path);

    QString GetLocalSetting(const QString& key, const QString& fallback) const;
    bool SaveLocalSetting(const QString& key, const QString& value);
    // Every key in one write of the file (empty values as "Null").
    bool SaveLocalSettings(const std::vector<IniEntry>& entries);

    const QString& Path() const { return store_.Path(); }
    const QString& LastError() const { return store_.LastError(); }

private:
    IniStore store_;
};

} // namespace quorvel
