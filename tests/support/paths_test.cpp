#include "support/paths.h"

#include <gtest/gtest.h>

using namespace quorvel;

TEST(Paths, SplitsFullPathsTrailingSeparatorsAndSlashes) {
    EXPECT_EQ(GetFileName("C:\\data\\site1.dat"), QString("site1.dat"));
    EXPECT_EQ(GetFileName("/data/site1.dat"), QString("site1.dat"));
    EXPECT_EQ(GetFileName("C:\\data/sub\\x.txt"), QString("x.txt"));
    EXPECT_EQ(GetFileName("plain.txt"), QString("plain.txt"));
    EXPECT_EQ(GetFileName("/data/"), QString());
    EXPECT_EQ(GetPath("/data/site1.dat"), QString("/data"));
    EXPECT_EQ(GetPath("C:\\data\\site1.dat"), QString("C:\\data"));
    EXPECT_EQ(GetPath("plain.txt"), QString());
    EXPECT_EQ(GetFileNameFromURL("http://host/a/b/files.txt"), QString("files.txt"));
    EXPECT_EQ(GetFileNameFromURL("files.txt"), QString("files.txt"));
    EXPECT_TRUE(IsFullPath("/home/user"));
    EXPECT_TRUE(IsFullPath("C:\\Data"));
    EXPECT_TRUE(IsFullPath("http://host/x"));
    EXPECT_TRUE(IsFullPath("\\\\server//share"));
    EXPECT_FALSE(IsFullPath("data\\site1.dat"));
    EXPECT_FALSE(IsFullPath(""));
    EXPECT_EQ(AddTrailingSlash(""), QString());
    EXPECT_EQ(AddTrailingSlash("C:\\Data/"), QString("C:\\Data/"));
    EXPECT_EQ(AddTrailingSlash("C:\\Data\\"), QString("C:\\Data\\"));
    EXPECT_EQ(AddTrailingSlash("/data"), QString("/data") + NativeSeparator());
    EXPECT_EQ(RemoveTrailingSlash("  C:\\Data\\\\  "), QString("C:\\Data\\"));
    EXPECT_EQ(RemoveTrailingSlash("/data/"), QString("/data"));
    EXPECT_EQ(RemoveTrailingSlash(""), QString());
    EXPECT_EQ(RemoveTrailingSlash("   "), QString());
    EXPECT_EQ(ConvertSlashes("a\\b/c", true), QString("a/b/c"));
    EXPECT_EQ(ConvertSlashes("a\\b/c", false), QString("a\\b\\c"));
    const QString native = ToNativeSeparators("data\\sub/x.dat");
    EXPECT_EQ(native, QString("data") + NativeSeparator() + "sub" + NativeSeparator() + "x.dat");
}
