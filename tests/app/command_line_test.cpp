// The one parser of the command line: what each form starts and which
// arguments it refuses.

#include "app/command_line.h"

#include <gtest/gtest.h>

namespace quorvel {
namespace {

// The switches a line set, as letters: S (scheduled), R (run all), D (dry run), Q (quiet).
std::string Switches(const CommandLine& line) {
    std::string out;
    for (const auto& [on, letter] : {std::pair{line.scheduled, 'S'},
                                     {line.runAll, 'R'},
                                     {line.dryRun, 'D'},
                                     {line.quiet, 'Q'}})
        if (on) out += letter;
    return out;
}

TEST(CommandLineTest, ReadsTheFormsAndRefusesTheRest) {
    struct Case {
        QStringList arguments;
        bool ok;
        const char* switches = "";
        const char* home = "<none>";
        const char* caFile = "<none>";
    };
    const Case cases[] = {
        {{}, true},
        {{"/s"}, true, "S"}, // any letter case
        {{"--home", "/tmp/h", "/S"}, true, "S", "/tmp/h"},
        {{"--run-all", "--quiet", "--dry-run"}, true, "RDQ"},
        {{"--run-all", "--home=/data/q"}, true, "R", "/data/q"},
        {{"--home", "/a", "--home", "/b"}, true, "", "/b"}, // the last wins
        {{"--ca-file", "/etc/ca.pem", "--run-all"}, true, "R", "<none>", "/etc/ca.pem"},
        {{"-platform", "offscreen", "-style", "fusion"}, true}, // Qt's own pass through
        {{"--run-al"}, false},
        {{"files.txt"}, false},
        {{"--home"}, false},
        {{"--dry-run"}, false},
        {{"/S", "--quiet"}, false},
    };
    for (const Case& c : cases) {
        SCOPED_TRACE(c.arguments.join(' ').toStdString());
        const CommandLine line = ParseCommandLine(c.arguments);
        EXPECT_EQ(line.error.isEmpty(), c.ok) << line.error.toStdString();
        if (!c.ok) continue;
        EXPECT_EQ(Switches(line), c.switches);
        EXPECT_EQ(line.home.value_or("<none>").toStdString(), c.home);
        EXPECT_EQ(line.caFile.value_or("<none>").toStdString(), c.caFile);
    }
}

TEST(UsageTest, NamesEveryExitCodeOfTheCommandLineRun) {
    const QString usage = UsageText(QStringLiteral("1.0"));
    for (const char* line : {"  0  every file succeeded", "  1  at least one file failed",
                             "  2  it could not start", "  3  another run holds the run lock"})
        EXPECT_TRUE(usage.contains(QLatin1String(line))) << line;
}

} // namespace
} // namespace quorvel
