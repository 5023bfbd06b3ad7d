#pragma once
// The client's web-data object, HTTP fetch and FTP functions against the
// reference service served over https by nginx and php-fpm, with every output
// the user or a log could see recorded.

#include "common/recorders.h"
#include "common/reference_service.h"
#include "common/temp_home.h"
#include "support/program_home.h"
#include "support/tls_trust.h"
#include "tls_web_peer.h"
#include "webdata/service_socket_control.h"
#include "webdata/talu_web_data.h"

#include <QFile>
#include <QFileInfo>
#include <QThread>

#include <gtest/gtest.h>

#include <chrono>
#include <iostream>

namespace quorvel::testing {

// Characters that a careless request or log would break or show.
inline const QString kAnnPassword = "Tr0ub&dor 3+%=?#";

class TlsServiceTest : public ::testing::Test {
protected:
    void SetUp() override {
        clock.SetWaits(WaitLengths{.replyGap = std::chrono::milliseconds(5000)});
        ASSERT_TRUE(service.AddUser(
            {.name = "ann", .password = kAnnPassword, .displayName = "Ann Example"}))
            << service.LastError().toStdString();
        ASSERT_TRUE(web.Start(service.DataRoot())) << web.LastError().toStdString();
        TlsTrust::SetExtraCaFiles({web.CaFile()});
        object.MyWinsock(&socket);
        object.SetAgent("TALUQuorvel");
        object.SetWebFolder("/wd");
        object.SetUserID("ann");
        object.SetPassword(kAnnPassword);
        object.SetProgramEnder([this] { ++programEnds; });
        for (int which = 0; which < 5; ++which)
            object.EnableLog(which, 1);
        QObject::connect(&object, &CTALUWebData::ShowStatus,
                         [this](const QString& text) { statuses << text; });
        QObject::connect(&object, &CTALUWebData::Finished,
                         [this](const QString& text) { statuses << text; });
        QObject::connect(&object, &CTALUWebData::ShowLog,
                         [this](const QString& text) { traces << text; });
        QObject::connect(&object, &CTALUWebData::ShowReceived,
                         [this](const QString& text) { traces << text; });
    }

    void TearDown() override {
        TlsTrust::SetExtraCaFiles({});
        if (HasFailure()) std::cerr << "Server logs:\n" << web.Log().toStdString();
    }

    // Waits for failures are short: a refused connection still waits out the gap.
    void ShortGap() { clock.SetWaits(WaitLengths{.replyGap = std::chrono::milliseconds(300)}); }

    QString ProgramLog() const {
        QFile file(ProgramHome::LogFile());
        return file.open(QIODevice::ReadOnly) ? QString::fromUtf8(file.readAll()) : QString();
    }
    // What nginx was asked, one request line each (its access log).
    QString AccessLog() const { return web.AccessLog(); }
    // How often the access log holds text, waiting (bounded) for `expected`:
    // nginx logs a request once its answer is complete.
    int AccessCount(const QString& text, int expected) const {
        for (int i = 0; i < 100 && AccessLog().count(text) < expected; ++i)
            QThread::msleep(20);
        return static_cast<int>(AccessLog().count(text));
    }

    TempHome home;
    RecordingPrompter prompter;
    SystemClock clock;
    CountingBusyPointer busy;
    ScopedPorts ports{Ports{&prompter, &clock, &busy}};
    ReferenceService service; // only its data root and accounts: nginx serves them
    TlsWebPeer web;
    ServiceSocketControl socket{1};
    CTALUWebData object;
    QStringList statuses, traces;
    int programEnds = 0;
};

} // namespace quorvel::testing
