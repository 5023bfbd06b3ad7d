#include "fake_service.h"

#include "support/date_text.h"

#include <QUrl>
#include <QUrlQuery>

#include <algorithm>
#include <cmath>

namespace quorvel::testing {

namespace {

QByteArray RecordDate(const QByteArray& record) {
    return record.left(record.indexOf(','));
}

// Whole seconds since the epoch of date values; -1 when the text is no date.
double Seconds(const QByteArray& text) {
    const std::optional<DateValue> v = ParseDateText(QString::fromLatin1(text.left(19)));
    return v ? std::round(*v * 86400.0) : -1;
}

} // namespace

QList<QByteArray> MinuteRecords(int n, int first) {
    QList<QByteArray> out;
    const QDateTime start(QDate(2006, 5, 1), QTime(10, 0));
    for (int i = first; i < first + n; ++i)
        out << start.addSecs(60LL * i).toString(QStringLiteral("yyyy-MM-dd HH:mm:ss")).toLatin1() +
                   "," + QByteArray::number(i) + ".5";
    return out;
}

QByteArray Joined(const QList<QByteArray>& records) {
    QByteArray out;
    for (const QByteArray& r : records)
        out += r + "\r\n";
    return out;
}

Reply FakeService::Answer(const QByteArray& request) {
    const QByteArray target = request.split(' ').value(1);
    const QUrlQuery query(QUrl(QString::fromLatin1(target)));
    const QString cmd = query.queryItemValue(QStringLiteral("cmd"));
    if (cmd == QLatin1String("GETLASTDATE")) {
        const QByteArray last = records.isEmpty() ? "NO FILE" : RecordDate(records.last());
        return {Send(HttpReply("OK " + last + "\r\n"))};
    }
    if (cmd != QLatin1String("GETDATA")) return {Send(HttpReply("NOK unknown command\r\n"))};
    const QByteArray from =
        query.queryItemValue(QStringLiteral("date"), QUrl::FullyDecoded).toLatin1();
    // The records are in date order, as in a data file: the first one after
    // the asked date is found by halving, so a large service answers at once
    // and never holds up the client sharing its thread.
    const double after = Seconds(from);
    const auto first =
        from == "0"
            ? records.cbegin()
            : std::partition_point(records.cbegin(), records.cend(), [after](const QByteArray& r) {
                  return Seconds(RecordDate(r)) <= after;
              });
    QByteArray body = Joined(QList<QByteArray>(first, records.cend())) + "OK\r\n";
    const QByteArray reply = HttpReply(body);
    QList<qsizetype> cuts;
    for (int i = 1; i < pieces; ++i)
        cuts << reply.size() * i / pieces;
    Reply steps;
    qsizetype from_ = 0;
    for (const qsizetype at : cuts + QList<qsizetype>{reply.size()}) {
        if (!steps.empty() && pauseMs > 0) steps.push_back(Pause(pauseMs));
        steps.push_back(Send(reply.mid(from_, at - from_)));
        from_ = at;
    }
    return steps;
}

} // namespace quorvel::testing
