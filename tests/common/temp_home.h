#pragma once
// A temporary program folder for one test: settings and logs go there and the
// folder is removed afterwards.

#include <QString>
#include <QTemporaryDir>

namespace quorvel::testing {

class TempHome {
public:
    TempHome();
    ~TempHome();
    TempHome(const TempHome&) = delete;
    TempHome& operator=(const TempHome&) = delete;

    QString Path() const { return dir_.path(); }
    // Path of a file or folder inside the temporary folder.
    QString File(const QString& name) const;
    // Creates a file with the given bytes (and any missing folders on the way).
    QString Write(const QString& name, const QByteArray& bytes) const;
    QByteArray Read(const QString& name) const;

private:
    QTemporaryDir dir_;
};

} // namespace quorvel::testing
