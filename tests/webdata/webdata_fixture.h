#pragma once
// A web-data object talking to a scripted loopback server, with every port
// recorded and the reply time-out shortened.

#include "common/recorders.h"
#include "common/temp_home.h"
#include "script_server.h"
#include "support/program_home.h"
#include "webdata/talu_web_data.h"
#include "webdata/tcp_socket_control.h"

#include <QCoreApplication>
#include <QElapsedTimer>
#include <QFile>
#include <QFileInfo>
#include <QStringList>

#include <gtest/gtest.h>

#include <chrono>

namespace quorvel::testing {

class WebDataTest : public ::testing::Test {
protected:
    static constexpr std::chrono::milliseconds kGap{500};

    WebDataTest() {
        clock.SetWaits(WaitLengths{.replyGap = kGap});
        web.MyWinsock(&socket);
        web.SetRemoteHost(server.HostPort());
        web.SetAgent(QStringLiteral("TALUQuorvel"));
        web.SetUserID(QStringLiteral("U"));
        web.SetPassword(QStringLiteral("P"));
        web.SetPictureBox(&progress);
        web.SetProgramEnder([this] { ++programEnds; });
        QObject::connect(&web, &CTALUWebData::Finished,
                         [this](const QString& m) { finished << m; });
        QObject::connect(&web, &CTALUWebData::ShowStatus,
                         [this](const QString& m) { statuses << m; });
        QObject::connect(&web, &CTALUWebData::ShowLog, [this](const QString& m) { logs << m; });
    }

    QByteArray LogBytes() const { return home.Read(QFileInfo(ProgramHome::LogFile()).fileName()); }
    // Pumps events until pred holds or ms pass; returns pred().
    template <typename Pred> static bool PumpUntil(Pred pred, int ms = 2000) {
        QElapsedTimer timer;
        timer.start();
        while (!pred() && timer.elapsed() < ms)
            QCoreApplication::processEvents(QEventLoop::AllEvents, 10);
        return pred();
    }
    // Queues the GETLASTDATE answer, then the GETDATA reply.
    void QueueNewData(const QByteArray& lastDateLine, const Reply& dataReply) {
        server.Queue(HttpReply(lastDateLine + "\r\n"));
        server.Queue(dataReply);
    }

    TempHome home;
    RecordingPrompter prompter;
    SystemClock clock;
    CountingBusyPointer busy;
    ScopedPorts ports{Ports{&prompter, &clock, &busy}};
    ScriptServer server;
    TcpSocketControl socket;
    CTALUWebData web;
    RecordingProgressView progress;
    int programEnds = 0;
    QStringList finished, statuses, logs;
};

} // namespace quorvel::testing
