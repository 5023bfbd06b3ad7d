#pragma once
// An INI file with the private-profile behaviour: sections and keys compared
// without regard to case, unknown lines kept on write, written atomically and
// created readable by its owner only.

#include <QString>

namespace quorvel {

class IniStore {
public:
    explicit IniStore(QString path);

    const QString& Path() const { return path_; }

    // The value, at most 255 characters; the default when the file or key is missing.
    QString Read(const QString& section, const QString& key, const QString& fallback) const;
    // Creates the file, the section or the key as needed; false when it failed.
    bool Write(const QString& section, const QString& key, const QString& value);

    static constexpr int kMaxValueLength = 255;

private:
    QString path_;
};

// The settings of section "General": an empty value is stored as "Null" and
// "Null" in any letter case reads back as empty.
class LocalSettings {
public:
    explicit LocalSettings(QString path);

    QString GetLocalSetting(const QString& key, const QString& fallback) const;
    bool SaveLocalSetting(const QString& key, const QString& value);

    const QString& Path() const { return store_.Path(); }

private:
    IniStore store_;
};

} // namespace quorvel
