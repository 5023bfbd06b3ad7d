// The window's settings keep the service password in the program's secret
// store when there is one, and in the settings file otherwise.
#include "app/app_settings.h"
#include "common/temp_home.h"
#include "fake_secret_store.h"
#include "support/ini_store.h"
#include "support/password_keeper.h"
#include "support/program_home.h"
#include "support/secret_store.h"

#include <QFile>

#include <gtest/gtest.h>

namespace quorvel::testing {
namespace {

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

    FakeStore store;
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
