#include "common/reference_service.h"

#include <QDeadlineTimer>
#include <QDir>
#include <QFile>
#include <QFileInfo>
#include <QProcessEnvironment>
#include <QRegularExpression>

namespace quorvel::testing {

namespace {
constexpr int kStartMs = 30000;
constexpr int kToolMs = 30000;
constexpr int kStopMs = 10000;

QString ReadAll(const QString& path) {
    QFile file(path);
    return file.open(QIODevice::ReadOnly) ? QString::fromUtf8(file.readAll()) : QString();
}
} // namespace

QString ReferenceService::ServerDir() {
    return QStringLiteral(QUORVEL_SERVER_DIR);
}

QString ReferenceService::ProgramPath() {
    return QStringLiteral(QUORVEL_PROGRAM);
}

ReferenceService::ReferenceService() {
    if (!root_.isValid()) lastError_ = QStringLiteral("no temporary folder for the data root");
}

ReferenceService::~ReferenceService() {
    Stop();
}

bool ReferenceService::RunTool(const QString& tool, const QStringList& args) {
    QProcess process;
    process.setProcessChannelMode(QProcess::MergedChannels);
    // add-user runs the quorvel program; in a sanitizer build its leak report at
    // exit would fail the tool.
    QProcessEnvironment env = QProcessEnvironment::systemEnvironment();
    if (!env.contains(QStringLiteral("ASAN_OPTIONS")))
        env.insert(QStringLiteral("ASAN_OPTIONS"), QStringLiteral("detect_leaks=0"));
    process.setProcessEnvironment(env);
    process.start(QDir(ServerDir()).filePath(tool), args);
    const bool done = process.waitForFinished(kToolMs);
    const QString output = QString::fromUtf8(process.readAll()).trimmed();
    if (!done) {
        process.kill();
        process.waitForFinished();
    }
    if (done && process.exitStatus() == QProcess::NormalExit && process.exitCode() == 0)
        return true;
    lastError_ =
        tool + QStringLiteral(" failed: ") + (output.isEmpty() ? process.errorString() : output);
    return false;
}

bool ReferenceService::AddUser(const ServiceUser& user) {
    const QString ftpPassword =
        user.ftpPassword.isEmpty() ? user.name + QStringLiteral("-ftp-7Q") : user.ftpPassword;
    QStringList args{user.name, user.password, QStringLiteral("--data"), DataRoot(),
                     QStringLiteral("--season"), user.season, QStringLiteral("--ftp-password"),
                     ftpPassword, QStringLiteral("--quorvel"), ProgramPath(),
                     QStringLiteral("--date-order"),
                     user.monthFirst ? QStringLiteral("mdy") : QStringLiteral("dmy"),
                     // The cheapest hash: every request checks the password.
                     QStringLiteral("--password-cost"), QStringLiteral("4")};
    if (!user.displayName.isEmpty()) args << QStringLiteral("--display-name") << user.displayName;
    if (!user.dataFolder.isEmpty()) args << QStringLiteral("--data-folder") << user.dataFolder;
    if (!RunTool(QStringLiteral("add-user"), args)) return false;
    ftpPasswords_[user.name] = ftpPassword;
    return true;
}

QString ReferenceService::UserPath(const QString& user, const QString& relativePath) const {
    const QString folder = DataRoot() + QStringLiteral("/users/") + user;
    return relativePath.isEmpty() ? folder : folder + QLatin1Char('/') + relativePath;
}

QString ReferenceService::PlaceFile(const QString& user, const QString& relativePath,
                                    const QByteArray& bytes) {
    const QString path = UserPath(user, relativePath);
    QDir().mkpath(QFileInfo(path).path());
    QFile file(path);
    if (!file.open(QIODevice::WriteOnly | QIODevice::Truncate) || file.write(bytes) != bytes.size())
        lastError_ = QStringLiteral("cannot write ") + path;
    return path;
}

QByteArray ReferenceService::ReadFile(const QString& user, const QString& relativePath) const {
    QFile file(UserPath(user, relativePath));
    return file.open(QIODevice::ReadOnly) ? file.readAll() : QByteArray("<missing>");
}

bool ReferenceService::Start() {
    if (IsRunning()) return true;
    httpPort_ = ftpPort_ = 0;
    run_.setProcessChannelMode(QProcess::SeparateChannels);
    run_.start(QDir(ServerDir()).filePath(QStringLiteral("run")),
               {QStringLiteral("--port"), QStringLiteral("0"), QStringLiteral("--ftp-port"),
                QStringLiteral("0"), QStringLiteral("--data"), DataRoot(),
                QStringLiteral("--workers"), QStringLiteral("2"),
                QStringLiteral("--ftp-auth-delay"), QStringLiteral("0"),
                QStringLiteral("--stop-with-parent")});
    static const QRegularExpression http(QStringLiteral("^HTTP: http://127\\.0\\.0\\.1:(\\d+)/"));
    static const QRegularExpression ftp(QStringLiteral("^FTP: ftp://127\\.0\\.0\\.1:(\\d+)/"));
    QString seen;
    const QDeadlineTimer deadline(kStartMs);
    while (!deadline.hasExpired()) {
        if (!run_.canReadLine() &&
            !run_.waitForReadyRead(static_cast<int>(deadline.remainingTime())))
            break;
        while (run_.canReadLine()) {
            const QString line = QString::fromUtf8(run_.readLine()).trimmed();
            seen += line + QLatin1Char('\n');
            if (auto m = http.match(line); m.hasMatch()) httpPort_ = m.captured(1).toInt();
            if (auto m = ftp.match(line); m.hasMatch()) ftpPort_ = m.captured(1).toInt();
            if (line.startsWith(QStringLiteral("Ctrl+C stops")) && httpPort_ > 0 && ftpPort_ > 0)
                return true;
        }
    }
    lastError_ = QStringLiteral("server/run did not come up: ") + run_.errorString() +
                 QLatin1Char('\n') + seen + QString::fromUtf8(run_.readAllStandardError());
    Stop();
    return false;
}

void ReferenceService::Stop() {
    if (run_.state() == QProcess::NotRunning) return;
    run_.terminate();
    if (!run_.waitForFinished(kStopMs)) {
        run_.kill();
        run_.waitForFinished(kStopMs);
    }
}

bool ReferenceService::IsRunning() const {
    return run_.state() == QProcess::Running;
}

QString ReferenceService::HttpHostPort() const {
    return QStringLiteral("127.0.0.1:") + QString::number(httpPort_);
}

QString ReferenceService::FtpServer() const {
    return QStringLiteral("127.0.0.1:") + QString::number(ftpPort_);
}

QString ReferenceService::FtpUrl() const {
    return QStringLiteral("ftp://") + FtpServer() + QLatin1Char('/');
}

QString ReferenceService::CfgUrl(const QString& user) const {
    return QStringLiteral("http://") + HttpHostPort() + QStringLiteral("/cfg/") + user +
           QStringLiteral(".cfg");
}

QString ReferenceService::FilesTxtUrl(const QString& user) const {
    return QStringLiteral("http://") + HttpHostPort() + UserFolder(user) +
           QStringLiteral("/files.txt");
}

QString ReferenceService::UserFolder(const QString& user) const {
    return QLatin1Char('/') + user;
}

QString ReferenceService::FtpPassword(const QString& user) const {
    return ftpPasswords_.value(user);
}

QString ReferenceService::Log() const {
    return ReadAll(DataRoot() + QStringLiteral("/logs/http.log")) +
           ReadAll(DataRoot() + QStringLiteral("/logs/ftp.log"));
}

} // namespace quorvel::testing
