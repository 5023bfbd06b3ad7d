#pragma once
// The most-recently-used list of file-list names behind the File menu: five
// entries, newest first, an empty entry is free.

#include <QString>

#include <array>

namespace quorvel {

class RecentFiles {
public:
    static constexpr int kEntries = 5;

    // Entries are numbered 1 to kEntries like the menu entries.
    QString Entry(int number) const;
    void SetEntry(int number, const QString& fileName);

    // Puts fileName on top. A name already present (in any letter case) moves
    // up without being duplicated; otherwise the oldest entry drops out.
    void Add(const QString& fileName);

    // The menu shows an entry's full name as its caption, and only while the
    // file list comes from the user (not from the administrator).
    QString Caption(int number) const { return Entry(number); }
    bool IsEntryVisible(int number, bool fileListFromUser) const;
    // The separator above the entries follows entry 1.
    bool IsSeparatorVisible(bool fileListFromUser) const {
        return IsEntryVisible(1, fileListFromUser);
    }

    bool operator==(const RecentFiles&) const = default;

private:
    std::array<QString, kEntries> entries_;
};

} // namespace quorvel
