// Quorvel: keeps data-logger files in step with the user's account on a web service.

#include "app/account_login.h"
#include "app/command_line.h"
#include "app/run/command_line_run.h"
#include "app/run/unattended_prompter.h"
#include "app/ui/frm_web_data_client.h"
#include "app/ui/no_display.h"
#include "app/ui/window_ports.h"
#include "app/window_instance.h"
#include "support/cipher.h"
#include "support/ini_store.h"
#include "support/log_file.h"
#include "support/program_home.h"
#include "support/secret_store.h"
#include "support/tls_trust.h"

#include <QApplication>
#include <QCoreApplication>
#include <QMessageBox>
#include <QStringList>
#include <QTextStream>

#include <chrono>

namespace {

using quorvel::CommandLine;

// A start on a program home whose window is open brings that window forward.
constexpr std::chrono::milliseconds kShowWait{3000};
// How long the command-line run waits for the desktop's secret store.
constexpr std::chrono::milliseconds kUnattendedStoreWait{5000};

// The switches that print something and end; -1 when the program goes on.
int AnswerSwitches(const CommandLine& line) {
    QTextStream out(stdout);
    QTextStream err(stderr);
    const QString usage = quorvel::UsageText(QStringLiteral(QUORVEL_VERSION));
    if (!line.error.isEmpty()) {
        err << "quorvel: " << line.error << "\n\n" << usage;
        return 2;
    }
    if (line.help) {
        out << usage;
        return 0;
    }
    if (line.version) {
        out << "Quorvel " << QUORVEL_VERSION << "\n";
        return 0;
    }
    if (line.encipher) {
        if (const QString why = quorvel::Uncipherable(*line.encipher); !why.isEmpty()) {
            err << "--encipher: " << why << "\n";
            return 2;
        }
        out << quorvel::EncryptHex(*line.encipher, QString::fromLatin1(quorvel::kLoginKeyText))
            << "\n";
        return 0;
    }
    return -1;
}

void ChooseHome(const CommandLine& line) {
    quorvel::ProgramHome::SetFolder(line.home.value_or(qEnvironmentVariable("QUORVEL_HOME")));
}

// The CA of --ca-file; a file that cannot serve ends the start, since every
// secure connection would fail. 2 for such a failure, -1 to go on.
int TakeCaFile(const CommandLine& line) {
    if (!line.caFile) return -1;
    if (const QString why = quorvel::TlsTrust::CheckCaFile(*line.caFile); !why.isEmpty()) {
        QTextStream(stderr) << "--ca-file: " << why << "\n";
        return 2;
    }
    quorvel::TlsTrust::AddExtraCaFile(*line.caFile);
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

// No widget and no display: the core alone, and no box that waits.
int RunAll(int argc, char* argv[], const CommandLine& line) {
    QCoreApplication app(argc, argv);
    ChooseHome(line);
    TakeCaSetting();
    // A keyring that would have to ask for its password counts as absent at
    // once: nobody is there to answer.
    const auto secrets = quorvel::MakeDesktopSecretStore(kUnattendedStoreWait);
    quorvel::SetProcessSecretStore(secrets.get());
    quorvel::UnattendedPrompter prompter;
    quorvel::SystemClock clock;
    quorvel::Ports ports;
    ports.prompter = &prompter;
    ports.clock = &clock;
    const quorvel::ScopedPorts scope(ports);
    QTextStream out(stdout);
    QTextStream err(stderr);
    quorvel::CommandLineRun run({.dryRun = line.dryRun, .quiet = line.quiet}, out, err);
    return run.Exec();
}

// Another window has this program home: it comes forward, this start ends.
int LeaveToOpenWindow(quorvel::WindowInstance& instance, bool scheduled) {
    const QString home = quorvel::ProgramHome::Folder();
    if (scheduled) {
        quorvel::WriteLogFile(QStringLiteral("A start with /S found Quorvel open on ") + home +
                              QStringLiteral(" and ended"));
        return 0;
    }
    QTextStream err(stderr);
    if (instance.AskHolderToShow(kShowWait)) {
        err << "Quorvel is already open on " << home << ": its window was brought forward.\n";
        return 0;
    }
    const QString text =
        QStringLiteral("Quorvel is already running on %1 (%2), but its window does not answer.")
            .arg(home, instance.LockPath());
    err << text << "\n";
    QMessageBox::warning(nullptr,
                         QString::fromLatin1(quorvel::frm_WebDataClient::kApplicationTitle), text);
    return 1;
}

} // namespace

int main(int argc, char* argv[]) {
    QStringList given;
    for (int i = 1; i < argc; ++i)
        given << QString::fromLocal8Bit(argv[i]);
    const CommandLine line = quorvel::ParseCommandLine(given);
    if (const int code = AnswerSwitches(line); code >= 0) return code;
    if (const int code = TakeCaFile(line); code >= 0) return code;
    if (line.runAll) return RunAll(argc, argv, line);

    if (quorvel::ReportMissingDisplay(argc, argv)) return 2;
    QApplication app(argc, argv);
    ChooseHome(line);
    quorvel::WindowInstance instance(quorvel::ProgramHome::Folder());
    if (!instance.Claim()) return LeaveToOpenWindow(instance, line.scheduled);
    TakeCaSetting();
    // A locked keyring may ask the user to open it; past this the password
    // stays in the owner-only settings file instead of blocking the start.
    const auto secrets = quorvel::MakeDesktopSecretStore(std::chrono::seconds(30));
    quorvel::SetProcessSecretStore(secrets.get());

    const QStringList arguments =
        line.scheduled ? QStringList{QStringLiteral("/S")} : QStringList{};
    quorvel::frm_WebDataClient window(arguments);
    quorvel::WindowPorts ports(&window, line.scheduled);
    QObject::connect(&instance, &quorvel::WindowInstance::ShowRequested, &window, [&window] {
        quorvel::WriteLogFile(QStringLiteral("Another start on this program folder: the window "
                                             "comes forward"));
        window.setWindowState(window.windowState() & ~Qt::WindowMinimized);
        window.show();
        window.raise();
        window.activateWindow();
    });
    window.Form_Load();
    window.show();
    return app.exec();
}
