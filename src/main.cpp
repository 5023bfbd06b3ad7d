// Quorvel: keeps data-logger files in step with the user's account on a web service.

#include "app/ui/frm_web_data_client.h"
#include "app/ui/no_display.h"
#include "app/ui/window_ports.h"
#include "support/cipher.h"
#include "support/ini_store.h"
#include "support/log_file.h"
#include "support/program_home.h"
#include "support/secret_store.h"
#include "support/tls_trust.h"

#include <QApplication>
#include <QStringList>
#include <QTextStream>

#include <chrono>

namespace {

// The short key under which a configuration file's FTP password is enciphered.
constexpr const char* kLoginKey = "tlu";

void PrintUsage(QTextStream& out) {
    out << "Quorvel " << QUORVEL_VERSION << "\n"
        << "Keeps data-logger files in step with your account on the web service.\n\n"
        << "Usage: quorvel [/S] [--home DIR] [--ca-file FILE] [--encipher TEXT] [--version] "
           "[--help]\n"
        << "  /S               start minimised and work on the schedule\n"
        << "  --home DIR       keep settings, logs and the file list in DIR\n"
        << "                   (also QUORVEL_HOME)\n"
        << "  --ca-file FILE   also trust the certificate authorities in FILE (PEM) for\n"
        << "                   https and FTP over TLS, as for a private service; the\n"
        << "                   setting CAFile does the same\n"
        << "  --encipher TEXT  print TEXT enciphered for line 3 of a configuration file\n";
}

// Answers the switches that print something and end; -1 when the window is to start.
int AnswerSwitches(const QStringList& args) {
    QTextStream out(stdout);
    if (args.contains("--help") || args.contains("-h")) {
        PrintUsage(out);
        return 0;
    }
    if (args.contains("--version")) {
        out << "Quorvel " << QUORVEL_VERSION << "\n";
        return 0;
    }
    if (const auto at = args.indexOf("--encipher"); at >= 0) {
        if (at + 1 >= args.size()) {
            QTextStream(stderr) << "--encipher needs the text to encipher\n";
            return 2;
        }
        const QString text = args.at(at + 1);
        if (const QString why = quorvel::Uncipherable(text); !why.isEmpty()) {
            QTextStream(stderr) << "--encipher: " << why << "\n";
            return 2;
        }
        out << quorvel::EncryptHex(text, kLoginKey) << "\n";
        return 0;
    }
    return -1;
}

// "--ca-file FILE" (removed from args); a file that cannot serve ends the
// start, since every secure connection would fail. 2 for such a failure, -1
// to go on.
int TakeCaFile(QStringList& args) {
    const auto at = args.indexOf("--ca-file");
    if (at < 0) return -1;
    if (at + 1 >= args.size()) {
        QTextStream(stderr) << "--ca-file needs the file of the certificate authority\n";
        return 2;
    }
    const QString file = args.at(at + 1);
    args.remove(at, 2);
    if (const QString why = quorvel::TlsTrust::CheckCaFile(file); !why.isEmpty()) {
        QTextStream(stderr) << "--ca-file: " << why << "\n";
        return 2;
    }
    quorvel::TlsTrust::AddExtraCaFile(file);
    return -1;
}

// The CA of the settings is taken even when it cannot be read: the secure
// connections then fail naming the file, rather than go on without it.
void TakeCaSetting() {
    const quorvel::LocalSettings settings(quorvel::ProgramHome::SettingsFile());
    const QString file = settings.GetLocalSetting(QStringLiteral("CAFile"), QString());
    if (file.isEmpty()) return;
    if (const QString why = quorvel::TlsTrust::CheckCaFile(file); !why.isEmpty())
        quorvel::WriteLogFile(QStringLiteral("CAFile: ") + why);
    quorvel::TlsTrust::AddExtraCaFile(file);
}

} // namespace

int main(int argc, char* argv[]) {
    // The printing switches need no display, so they are answered before one is opened.
    QStringList given;
    for (int i = 1; i < argc; ++i)
        given << QString::fromLocal8Bit(argv[i]);
    if (const int code = AnswerSwitches(given); code >= 0) return code;
    if (const int code = TakeCaFile(given); code >= 0) return code;

    if (quorvel::ReportMissingDisplay(argc, argv)) return 2;
    QApplication app(argc, argv);
    QStringList args = app.arguments();
    args.removeFirst();
    quorvel::ProgramHome::Configure(args);
    if (const auto at = args.indexOf("--ca-file"); at >= 0) args.remove(at, 2);
    TakeCaSetting();
    // A locked keyring may ask the user to open it; past this the password
    // stays in the owner-only settings file instead of blocking the start.
    const auto secrets = quorvel::MakeDesktopSecretStore(std::chrono::seconds(30));
    quorvel::SetProcessSecretStore(secrets.get());

    quorvel::frm_WebDataClient window(args);
    quorvel::WindowPorts ports(&window);
    window.Form_Load();
    window.show();
    return app.exec();
}
