#pragma once
// The text of a request to the service's script wd.php.

#include <QString>
#include <QStringList>

namespace quorvel {

// The characters URLEncode escapes: space first, backslash last, then tab and
// double quote.
extern const QString kSpecialCharacters;

// Escapes each special character as "%" and two upper-case hex digits.
QString URLEncode(const QString& text);
// URLEncode plus control characters: for every query value, so that "&", a
// space or a line end in a password can neither break nor extend the request.
QString EscapeQueryValue(const QString& text);

// "/wd" -> "/wd/", "wd" -> "wd/", "\wd" -> "/wd/", "" -> "".
QString FolderPath(const QString& webFolder);

// "host:port" (or "[v6]:port") split for connecting; the port is fallback
// when the text names none.
struct HostPort {
    QString host;
    int port = 80;
};
HostPort SplitHostPort(const QString& remoteHost, int fallbackPort);

// Indices into the command-word table; the index is what travels between the
// object's steps, the word is what the service reads.
enum CommandIndex : int {
    kCommandSendData = 1,
    kCommandGetData = 2,
    kCommandGetLastDate = 4,
    kCommandGetFolder = 10,
    kCommandGetUserFolders = 11,
};

// True for the commands sent with GET; every other is POST.
bool IsGetCommand(int commandIndex);

struct RequestFields {
    int commandIndex = 0;
    QString command;
    QString user, password, file;
    int dateFormat = 0;
    int fileLocation = 0;
    bool traceServer = false;
    QString date; // plain date text; empty when the command has none
    QString host, webFolder, agent;
    QString scheme = QStringLiteral("http"); // "https" for an exchange over TLS
};

// The four lines of a request, without their CR LF; the last one is empty.
QStringList RequestLines(const RequestFields& fields);

// The line with the value of its "pwd" parameter replaced by "***".
QString MaskPassword(const QString& line);

} // namespace quorvel
