// Quorvel: keeps data-logger files in step with the user's account on a web service.

#include "support/cipher.h"
#include "support/program_home.h"

#include <QCoreApplication>
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

} // namespace

int main(int argc, char* argv[]) {
    QCoreApplication app(argc, argv);
    QStringList args = app.arguments();
    args.removeFirst();
    quorvel::ProgramHome::Configure(args);

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
        out << quorvel::EncryptHex(args.at(at + 1), kLoginKey) << "\n";
        return 0;
    }
    PrintUsage(out);
    out << "\nSettings and logs: " << quorvel::ProgramHome::Folder() << "\n";
    return 0;
}
