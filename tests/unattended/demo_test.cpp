// The demo's path without a display, in its short form: two runs of all
// files against the demo account, the second straight after the first.

#include "common/command_line_process.h"
#include "common/reference_service.h"
#include "common/temp_home.h"

#include <QProcess>
#include <QRegularExpression>
#include <QTcpSocket>

#include <gtest/gtest.h>

namespace quorvel::testing {
namespace {

TEST(DemoTest, TwoRunsWithoutADisplayAndNothingLeftRunning) {
    TempHome folder;
    QProcess demo;
    QProcessEnvironment env = CommandLineProcess::Unattended(folder.Path());
    demo.setProcessEnvironment(env);
    demo.setProcessChannelMode(QProcess::MergedChannels);
    demo.start(QStringLiteral(QUORVEL_SOURCE_DIR "/tools/demo"),
               {"--quorvel", ReferenceService::ProgramPath(), "--headless", "--pause", "0",
                "--folder", folder.File("demo")});
    ASSERT_TRUE(demo.waitForFinished(180000));
    const QString out = QString::fromUtf8(demo.readAll());
    ASSERT_EQ(demo.exitStatus(), QProcess::NormalExit) << out.toStdString();
    EXPECT_EQ(demo.exitCode(), 0) << out.toStdString();

    // Every file of the demo list, twice; the logger's file grows in between.
    EXPECT_EQ(out.count("Processed 8 file(s): 8 succeeded, 0 failed"), 2) << out.toStdString();
    // The first run fetches the logger's file whole.
    EXPECT_TRUE(QRegularExpression(R"(\[1/8\] Site 1: downloaded [\d.]+ Kb)").match(out).hasMatch())
        << out.toStdString();
    const auto second =
        QRegularExpression(R"(Second run.*\n(?:.*\n)*?.*\[1/8\] Site 1: (.*))").match(out);
    ASSERT_TRUE(second.hasMatch()) << out.toStdString();
    EXPECT_TRUE(QRegularExpression(R"(^(no new records|downloaded \d new records?)$)")
                    .match(second.captured(1))
                    .hasMatch())
        << second.captured(1).toStdString();
    EXPECT_EQ(out.count("(exit code 0)"), 2) << out.toStdString();
    EXPECT_TRUE(out.contains("FTP password: (enciphered in the configuration file)"));

    // The service it started is gone.
    const auto http = QRegularExpression(R"(HTTP: http://127\.0\.0\.1:(\d+)/)").match(out);
    ASSERT_TRUE(http.hasMatch()) << out.toStdString();
    QTcpSocket probe;
    probe.connectToHost(QStringLiteral("127.0.0.1"),
                        static_cast<quint16>(http.captured(1).toInt()));
    EXPECT_FALSE(probe.waitForConnected(2000)) << "the demo's service still answers";
}

} // namespace
} // namespace quorvel::testing
