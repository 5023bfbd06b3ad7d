#include "app/app_settings.h"

#include "app/file_list_format.h"
#include "support/ini_store.h"
#include "support/password_keeper.h"
#include "support/paths.h"
#include "support/ports.h"
#include "support/program_home.h"
#include "support/secret_store.h"
#include "support/value_rules.h"

namespace quorvel {

namespace {

constexpr const char* kDefaultListName = "files.txt";

std::int16_t CheckValue(const QString& text) {
    return IsNonZero(text) ? 1 : 0;
}

// Reads the settings in start-up order. An option index that is no 16-bit
// number keeps its own default and is reported; the reading goes on, so one
// bad line never costs the other settings (they are written back at exit).
class SettingsReader {
public:
    explicit SettingsReader(const LocalSettings& settings) : settings_(settings) {}

    QString Text(const char* key, const QString& fallback) const {
        return settings_.GetLocalSetting(QString::fromLatin1(key), fallback);
    }

    void OptionIndex(const char* key, const char* fallback, std::int16_t& target) {
        const QString text = Text(key, QString::fromLatin1(fallback));
        const auto index = ToInt16(text);
        target = index ? *index : static_cast<std::int16_t>(QString::fromLatin1(fallback).toInt());
        if (index || error_) return;
        error_ = AppError{
            (IsNumericText(text) ? QStringLiteral("Overflow") : QStringLiteral("Type mismatch")) +
                QStringLiteral(": %1=%2 (its default %3 is used)")
                    .arg(QLatin1String(key), text, QLatin1String(fallback)),
            QStringLiteral("Load")};
    }

    const std::optional<AppError>& Error() const { return error_; }

private:
    const LocalSettings& settings_;
    std::optional<AppError> error_;
};

// The service password lives in the desktop's secret store when the program
// uses one and it answers; the settings file then holds "Null" for it.
QString KeptPassword(const LocalSettings& settings, const QString& inFile) {
    SecretStore* store = ProcessSecretStore();
    if (!store) return inFile;
    LocalSettings writable(settings.Path());
    return PasswordKeeper(writable, store).Load(QStringLiteral("Password"));
}

// What the settings file is to hold for the password.
QString PasswordForFile(LocalSettings& settings, const QString& password) {
    SecretStore* store = ProcessSecretStore();
    if (!store) return password;
    PasswordKeeper keeper(settings, store);
    keeper.Save(QStringLiteral("Password"), password);
    return keeper.LastPlace() == PasswordKeeper::Place::SecretStore ? QString() : password;
}

} // namespace

QString DefaultAfterDate(int year) {
    return QStringLiteral("1 Nov ") + QString::number(year);
}

QString SingleText(float value) {
    return QString::number(static_cast<double>(value), 'g', 7).toUpper();
}

AppSettings AppSettings::Defaults(const QString& programFolder, int currentYear,
                                  const QString& dataFolder) {
    AppSettings s;
    s.applicationFolder = programFolder;
    s.dataFolder = dataFolder.isEmpty() ? programFolder : dataFolder;
    s.interval = QStringLiteral("3 hrs");
    s.lastDownload = QStringLiteral("never");
    s.afterDate = DefaultAfterDate(currentYear);
    s.loadedFile = AddTrailingSlash(programFolder) + kDefaultListName;
    s.recentFiles.SetEntry(1, s.loadedFile);
    return s;
}

std::optional<AppError> AppSettings::Load(const LocalSettings& settings,
                                          const QString& programFolder, int currentYear,
                                          const QString& defaultDataFolder) {
    SettingsReader in(settings);
    cfgUrl = in.Text("CFG_URL", {});
    userId = in.Text("UserID", {});
    password = KeptPassword(settings, in.Text("Password", {}));
    applicationFolder = in.Text("ApplicationFolder", programFolder);
    dataFolder =
        in.Text("DataFolder", defaultDataFolder.isEmpty() ? programFolder : defaultDataFolder);
    showDate0 = CheckValue(in.Text("ShowDate0", QStringLiteral("1")));
    in.OptionIndex("GetLocalFolders", "1", getLocalFolders);
    in.OptionIndex("GetFileList", "1", getFileList);
    in.OptionIndex("Automatic", "0", automatic);
    interval = in.Text("Interval", QStringLiteral("3 hrs"));
    lastDownload = in.Text("LastDownload", QStringLiteral("never"));
    nextDownloadDue = in.Text("NextDownloadDue", {});
    downloadOnly = CheckValue(in.Text("DownloadOnly", QStringLiteral("0")));
    in.OptionIndex("Whichdates", "0", whichdates);
    afterDate = in.Text("AfterDate", DefaultAfterDate(currentYear));
    for (int number = 1; number <= RecentFiles::kEntries; ++number) {
        const QByteArray key = "File" + QByteArray::number(number);
        recentFiles.SetEntry(number, in.Text(key.constData(), {}));
    }
    loadedFile = in.Text("File1", AddTrailingSlash(applicationFolder) + kDefaultListName);
    recentFiles.SetEntry(1, loadedFile);
    return in.Error();
}

std::optional<AppError> AppSettings::Load(const LocalSettings& settings) {
    return Load(settings, ProgramHome::Folder(), CurrentClock().Now().date().year(),
                ProgramHome::DefaultDataFolder());
}

bool AppSettings::Save(LocalSettings& settings) const {
    const auto number = [](std::int16_t value) { return QString::number(value); };
    const std::pair<const char*, QString> values[] = {
        {"Left", SingleText(left)},
        {"Top", SingleText(top)},
        {"CFG_URL", cfgUrl},
        {"UserID", userId},
        {"Password", PasswordForFile(settings, password)},
        {"ApplicationFolder", applicationFolder},
        {"DataFolder", dataFolder},
        {"Automatic", number(automatic)},
        {"Interval", interval},
        {"LastDownload", lastDownload},
        {"NextDownloadDue", nextDownloadDue},
        {"Whichdates", number(whichdates)},
        {"AfterDate", afterDate},
        {"ShowDate0", number(showDate0)},
        {"ShowDate1", number(showDate1)},
        {"GetFileList", number(getFileList)},
        {"GetLocalFolders", number(getLocalFolders)},
        {"DownloadOnly", number(downloadOnly)},
    };
    std::vector<IniEntry> entries;
    for (const auto& [key, value] : values)
        entries.push_back({QString::fromLatin1(key), value});
    // The recent lists; a free entry has no line (an empty "File1" would read
    // as no list at all instead of the default list).
    for (int number = 1; number <= RecentFiles::kEntries; ++number) {
        if (!recentFiles.Entry(number).isEmpty())
            entries.push_back({QStringLiteral("File%1").arg(number), recentFiles.Entry(number)});
    }
    // One replacement of the file for all of them: each one is synced to disk.
    return settings.SaveLocalSettings(entries);
}

} // namespace quorvel
