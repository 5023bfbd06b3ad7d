// The window's settings keep the service password in the program's secret
// store when there is one, and in the settings file otherwise.
#include "app/app_settings.h"
#include "common/temp_home.h"
#include "support/ini_store.h"
#include "support/password_keeper.h"
#include "support/program_home.h"
#include "support/secret_store.h"

#include <QFile>
#include <QMap>

#include <gtest/gtest.h>

namespace quorvel::testing {
namespace {

class MapStore : public SecretStore {
public:
    Result Read(const QString& key) override {
        if (!entries.contains(key)) return {Status::NotFound, {}, {}};
        return {Status::Ok, entries.value(key), {}};
    }
    Result Write(const QString& key, const QString& secret) override {
        entries[key] = secret;
        return {Status::Ok, {}, {}};
    }
    Result Remove(const QString& key) override {
        return {entries.remove(key) ? Status::Ok : Status::NotFound, {}, {}};
    }
    QMap<QString, QString> entries;
};

QString FileText(const QString& path) {
    QFile file(path);
    return file.open(QIODevice::ReadOnly) ? QString::fromUtf8(file.readAll()) : QString();
}

TEST(SettingsPassword, GoesToTheStoreWhenThereIsOneAndStaysInTheFileOtherwise) {
    TempHome home;
    PasswordKeeper::ResetLogMemory();
    LocalSettings settings(ProgramHome::SettingsFile());
    AppSettings values = AppSettings::Defaults(home.Path(), 2024);
    values.userId = "ann";
    values.password = "p&ss word";

    // Without a store, as described: the owner-only file holds it.
    ASSERT_TRUE(values.Save(settings));
    EXPECT_TRUE(FileText(settings.Path()).contains("Password=p&ss word"));

    MapStore store;
    SetProcessSecretStore(&store);
    AppSettings loaded;
    ASSERT_FALSE(loaded.Load(settings, home.Path(), 2024));
    EXPECT_EQ(loaded.password, "p&ss word");
    // Read once with a store there, the password left the file.
    EXPECT_EQ(store.entries.value(settings.Path() + "|Password"), "p&ss word");
    EXPECT_FALSE(FileText(settings.Path()).contains("p&ss"));

    loaded.password = "changed";
    ASSERT_TRUE(loaded.Save(settings));
    EXPECT_TRUE(FileText(settings.Path()).contains("Password=Null"));
    EXPECT_FALSE(FileText(settings.Path()).contains("changed"));
    AppSettings again;
    ASSERT_FALSE(again.Load(settings, home.Path(), 2024));
    EXPECT_EQ(again.password, "changed");
    SetProcessSecretStore(nullptr);
}

} // namespace
} // namespace quorvel::testing
