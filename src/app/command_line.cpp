#include "app/command_line.h"

#include <QCommandLineParser>

namespace quorvel {

namespace {

// Qt's own options for a window, taken by QApplication itself.
constexpr const char* kQtValueOptions[] = {
    "platform",    "platformpluginpath", "platformtheme", "plugin", "qwindowgeometry",
    "qwindowicon", "qwindowtitle",       "session",       "style",  "stylesheet",
    "display",     "geometry",           "qmljsdebugger"};
constexpr const char* kQtSwitches[] = {"reverse", "widgetcount", "nograb", "dograb", "sync"};

bool IsScheduleSwitch(const QString& argument) {
    return argument.compare(QLatin1String("/S"), Qt::CaseInsensitive) == 0;
}

} // namespace

CommandLine ParseCommandLine(const QStringList& arguments) {
    QCommandLineParser parser;
    // "-platform offscreen" as Qt writes it; "--home" and "-home" alike.
    parser.setSingleDashWordOptionMode(QCommandLineParser::ParseAsLongOptions);
    const QCommandLineOption home(QStringLiteral("home"), {}, QStringLiteral("DIR"));
    const QCommandLineOption runAll(QStringLiteral("run-all"));
    const QCommandLineOption dryRun(QStringLiteral("dry-run"));
    const QCommandLineOption quiet(QStringLiteral("quiet"));
    const QCommandLineOption caFile(QStringLiteral("ca-file"), {}, QStringLiteral("FILE"));
    const QCommandLineOption encipher(QStringLiteral("encipher"), {}, QStringLiteral("TEXT"));
    const QCommandLineOption help(QStringList{QStringLiteral("help"), QStringLiteral("h")});
    const QCommandLineOption version(QStringLiteral("version"));
    parser.addOptions({home, caFile, runAll, dryRun, quiet, encipher, help, version});
    for (const char* name : kQtValueOptions)
        parser.addOption(QCommandLineOption(QLatin1String(name), {}, QStringLiteral("VALUE")));
    for (const char* name : kQtSwitches)
        parser.addOption(QCommandLineOption(QLatin1String(name)));

    CommandLine line;
    QStringList withName = arguments;
    withName.prepend(QStringLiteral("quorvel"));
    if (!parser.parse(withName)) {
        line.error = parser.errorText();
        return line;
    }
    for (const QString& argument : parser.positionalArguments()) {
        if (!IsScheduleSwitch(argument)) {
            line.error = QStringLiteral("Unknown argument '%1'.").arg(argument);
            return line;
        }
        line.scheduled = true;
    }
    if (parser.isSet(home)) line.home = parser.values(home).constLast();
    if (parser.isSet(caFile)) line.caFile = parser.values(caFile).constLast();
    line.runAll = parser.isSet(runAll);
    line.dryRun = parser.isSet(dryRun);
    line.quiet = parser.isSet(quiet);
    if (parser.isSet(encipher)) line.encipher = parser.value(encipher);
    line.help = parser.isSet(help);
    line.version = parser.isSet(version);
    if ((line.dryRun || line.quiet) && !line.runAll)
        line.error = QStringLiteral("--dry-run and --quiet go with --run-all.");
    return line;
}

QString UsageText(const QString& version) {
    return QStringLiteral(
               "Quorvel %1\n"
               "Keeps data-logger files in step with your account on the web service.\n"
               "\n"
               "Usage: quorvel [/S] [--home DIR] [--ca-file FILE]\n"
               "       quorvel --run-all [--home DIR] [--ca-file FILE] [--dry-run] [--quiet]\n"
               "       quorvel --encipher TEXT | --version | --help\n"
               "\n"
               "  /S               start minimised and work on the schedule\n"
               "  --home DIR       keep settings, logs and the file list in DIR\n"
               "                   (also QUORVEL_HOME)\n"
               "  --ca-file FILE   also trust the certificate authorities in FILE (PEM) for\n"
               "                   https and FTP over TLS, as for a private service; the\n"
               "                   setting CAFile does the same\n"
               "  --run-all        sign in, run all files of the list and end, without a\n"
               "                   window or a display (for cron or a systemd timer); one\n"
               "                   line per file and a summary on standard output\n"
               "  --dry-run        with --run-all: print what each file would do, move\n"
               "                   nothing\n"
               "  --quiet          with --run-all: print only the failures\n"
               "  --encipher TEXT  print TEXT enciphered for line 3 of a configuration file\n"
               "  --version        print the version\n"
               "  --help           print this text\n"
               "\n"
               "Exit codes of --run-all:\n"
               "  0  every file succeeded\n"
               "  1  at least one file failed\n"
               "  2  it could not start (bad arguments, no file list, login failed,\n"
               "     folders unusable)\n"
               "  3  another run holds the run lock of the program folder\n")
        .arg(version);
}

} // namespace quorvel
