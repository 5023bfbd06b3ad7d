// Quorvel: keeps data-logger files in step with the user's account on a web service.

#include "app/ui/frm_web_data_client.h"
#include "app/ui/no_display.h"
#include "app/ui/window_ports.h"
#include "support/cipher.h"
#include "support/program_home.h"

#include <QApplication>
#include <QStringList>
#include <QTextStream>

namespace {

// The short key under which a configuration file's FTP password is enciphered.
constexpr const char* kLoginKey = "tlu";

void PrintUsage(QTextStream& out) {
    out << "Quorvel " << QUORVEL_VERSION << "\n"
        << "Keeps data-logger files in step with your account on the web service.\n\n"
        << "Usage: quorvel [/S] [--home DIR] [--encipher TEXT] [--version] [--help]\n"
        << "  /S               start minimised and work on the schedule\n"
        << "  --home DIR       keep settings, logs and the file list in DIR\n"
        << "                   (also QUORVEL_HOME)\n"
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

} // namespace

int main(int argc, char* argv[]) {
    // The printing switches need no display, so they are answered before one is opened.
    QStringList given;
    for (int i = 1; i < argc; ++i)
        given << QString::fromLocal8Bit(argv[i]);
    if (const int code = AnswerSwitches(given); code >= 0) return code;

    if (quorvel::ReportMissingDisplay(argc, argv)) return 2;
    QApplication app(argc, argv);
    QStringList args = app.arguments();
    args.removeFirst();
    quorvel::ProgramHome::Configure(args);

    quorvel::frm_WebDataClient window(args);
    quorvel::WindowPorts ports(&window);
    window.Form_Load();
    window.show();
    return app.exec();
}
