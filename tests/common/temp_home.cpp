#include "common/temp_home.h"

#include "support/program_home.h"

#include <QDir>
#include <QFile>
#include <QFileInfo>

namespace quorvel::testing {

TempHome::TempHome() {
    ProgramHome::SetFolder(dir_.path());
}

TempHome::~TempHome() {
    ProgramHome::SetFolder({});
}

QString TempHome::File(const QString& name) const {
    return dir_.filePath(name);
}

QString TempHome::Write(const QString& name, const QByteArray& bytes) const {
    const QString path = File(name);
    QDir().mkpath(QFileInfo(path).path());
    QFile file(path);
    if (file.open(QIODevice::WriteOnly | QIODevice::Truncate)) file.write(bytes);
    return path;
}

QByteArray TempHome::Read(const QString& name) const {
    QFile file(File(name));
    return file.open(QIODevice::ReadOnly) ? file.readAll() : QByteArray();
}

} // namespace quorvel::testing
