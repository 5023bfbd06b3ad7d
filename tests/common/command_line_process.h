#pragma once
// The program run from the command line as a process of its own, as cron or a
// systemd timer would run it: no display, no desktop session and no secret
// store on a bus (the password stays in the settings file).
//
//   CommandLineProcess run(home.Path());
//   const auto result = run.Run({"--run-all"});
//   EXPECT_EQ(result.code, 0) << result.err.toStdString();

#include <QProcess>
#include <QString>
#include <QStringList>

namespace quorvel::testing {

class CommandLineProcess {
public:
    struct Result {
        int code = -1; // the exit code; -1 when it did not end on its own
        QString out;   // standard output
        QString err;   // standard error
        QStringList OutLines() const;
    };

    // home: the program home given with --home to every run.
    explicit CommandLineProcess(QString home);

    // Runs the program with --home and the arguments to its end.
    Result Run(const QStringList& arguments);
    // Starts it and returns at once; Finish() collects the result.
    QProcess& Start(const QStringList& arguments);
    Result Finish();

    // The environment every run gets.
    static QProcessEnvironment Unattended(const QString& home);

private:
    QString home_;
    QProcess process_;
};

} // namespace quorvel::testing
