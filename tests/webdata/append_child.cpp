// One GetNewData in a process of its own, for the tests that end it from
// outside (SIGKILL) or let the system stop its writes (a file-size limit).
//
// usage: webdata_append_child HOST FILE TYPE [FSIZE [die]]
//   FSIZE  caps the size of every file the process writes (RLIMIT_FSIZE);
//   die    leaves SIGXFSZ at its default, so that a write past the cap kills
//          the process; otherwise the write fails and the object goes on.
// Exit code 0 when GetNewData returned true, 1 when false.
#include "common/recorders.h"
#include "support/program_home.h"
#include "webdata/talu_web_data.h"
#include "webdata/tcp_socket_control.h"

#include <QCoreApplication>
#include <QFileInfo>

#include <csignal>
#include <sys/resource.h>

int main(int argc, char** argv) {
    QCoreApplication app(argc, argv);
    const QStringList args = app.arguments();
    if (args.size() < 4) return 2;
    // The log goes beside the data file, never beyond the test's folder.
    quorvel::ProgramHome::SetFolder(QFileInfo(args[2]).absolutePath());
    quorvel::testing::RecordingPrompter prompter; // answers No to the error question
    quorvel::SystemClock clock;
    clock.SetWaits(quorvel::WaitLengths{.replyGap = std::chrono::milliseconds(1000)});
    quorvel::ScopedPorts ports({&prompter, &clock, nullptr});
    if (args.size() > 4) {
        if (args.size() < 6 || args[5] != QLatin1String("die")) std::signal(SIGXFSZ, SIG_IGN);
        const rlim_t cap = args[4].toULongLong();
        const rlimit limit{cap, cap};
        setrlimit(RLIMIT_FSIZE, &limit);
    }
    quorvel::TcpSocketControl socket;
    quorvel::CTALUWebData web;
    web.MyWinsock(&socket);
    web.SetRemoteHost(args[1]);
    web.SetUserID(QStringLiteral("U"));
    web.SetPassword(QStringLiteral("P"));
    web.SetProgramEnder([] {});
    return web.GetNewData(args[2], 1, args[3].toInt()) ? 0 : 1;
}
