#include "app/recent_files.h"

namespace quorvel {

QString RecentFiles::Entry(int number) const {
    return number >= 1 && number <= kEntries ? entries_[number - 1] : QString();
}

void RecentFiles::SetEntry(int number, const QString& fileName) {
    if (number >= 1 && number <= kEntries) entries_[number - 1] = fileName;
}

void RecentFiles::Add(const QString& fileName) {
    int last = kEntries - 1; // the entry that makes room
    for (int i = 0; i < kEntries; ++i) {
        if (entries_[i].compare(fileName, Qt::CaseInsensitive) == 0) {
            last = i;
            break;
        }
    }
    for (int i = last; i > 0; --i)
        entries_[i] = entries_[i - 1];
    entries_[0] = fileName;
}

bool RecentFiles::IsEntryVisible(int number, bool fileListFromUser) const {
    return fileListFromUser && !Entry(number).isEmpty();
}

} // namespace quorvel
