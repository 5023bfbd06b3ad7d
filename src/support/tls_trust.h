#pragma once
// Certificate authorities trusted besides the system's store, for every secure
// connection of the process: the web-data exchange, the configuration and
// file-list fetches and FTP over TLS. A private service's own CA is added here
// from the settings or from "--ca-file FILE"; the system's store is never
// replaced, and there is no way to switch verification off.

#include <QByteArray>
#include <QString>
#include <QStringList>

namespace quorvel {

class TlsTrust {
public:
    // The files (PEM, one or more certificates each) added for the whole process.
    static QStringList ExtraCaFiles();
    static void SetExtraCaFiles(const QStringList& files);
    // Adds one file unless it is empty or already there.
    static void AddExtraCaFile(const QString& file);

    // The PEM text of every extra file, in order. False, with the reason
    // naming the file, when one cannot be read or holds no certificate: a
    // secure connection then fails rather than go on without the CA the user
    // asked for.
    static bool ReadExtraCaPem(QByteArray& pem, QString& error);
    // The same check for one file ("" when it is usable).
    static QString CheckCaFile(const QString& file);
};

} // namespace quorvel
