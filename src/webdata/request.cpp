#include "webdata/request.h"

#include <QRegularExpression>

#include <array>

namespace quorvel {

const QString kSpecialCharacters = QStringLiteral(" !#%&()+,./:;<>=?@\\\t\"");

namespace {

QString Escape(const QString& text, bool controls) {
    QString out;
    out.reserve(text.size());
    for (const QChar c : text) {
        const bool control = controls && (c.unicode() < 0x20 || c.unicode() == 0x7F);
        if (control || kSpecialCharacters.contains(c)) {
            out += QLatin1Char('%');
            out += QStringLiteral("%1").arg(c.unicode(), 2, 16, QLatin1Char('0')).toUpper();
        } else {
            out += c;
        }
    }
    return out;
}

bool AllDigits(QStringView text) {
    if (text.isEmpty()) return false;
    for (const QChar c : text)
        if (!c.isDigit()) return false;
    return true;
}

} // namespace

QString URLEncode(const QString& text) {
    return Escape(text, false);
}

QString EscapeQueryValue(const QString& text) {
    return Escape(text, true);
}

QString FolderPath(const QString& webFolder) {
    QString path = webFolder;
    if (!path.isEmpty() && !path.endsWith(QLatin1Char('\\')) && !path.endsWith(QLatin1Char('/')))
        path += QLatin1Char('\\');
    path.replace(QLatin1Char('\\'), QLatin1Char('/'));
    return path;
}

HostPort SplitHostPort(const QString& remoteHost, int fallbackPort) {
    HostPort result{remoteHost, fallbackPort};
    if (remoteHost.startsWith(QLatin1Char('['))) {
        const qsizetype close = remoteHost.indexOf(QLatin1Char(']'));
        if (close < 0) return result;
        result.host = remoteHost.mid(1, close - 1);
        const QStringView rest = QStringView(remoteHost).mid(close + 1);
        if (rest.startsWith(QLatin1Char(':')) && AllDigits(rest.mid(1)))
            result.port = rest.mid(1).toInt();
        return result;
    }
    const qsizetype colon = remoteHost.lastIndexOf(QLatin1Char(':'));
    if (colon > 0 && remoteHost.indexOf(QLatin1Char(':')) == colon &&
        AllDigits(QStringView(remoteHost).mid(colon + 1))) {
        const int port = QStringView(remoteHost).mid(colon + 1).toInt();
        if (port > 0 && port < 65536) {
            result.host = remoteHost.left(colon);
            result.port = port;
        }
    }
    return result;
}

bool IsGetCommand(int commandIndex) {
    return commandIndex == kCommandGetData || commandIndex == kCommandGetLastDate ||
           commandIndex == kCommandGetFolder || commandIndex == kCommandGetUserFolders;
}

QStringList RequestLines(const RequestFields& f) {
    static const std::array<const char*, 8> names = {"cmd", "user",         "pwd",   "file",
                                                     "dt",  "filelocation", "trace", "date"};
    const std::array<QString, 8> values = {
        EscapeQueryValue(f.command),
        EscapeQueryValue(f.user),
        EscapeQueryValue(f.password),
        EscapeQueryValue(f.file),
        EscapeQueryValue(QString::number(f.dateFormat)),
        EscapeQueryValue(QString::number(f.fileLocation)),
        f.traceServer ? QStringLiteral("on") : QString(),
        f.date.isEmpty() ? QString() : EscapeQueryValue(f.date),
    };
    QString query;
    for (std::size_t i = 0; i < names.size(); ++i) {
        if (values[i].isEmpty()) continue;
        query += query.isEmpty() ? QLatin1Char('?') : QLatin1Char('&');
        query += QLatin1String(names[i]) + QLatin1Char('=') + values[i];
    }
    const QString method =
        IsGetCommand(f.commandIndex) ? QStringLiteral("GET") : QStringLiteral("POST");
    return {method + QLatin1Char(' ') + f.scheme + QStringLiteral("://") + f.host +
                FolderPath(f.webFolder) + QStringLiteral("wd.php") + query +
                QStringLiteral(" HTTP/1.1"),
            QStringLiteral("Host: ") + f.host, QStringLiteral("User-Agent: ") + f.agent, QString()};
}

QString MaskPassword(const QString& line) {
    static const QRegularExpression pwd(QStringLiteral("([?&]pwd=)[^& ]*"));
    QString masked = line;
    masked.replace(pwd, QStringLiteral("\\1***"));
    return masked;
}

} // namespace quorvel
