// The listing a "DIR" record writes of the local folders.

#include "app/run/directory_listing.h"
#include "common/recorders.h"
#include "common/temp_home.h"

#include <QDir>
#include <QFile>
#include <QLocale>

#include <gtest/gtest.h>

namespace quorvel {
namespace {

using testing::TempHome;

TEST(ListingLines, FixedWidthFileLinesAndFolderHeaders) {
    const DateValue when = MakeDate(2024, 3, 5, 7, 8, 9);
    struct Case {
        int depth;
        QString name;
        std::int64_t size;
        QString line;
    };
    const Case cases[] = {
        {0, "a.csv", 12, "a.csv                       12   5 Mar 2024 07:08:09"},
        {1, "twenty-five-chars-long.csv", 1250000,
         "    twenty-five-chars-lo 1,250,000   5 Mar 2024 07:08:09"},
        // A size too wide for its column keeps its end.
        {0, "big", 123456789012, "big                 56,789,012   5 Mar 2024 07:08:09"},
    };
    QString separator = QLocale::system().groupSeparator();
    if (separator.isEmpty()) separator = ",";
    for (const Case& c : cases)
        EXPECT_EQ(ListingFileLine(c.depth, c.name, c.size, when),
                  QString(c.line).replace(",", separator));
    EXPECT_EQ(ListingFolderLine(0, "/data"), "/data ===========");
    EXPECT_EQ(ListingFolderLine(2, "/data/a/b"), "========/data/a/b ===========");
}

TEST(ListingTrees, OneTreeWhenAFolderLiesInTheOtherByText) {
    struct Case {
        QString application, data;
        QStringList trees;
    };
    const Case cases[] = {
        {"/opt/q", "/opt/q", {"/opt/q"}},
        {"/opt/Q", "/OPT/q", {"/opt/Q"}},
        {"/srv/data/app", "/srv/data", {"/srv/data"}},
        {"/srv/app", "/srv/app/data", {"/srv/app"}},
        // A plain text test: a sibling whose name starts with the other's counts as inside.
        {"/srv/app", "/srv/app2", {"/srv/app"}},
        {"/opt/q", "/srv/data", {"/opt/q", "/srv/data"}},
    };
    for (const Case& c : cases)
        EXPECT_EQ(ListingTrees(c.application, c.data), c.trees) << c.data.toStdString();
}

QStringList Lines(const QByteArray& bytes) {
    QStringList lines = QString::fromUtf8(bytes).split("\r\n");
    if (lines.last().isEmpty()) lines.removeLast();
    return lines;
}

TEST(ListingFile, SubFoldersComeFirstSortedAndNothingIsLeftOutOrFollowed) {
    TempHome home;
    testing::RecordingPorts ports;
    const QString app = home.File("app");
    home.Write("app/b.csv", "12");
    home.Write("app/a.csv", "1");
    home.Write("app/.hidden", "x");
    home.Write("app/2024.v2/old.csv", "123");
    home.Write("app/sub/empty/.keep", "");
    home.Write("app/sub/z.dat", "");
    ASSERT_TRUE(QFile::link(app + "/sub", app + "/loop"));
    const LocationFolders folders{app, app, "Farm1", "2024", {}, {}};
    const QString output = app + "/dir.txt";
    ASSERT_FALSE(GenerateAllFiles(output, folders, MakeDate(2024, 11, 1, 10, 20, 0)));

    QStringList lines = Lines(home.Read("app/dir.txt"));
    // Sizes and times vary; the names and structure are the point.
    for (qsizetype i = 5; i < lines.size(); ++i)
        if (!lines[i].contains("=")) lines[i] = lines[i].left(24).trimmed();
    const QStringList expected = {
        "Date: 1 Nov 2024 10:20:00",
        "Application folder: " + app,
        "Data folder: " + app,
        "User folder: Farm1",
        "User current folder: 2024",
        app + " ===========",
        "====" + app + "/2024.v2 ===========",
        "old.csv",
        "====" + app + "/loop =========== link to " + app + "/sub, not entered",
        "====" + app + "/sub ===========",
        "========" + app + "/sub/empty ===========",
        "z.dat",
        "a.csv",
        "b.csv",
    };
    EXPECT_EQ(lines, expected);
    // The listing never lists itself half-written.
    EXPECT_FALSE(home.Read("app/dir.txt").contains("dir.txt"));
}

TEST(ListingFile, AnOutputThatCannotBeWrittenIsReportedAndWritesNothing) {
    TempHome home;
    const LocationFolders folders{home.Path(), home.Path(), {}, {}, {}, {}};
    const auto error = GenerateAllFiles(home.File("missing/dir.txt"), folders, 0);
    ASSERT_TRUE(error.has_value());
    EXPECT_EQ(error->where, "GenerateAllFiles");
    EXPECT_FALSE(QFile::exists(home.File("missing")));
}

} // namespace
} // namespace quorvel
