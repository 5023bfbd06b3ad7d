#include "tls_web_peer.h"

#include "common/reference_service.h"

#include <QDeadlineTimer>
#include <QDir>
#include <QFile>
#include <QFileInfo>
#include <QTcpServer>
#include <QTcpSocket>
#include <QThread>

#include <unistd.h>

namespace quorvel::testing {

namespace {

constexpr int kStartMs = 15000;

QString ReadText(const QString& path) {
    QFile file(path);
    return file.open(QIODevice::ReadOnly) ? QString::fromUtf8(file.readAll()) : QString();
}

bool WriteText(const QString& path, const QString& text) {
    QFile file(path);
    return file.open(QIODevice::WriteOnly) && file.write(text.toUtf8()) == text.toUtf8().size();
}

bool Accepts(int port) {
    QTcpSocket probe;
    probe.connectToHost("127.0.0.1", static_cast<quint16>(port));
    return probe.waitForConnected(200);
}

QString PhpFpmProgram() {
    const QStringList found = QDir("/usr/sbin").entryList({"php-fpm*"}, QDir::Files);
    return found.isEmpty() ? QString() : "/usr/sbin/" + found.first();
}

// Run as root (CI), both servers must be told to stay root; otherwise nginx's
// workers would become "nobody" and could not read the test's folders.
bool RunAsRoot() {
    return geteuid() == 0;
}

const char* StemOf(TlsSite site) {
    switch (site) {
    case TlsSite::Good:
        return "good";
    case TlsSite::Expired:
        return "expired";
    case TlsSite::WrongName:
        return "wrong_name";
    case TlsSite::Stranger:
        return "stranger";
    case TlsSite::Plain:
        break;
    }
    return nullptr;
}

} // namespace

QString SecurityTestDir() {
    return QStringLiteral(QUORVEL_SECURITY_TEST_DIR);
}

int FreePort() {
    QTcpServer server;
    server.listen(QHostAddress::LocalHost, 0);
    return server.serverPort();
}

TlsWebPeer::TlsWebPeer() = default;

TlsWebPeer::~TlsWebPeer() {
    Stop();
}

bool TlsWebPeer::Fail(const QString& text) {
    lastError_ = text + "\n" + Log();
    Stop();
    return false;
}

QString TlsWebPeer::Address(TlsSite site, const QString& host) const {
    return "https://" + host + ':' + QString::number(Port(site));
}

QString TlsWebPeer::HostPort(TlsSite site) const {
    return "localhost:" + QString::number(Port(site));
}

QString TlsWebPeer::Log() const {
    return ReadText(File("nginx_error.log")) + ReadText(File("fpm.log")) +
           ReadText(File("php.log"));
}

QString TlsWebPeer::AccessLog() const {
    return ReadText(File("access.log"));
}

bool TlsWebPeer::Start(const QString& dataRoot) {
    if (!dir_.isValid()) return Fail("no temporary folder");
    if (!MakeCertificates() || !WriteConfigs(dataRoot)) return false;
    return StartFpm() && StartNginx();
}

bool MakeTestCertificates(const QString& folder, QString& error) {
    QDir().mkpath(folder);
    QProcess make;
    make.setProcessChannelMode(QProcess::MergedChannels);
    make.start("/usr/bin/python3", {SecurityTestDir() + "/make_certs.py", folder});
    if (make.waitForFinished(kStartMs) && make.exitStatus() == QProcess::NormalExit &&
        make.exitCode() == 0)
        return true;
    error = "make_certs.py failed: " + QString::fromUtf8(make.readAll());
    return false;
}

bool TlsWebPeer::MakeCertificates() {
    QString error;
    return MakeTestCertificates(CertFolder(), error) || Fail(error);
}

bool TlsWebPeer::WriteConfigs(const QString& dataRoot) {
    const QString www = ReferenceService::ServerDir() + "/www";
    for (TlsSite site :
         {TlsSite::Good, TlsSite::Expired, TlsSite::WrongName, TlsSite::Stranger, TlsSite::Plain})
        ports_[site] = FreePort();
    const QString socket = File("fpm.sock");
    // The locations of the deployment snippet in server/README.md.
    const QString locations =
        QStringLiteral("root %1;\n"
                       "location = /wd/wd.php {\n"
                       "  include /etc/nginx/fastcgi_params;\n"
                       "  fastcgi_param SCRIPT_FILENAME $document_root/wd/wd.php;\n"
                       "  fastcgi_param QUORVEL_DATA %2;\n"
                       "  fastcgi_pass unix:%3;\n"
                       "  fastcgi_buffering off;\n"
                       "}\n"
                       "location ~ ^/cfg/([A-Za-z0-9][A-Za-z0-9._-]*)\\.cfg$ {\n"
                       "  default_type text/plain; alias %2/cfg/$1.cfg;\n"
                       "}\n"
                       "location ~ ^/([A-Za-z0-9][A-Za-z0-9._-]*)/files\\.txt$ {\n"
                       "  default_type text/plain; alias %2/users/$1/files.txt;\n"
                       "}\n"
                       "location ~ ^/to-plain/(.*)$ { return 301 http://localhost:%4/$1; }\n"
                       "location / { return 404; }\n")
            .arg(www, dataRoot, socket, QString::number(ports_.value(TlsSite::Plain)));
    QString servers;
    for (TlsSite site :
         {TlsSite::Good, TlsSite::Expired, TlsSite::WrongName, TlsSite::Stranger, TlsSite::Plain}) {
        const int port = ports_.value(site);
        servers += QStringLiteral("server {\n  listen 127.0.0.1:%1%2;\n")
                       .arg(port)
                       .arg(site == TlsSite::Plain ? QString() : " ssl");
        if (const char* stem = StemOf(site))
            servers += QStringLiteral("  ssl_certificate %1/%2.pem;\n"
                                      "  ssl_certificate_key %1/%2.key;\n")
                           .arg(CertFolder(), QString::fromLatin1(stem));
        servers += QStringLiteral("  include %1;\n}\n").arg(File("service.conf"));
    }
    const QString temp = File("tmp");
    QDir().mkpath(temp);
    const QString nginx =
        QStringLiteral("%1worker_processes 1;\n"
                       "daemon off;\n"
                       "pid %2/nginx.pid;\n"
                       "error_log %2/nginx_error.log warn;\n"
                       "events { worker_connections 64; }\n"
                       "http {\n"
                       "  log_format line '$server_port $request';\n"
                       "  access_log %2/access.log line;\n"
                       "  client_body_temp_path %3/body;\n"
                       "  fastcgi_temp_path %3/fastcgi;\n"
                       "  proxy_temp_path %3/proxy;\n"
                       "  uwsgi_temp_path %3/uwsgi;\n"
                       "  scgi_temp_path %3/scgi;\n"
                       "  keepalive_timeout 60;\n"
                       "%4}\n")
            .arg(RunAsRoot() ? "user root root;\n" : QString(), dir_.path(), temp, servers);
    const QString fpm =
        QStringLiteral("[global]\n"
                       "pid = %1/fpm.pid\n"
                       "error_log = %1/fpm.log\n"
                       "daemonize = no\n"
                       "[quorvel]\n"
                       "%2"
                       "listen = %3\n"
                       "pm = static\n"
                       "pm.max_children = 2\n"
                       "php_admin_value[error_log] = %1/php.log\n"
                       "php_admin_flag[log_errors] = on\n"
                       "php_admin_value[output_buffering] = 0\n")
            .arg(dir_.path(), RunAsRoot() ? "user = root\ngroup = root\n" : QString(), socket);
    if (!WriteText(File("service.conf"), locations) || !WriteText(File("nginx.conf"), nginx) ||
        !WriteText(File("fpm.conf"), fpm))
        return Fail("could not write the server configurations");
    return true;
}

bool TlsWebPeer::StartFpm() {
    const QString program = PhpFpmProgram();
    if (program.isEmpty()) return Fail("php-fpm is not installed");
    QStringList args{"-F", "-y", File("fpm.conf")};
    if (RunAsRoot()) args << "-R";
    fpm_.setProcessChannelMode(QProcess::MergedChannels);
    fpm_.setStandardOutputFile(File("fpm.out"));
    fpm_.start(program, args);
    const QDeadlineTimer deadline(kStartMs);
    while (!deadline.hasExpired() && fpm_.state() != QProcess::NotRunning &&
           !QFileInfo::exists(File("fpm.sock")))
        QThread::msleep(10);
    if (!QFileInfo::exists(File("fpm.sock")))
        return Fail("php-fpm did not start: " + ReadText(File("fpm.out")));
    return true;
}

bool TlsWebPeer::StartNginx() {
    nginx_.setProcessChannelMode(QProcess::MergedChannels);
    nginx_.setStandardOutputFile(File("nginx.out"));
    nginx_.start("/usr/sbin/nginx",
                 {"-p", dir_.path(), "-c", File("nginx.conf"), "-e", File("nginx_error.log")});
    const QDeadlineTimer deadline(kStartMs);
    for (const int port : ports_) {
        while (!deadline.hasExpired() && nginx_.state() != QProcess::NotRunning && !Accepts(port))
            QThread::msleep(10);
        if (!Accepts(port)) return Fail("nginx did not start: " + ReadText(File("nginx.out")));
    }
    return true;
}

void TlsWebPeer::Stop() {
    // SIGTERM: each master stops its own workers before it ends.
    for (QProcess* process : {&nginx_, &fpm_}) {
        if (process->state() == QProcess::NotRunning) continue;
        process->terminate();
        if (!process->waitForFinished(5000)) {
            process->kill();
            process->waitForFinished(2000);
        }
    }
}

} // namespace quorvel::testing
