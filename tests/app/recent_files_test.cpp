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

TEST(RecentFiles, NewNamesGoOnTopAndTheSixthPushesTheOldestOut) {
    RecentFiles recent;
    for (const char* name : {"a.txt", "b.txt", "c.txt", "d.txt", "e.txt"})
        recent.Add(name);
    EXPECT_EQ(Entries(recent), (QStringList{"e.txt", "d.txt", "c.txt", "b.txt", "a.txt"}));
    recent.Add("f.txt");
    EXPECT_EQ(Entries(recent), (QStringList{"f.txt", "e.txt", "d.txt", "c.txt", "b.txt"}));
}

TEST(RecentFiles, ANameInAnotherLetterCaseMovesToTheTopWithoutADuplicate) {
    RecentFiles recent;
    for (const char* name : {"/l/a.txt", "/l/b.txt", "/l/c.txt", "/l/d.txt"})
        recent.Add(name);
    recent.Add("/L/B.TXT");
    EXPECT_EQ(Entries(recent), (QStringList{"/L/B.TXT", "/l/d.txt", "/l/c.txt", "/l/a.txt", ""}));
    recent.Add("/l/a.txt");
    EXPECT_EQ(Entries(recent), (QStringList{"/l/a.txt", "/L/B.TXT", "/l/d.txt", "/l/c.txt", ""}));
}

TEST(RecentFiles, TheNewestAgainChangesNothing) {
    RecentFiles recent;
    recent.Add("a");
    recent.Add("b");
    recent.Add("b");
    EXPECT_EQ(Entries(recent), (QStringList{"b", "a", "", "", ""}));
}

TEST(RecentFiles, EntriesShowOnlyWhenFilledAndTheListIsTheUsersOwn) {
    RecentFiles recent;
    EXPECT_FALSE(recent.IsSeparatorVisible(true));
    recent.SetEntry(1, "/l/files.txt");
    recent.SetEntry(3, "/l/other.txt");
    EXPECT_TRUE(recent.IsSeparatorVisible(true));
    EXPECT_TRUE(recent.IsEntryVisible(1, true));
    EXPECT_FALSE(recent.IsEntryVisible(2, true));
    EXPECT_TRUE(recent.IsEntryVisible(3, true));
    EXPECT_EQ(recent.Caption(3), "/l/other.txt");
    EXPECT_FALSE(recent.IsSeparatorVisible(false));
    EXPECT_FALSE(recent.IsEntryVisible(1, false));
    EXPECT_FALSE(recent.IsEntryVisible(6, true));
}

} // namespace
} // namespace quorvel
