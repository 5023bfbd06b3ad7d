// The most-recently-used list of file lists.

#include "app/recent_files.h"

#include <QStringList>

#include <gtest/gtest.h>

namespace quorvel {
namespace {

QStringList Entries(const RecentFiles& recent) {
    QStringList out;
    for (int n = 1; n <= RecentFiles::kEntries; ++n)
        out << recent.Entry(n);
    return out;
}

TEST(RecentFiles, TheSixthPushesTheOldestOutAndAnotherCaseMovesToTheTop) {
    RecentFiles recent;
    for (const char* name : {"a", "b", "c", "d", "e", "f"})
        recent.Add(name);
    EXPECT_EQ(Entries(recent), (QStringList{"f", "e", "d", "c", "b"}));

    // A name in another letter case moves to the top.
    recent = RecentFiles();
    for (const char* name : {"/l/a.txt", "/l/b.txt", "/l/c.txt", "/l/d.txt"})
        recent.Add(name);
    recent.Add("/L/B.TXT");
    EXPECT_EQ(Entries(recent), (QStringList{"/L/B.TXT", "/l/d.txt", "/l/c.txt", "/l/a.txt", ""}));
    recent.Add("/L/B.TXT");
    EXPECT_EQ(Entries(recent).count("/L/B.TXT"), 1);
}

TEST(RecentFiles, EntriesShowOnlyWhenFilledAndTheListIsTheUsersOwn) {
    RecentFiles recent;
    EXPECT_FALSE(recent.IsSeparatorVisible(true));
    recent.SetEntry(1, "/l/files.txt");
    recent.SetEntry(3, "/l/other.txt");
    EXPECT_TRUE(recent.IsSeparatorVisible(true) && recent.IsEntryVisible(3, true));
    EXPECT_FALSE(recent.IsEntryVisible(2, true));
    EXPECT_EQ(recent.Caption(3), "/l/other.txt");
    EXPECT_FALSE(recent.IsSeparatorVisible(false) || recent.IsEntryVisible(1, false));
}

} // namespace
} // namespace quorvel
