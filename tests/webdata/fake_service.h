#pragma once
// A service for the script server that keeps one data file's records and
// answers GETLASTDATE and GETDATA from them: records after the asked date, or
// all of them for date=0, compared by date value at whole seconds.

#include "script_server.h"

#include <QByteArray>
#include <QList>

namespace quorvel::testing {

// n "DateTime" records a minute apart from 1 May 2006 10:00, each without its line end.
QList<QByteArray> MinuteRecords(int n, int first = 0);
// Records joined, each ended with CR LF.
QByteArray Joined(const QList<QByteArray>& records);

struct FakeService {
    QList<QByteArray> records; // in date order
    int pieces = 1;            // the GETDATA reply is sent in this many pieces ...
    int pauseMs = 0;           // ... with this pause between them

    QByteArray File() const { return Joined(records); }
    Reply Answer(const QByteArray& request);
    void Serve(ScriptServer& server) {
        server.responder = [this](const QByteArray& request) { return Answer(request); };
    }
};

} // namespace quorvel::testing
