#pragma once
// A web-data object talking to a scripted loopback server, with every port
// recorded and the reply time-out shortened.

#include "common/recorders.h"
#include "common/temp_home.h"
#include "script_server.h"
#include "webdata/talu_web_data.h"
#include "webdata/tcp_socket_control.h"

#include <QCoreApplication>
#include <QElapsedTimer>
#include <QStringList>

#include <gtest/gtest.h>

#include <chrono>

namespace quorvel::testing {

class WebDataTest : public ::testing::Test {
protected:
    static constexpr std::chrono::milliseconds kGap{500};

    WebDataTest();

    // Reads a text file of the temporary home.
    QByteArray FileBytes(const QString& name) const { return home.Read(name); }
    QByteArray LogBytes() const;
    // Pumps events until pred holds or ms pass; returns pred().
    template <typename Pred> static bool PumpUntil(Pred pred, int ms = 2000);
    // Queues the GETLASTDATE answer, then the GETDATA reply.
    void QueueNewData(const QByteArray& lastDateLine, const Reply& dataReply);

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

template <typename Pred> bool WebDataTest::PumpUntil(Pred pred, int ms) {
    QElapsedTimer timer;
    timer.start();
    while (!pred() && timer.elapsed() < ms)
        QCoreApplication::processEvents(QEventLoop::AllEvents, 10);
    return pred();
}

} // namespace quorvel::testing
