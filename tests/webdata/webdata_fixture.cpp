#include "webdata_fixture.h"

#include "support/program_home.h"

#include <QFile>

namespace quorvel::testing {

WebDataTest::WebDataTest() {
    WaitLengths waits;
    waits.replyGap = kGap;
    clock.SetWaits(waits);
    web.MyWinsock(&socket);
    web.SetRemoteHost(server.HostPort());
    web.SetAgent(QStringLiteral("TALUQuorvel"));
    web.SetUserID(QStringLiteral("U"));
    web.SetPassword(QStringLiteral("P"));
    web.SetPictureBox(&progress);
    web.SetProgramEnder([this] { ++programEnds; });
    QObject::connect(&web, &CTALUWebData::Finished, [this](const QString& m) { finished << m; });
    QObject::connect(&web, &CTALUWebData::ShowStatus, [this](const QString& m) { statuses << m; });
    QObject::connect(&web, &CTALUWebData::ShowLog, [this](const QString& m) { logs << m; });
}

QByteArray WebDataTest::LogBytes() const {
    QFile file(ProgramHome::LogFile());
    return file.open(QIODevice::ReadOnly) ? file.readAll() : QByteArray();
}

void WebDataTest::QueueNewData(const QByteArray& lastDateLine, const Reply& dataReply) {
    server.Queue(HttpReply(lastDateLine + "\r\n"));
    server.Queue(dataReply);
}

} // namespace quorvel::testing
