#include "webdata/combo_sink.h"

#include "webdata/line_dates.h"

namespace quorvel {

void LoadIPAddresses(ComboSink& combo) {
    combo.Clear();
    const QStringList hosts = {QStringLiteral("127.0.0.1"),   QStringLiteral("LocalHost"),
                               QStringLiteral("192.168.0.1"), QStringLiteral("192.168.0.2"),
                               QStringLiteral("192.168.0.3"), QStringLiteral("192.168.0.4"),
                               QStringLiteral("localhost"),   QStringLiteral("127.0.0.1:8080")};
    for (const QString& host : hosts)
        combo.AddItem(host, 0);
    combo.SetCurrentIndex(1);
}

void LoadIntervals(ComboSink& combo) {
    const QStringList intervals = {QStringLiteral("15 minutes"), QStringLiteral("1 hour"),
                                   QStringLiteral("3 hours"),    QStringLiteral("6 hours"),
                                   QStringLiteral("12 hours"),   QStringLiteral("1 day")};
    for (const QString& interval : intervals)
        combo.AddItem(interval, 0);
}

void LoadDataTypes(ComboSink& combo) {
    combo.Clear();
    const QStringList& names = DataTypeNames();
    for (int i = 0; i < names.size(); ++i)
        combo.AddItem(names.at(i), i);
}

} // namespace quorvel
