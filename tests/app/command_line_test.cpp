// The one parser of the command line: what each form starts and which
// arguments it refuses.

#include "app/command_line.h"

#include <gtest/gtest.h>

#include <ostream>

namespace quorvel {
namespace {

struct LineCase {
    const char* name;
    QStringList arguments;
    bool ok;
    bool scheduled = false;
    bool runAll = false;
    bool dryRun = false;
    bool quiet = false;
    const char* home = nullptr;
    const char* caFile = nullptr;
};
// The case's name in test listings.
void PrintTo(const LineCase& c, std::ostream* out) {
    *out << c.name;
}

class CommandLineTest : public ::testing::TestWithParam<LineCase> {};

TEST_P(CommandLineTest, ReadsTheForms) {
    const LineCase& c = GetParam();
    const CommandLine line = ParseCommandLine(c.arguments);
    EXPECT_EQ(line.error.isEmpty(), c.ok) << line.error.toStdString();
    if (!c.ok) return;
    EXPECT_EQ(line.scheduled, c.scheduled);
    EXPECT_EQ(line.runAll, c.runAll);
    EXPECT_EQ(line.dryRun, c.dryRun);
    EXPECT_EQ(line.quiet, c.quiet);
    EXPECT_EQ(line.home.value_or("<none>").toStdString(), c.home ? c.home : "<none>");
    EXPECT_EQ(line.caFile.value_or("<none>").toStdString(), c.caFile ? c.caFile : "<none>");
}

INSTANTIATE_TEST_SUITE_P(
    Forms, CommandLineTest,
    ::testing::Values(
        LineCase{"Nothing", {}, true}, LineCase{"ScheduleSwitchAnyCase", {"/s"}, true, true},
        LineCase{"ScheduleSwitchAfterHome",
                 {"--home", "/tmp/h", "/S"},
                 true,
                 true,
                 false,
                 false,
                 false,
                 "/tmp/h"},
        LineCase{
            "RunAllQuietDry", {"--run-all", "--quiet", "--dry-run"}, true, false, true, true, true},
        LineCase{"HomeWithEquals",
                 {"--run-all", "--home=/data/q"},
                 true,
                 false,
                 true,
                 false,
                 false,
                 "/data/q"},
        LineCase{"LastHomeWins",
                 {"--home", "/a", "--home", "/b"},
                 true,
                 false,
                 false,
                 false,
                 false,
                 "/b"},
        LineCase{"CaFile",
                 {"--ca-file", "/etc/ca.pem", "--run-all"},
                 true,
                 false,
                 true,
                 false,
                 false,
                 nullptr,
                 "/etc/ca.pem"},
        LineCase{
            "QtWindowOptionsPassThrough", {"-platform", "offscreen", "-style", "fusion"}, true},
        LineCase{"UnknownOption", {"--run-al"}, false},
        LineCase{"UnknownWord", {"files.txt"}, false},
        LineCase{"HomeWithoutFolder", {"--home"}, false},
        LineCase{"DryRunAlone", {"--dry-run"}, false},
        LineCase{"QuietWithTheWindow", {"/S", "--quiet"}, false}),
    [](const auto& info) { return std::string(info.param.name); });

TEST(UsageTest, NamesEveryExitCodeOfTheCommandLineRun) {
    const QString usage = UsageText(QStringLiteral("1.0"));
    for (const char* line : {"  0  every file succeeded", "  1  at least one file failed",
                             "  2  it could not start", "  3  another run holds the run lock"})
        EXPECT_TRUE(usage.contains(QLatin1String(line))) << line;
}

} // namespace
} // namespace quorvel
