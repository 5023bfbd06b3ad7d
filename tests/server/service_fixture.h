#pragma once
// The client's own web-data object, HTTP fetch and FTP functions against the
// reference service, started afresh for every test with two users.

#include "common/recorders.h"
#include "common/reference_service.h"
#include "common/temp_home.h"
#include "support/date_text.h"
#include "transfer/ftp.h"
#include "webdata/talu_web_data.h"
#include "webdata/tcp_socket_control.h"

#include <QFile>

#include <iostream>

#include <gtest/gtest.h>

namespace quorvel::testing {

inline const QString kAnnPassword = QStringLiteral("p&ss word+%=?#");

class ServiceTest : public ::testing::Test {
protected:
    void SetUp() override {
        ASSERT_TRUE(
            service.AddUser({.name = QStringLiteral("ann"),
                             .password = kAnnPassword,
                             .displayName = QStringLiteral("Ann Example"),
                             .dataFolder = QStringLiteral("/home/ann/loggers"),
                             .monthFirst = SystemDateOrder() == NumericDateOrder::MonthFirst}))
            << service.LastError().toStdString();
        ASSERT_TRUE(
            service.AddUser({.name = QStringLiteral("bob"), .password = QStringLiteral("bob")}))
            << service.LastError().toStdString();
        ASSERT_TRUE(service.Start()) << service.LastError().toStdString();
        web.MyWinsock(&socket);
        web.SetAgent(QStringLiteral("TALUQuorvel"));
        web.SetRemoteHost(service.HttpHostPort());
        web.SetWebFolder(service.WebFolder());
        web.SetUserID(QStringLiteral("ann"));
        web.SetPassword(kAnnPassword);
        web.SetProgramEnder([this] { ++programEnds; });
        SetFTPDisplay(&trace, nullptr);
    }

    void TearDown() override {
        ftpClose();
        if (HasFailure()) std::cerr << "Service log:\n" << service.Log().toStdString();
    }

    // The body wd.php answers a query (after "wd.php?"), fetched by the client's
    // HTTP fetch; "<failed>" when the fetch failed.
    QString Ask(const QString& query) {
        QString body;
        const QString url = QStringLiteral("http://") + service.HttpHostPort() +
                            service.WebFolder() + QStringLiteral("/wd.php?") + query;
        return HTTPGetFileContents(url, body) ? body : QStringLiteral("<failed>");
    }
    // The start of a query as ann.
    static QString AsAnn(const QString& rest) {
        return QStringLiteral("user=ann&pwd=p%26ss%20word%2B%25%3D%3F%23&") + rest;
    }

    QString Local(const QString& name) const { return home.File(name); }
    QByteArray ReadLocal(const QString& name) const {
        QFile file(Local(name));
        return file.open(QIODevice::ReadOnly) ? file.readAll() : QByteArray("<missing>");
    }

    TempHome home;
    RecordingPrompter prompter;
    SystemClock clock; // the full reply gap: PHP may be slow on a busy machine
    CountingBusyPointer busy;
    ScopedPorts ports{Ports{&prompter, &clock, &busy}};
    ReferenceService service;
    TcpSocketControl socket;
    CTALUWebData web;
    RecordingTraceView trace;
    int programEnds = 0;
};

} // namespace quorvel::testing
