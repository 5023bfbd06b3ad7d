// Passwords at rest: the desktop's secret store (a real GNOME keyring on a
// private D-Bus session, see with_keyring.sh), the fallback to the owner-only
// settings file without one, and the keeping rules between the two.
#include "common/temp_home.h"
#include "fake_secret_store.h"
#include "support/ini_store.h"
#include "support/password_keeper.h"
#include "support/program_home.h"
#include "support/secret_store.h"

#include <QElapsedTimer>
#include <QFile>

#include <gtest/gtest.h>

#include <chrono>

namespace quorvel::testing {
namespace {

using namespace std::chrono_literals;
using Status = SecretStore::Status;

const QString kPassword = "Tr0ub&dor 3=x";

QString Read(const QString& path) {
    QFile file(path);
    return file.open(QIODevice::ReadOnly) ? QString::fromUtf8(file.readAll()) : QString();
}

// ---- the keeping rules, over a store the test controls ----

class KeeperTest : public ::testing::Test {
protected:
    KeeperTest() { PasswordKeeper::ResetLogMemory(); }
    QString SettingsText() const { return Read(settings.Path()); }
    QString Log() const { return Read(ProgramHome::LogFile()); }
    QString StoreKey() const { return settings.Path() + "|Password"; }

    TempHome home;
    LocalSettings settings{ProgramHome::SettingsFile()};
    FakeStore store;
};

TEST_F(KeeperTest, WithAStoreTheSettingsFileHoldsNoPassword) {
    PasswordKeeper keeper(settings, &store);
    ASSERT_TRUE(keeper.Save("Password", kPassword));
    EXPECT_EQ(store.entries.value(StoreKey()), kPassword);
    EXPECT_TRUE(SettingsText().contains("Password=Null"));
    EXPECT_FALSE(SettingsText().contains("Tr0ub"));
    EXPECT_EQ(PasswordKeeper(settings, &store).Load("Password"), kPassword);
    // An emptied password leaves nothing behind in the store either.
    ASSERT_TRUE(keeper.Save("Password", QString()));
    EXPECT_TRUE(store.entries.isEmpty());
    EXPECT_EQ(keeper.LastPlace(), PasswordKeeper::Place::SecretStore);
}

TEST_F(KeeperTest, APasswordLeftInTheFileIsMovedIntoTheStoreOnceItAnswers) {
    settings.SaveLocalSetting("Password", kPassword);
    store.answers = false;
    EXPECT_EQ(PasswordKeeper(settings, &store).Load("Password"), kPassword);
    EXPECT_TRUE(SettingsText().contains(kPassword)); // kept where it is
    store.answers = true;
    store.entries[StoreKey()] = "older";
    // The file's copy was written while the store was away: it is the newer one.
    EXPECT_EQ(PasswordKeeper(settings, &store).Load("Password"), kPassword);
    EXPECT_EQ(store.entries.value(StoreKey()), kPassword);
    EXPECT_FALSE(SettingsText().contains(kPassword));
}

TEST_F(KeeperTest, WithoutAStoreThePasswordStaysInTheFileAndTheLogSaysSoOnce) {
    store.answers = false;
    PasswordKeeper keeper(settings, &store);
    ASSERT_TRUE(keeper.Save("Password", kPassword));
    ASSERT_TRUE(keeper.Save("FtpPassword", "ftp-secret"));
    EXPECT_EQ(keeper.Load("Password"), kPassword);
    EXPECT_EQ(keeper.LastPlace(), PasswordKeeper::Place::SettingsFile);
    EXPECT_EQ(keeper.StoreProblem(), "no bus");
    const QString told =
        PasswordKeeper::PlaceText(PasswordKeeper::Place::SettingsFile, settings.Path(), "no bus");
    EXPECT_EQ(Log().count(told), 1) << Log().toStdString();
    // Where it is kept changes: the log says it again, once.
    store.answers = true;
    keeper.Save("Password", kPassword);
    keeper.Save("FtpPassword", "ftp-secret");
    EXPECT_EQ(Log().count("kept in the desktop's secret store"), 1);
    EXPECT_FALSE(SettingsText().contains("ftp-secret"));
    // A keeper without any store (the settings file alone) behaves as described.
    PasswordKeeper plain(settings, nullptr);
    ASSERT_TRUE(plain.Save("Password", kPassword));
    EXPECT_TRUE(SettingsText().contains("Password=" + kPassword));
}

// ---- the real store ----

// The keyring runs only under with_keyring.sh (CTest); run by hand, these
// tests must not touch the desktop's own keyring.
bool InPrivateKeyring() {
    return qEnvironmentVariable("QUORVEL_TEST_KEYRING") == "1";
}
bool WithoutAnyBus() {
    return qEnvironmentVariable("QUORVEL_TEST_KEYRING") == "none";
}

TEST(KeyringStore, KeepsReplacesAndRemovesAPassword) {
    if (!InPrivateKeyring()) GTEST_SKIP() << "runs inside with_keyring.sh only";
    const auto store = MakeDesktopSecretStore(10s);
    const QString key = "/home/ann/.config/quorvel/quorvel.ini|Password";
    const SecretStore::Result written = store->Write(key, kPassword);
    ASSERT_EQ(written.status, Status::Ok) << written.error.toStdString();
    EXPECT_EQ(store->Read(key).secret, kPassword);
    ASSERT_EQ(store->Write(key, "second").status, Status::Ok);
    EXPECT_EQ(store->Read(key).secret, "second");
    // Another program home has its own entry.
    EXPECT_EQ(store->Read("/elsewhere/quorvel.ini|Password").status, Status::NotFound);
    EXPECT_EQ(store->Remove(key).status, Status::Ok);
    EXPECT_EQ(store->Read(key).status, Status::NotFound);
}

TEST(KeyringStore, TheKeeperLeavesNoPasswordInTheSettingsFile) {
    if (!InPrivateKeyring()) GTEST_SKIP() << "runs inside with_keyring.sh only";
    TempHome home;
    PasswordKeeper::ResetLogMemory();
    LocalSettings settings(ProgramHome::SettingsFile());
    settings.SaveLocalSetting("Password", kPassword); // from an older run
    const auto store = MakeDesktopSecretStore(10s);
    {
        PasswordKeeper keeper(settings, store.get());
        EXPECT_EQ(keeper.Load("Password"), kPassword);
        EXPECT_EQ(keeper.LastPlace(), PasswordKeeper::Place::SecretStore)
            << keeper.StoreProblem().toStdString();
        ASSERT_TRUE(keeper.Save("FtpPassword", "ftp-secret"));
    }
    const QString file = Read(settings.Path());
    EXPECT_FALSE(file.contains("Tr0ub")) << file.toStdString();
    EXPECT_FALSE(file.contains("ftp-secret"));
    // A later run (a new store object, as after a restart) finds both.
    const auto again = MakeDesktopSecretStore(10s);
    PasswordKeeper later(settings, again.get());
    EXPECT_EQ(later.Load("Password"), kPassword);
    EXPECT_EQ(later.Load("FtpPassword"), "ftp-secret");
    EXPECT_EQ(Read(ProgramHome::LogFile()).count("secret store"), 1);
}

TEST(NoSecretStore, AnswersUnavailableAtOnceAndTheKeeperFallsBackToTheFile) {
    if (!WithoutAnyBus()) GTEST_SKIP() << "runs without a session bus only";
    TempHome home;
    PasswordKeeper::ResetLogMemory();
    const auto store = MakeDesktopSecretStore(10s);
    QElapsedTimer timer;
    timer.start();
    const SecretStore::Result read = store->Read("x|Password");
    EXPECT_EQ(read.status, Status::Unavailable);
    EXPECT_FALSE(read.error.isEmpty());
    EXPECT_LT(timer.elapsed(), 5000); // no waiting for the limit
    LocalSettings settings(ProgramHome::SettingsFile());
    PasswordKeeper keeper(settings, store.get());
    ASSERT_TRUE(keeper.Save("Password", kPassword));
    EXPECT_EQ(keeper.Load("Password"), kPassword);
    EXPECT_EQ(keeper.LastPlace(), PasswordKeeper::Place::SettingsFile);
    const QString log = Read(ProgramHome::LogFile());
    EXPECT_EQ(log.count("passwords are kept in the settings file " + settings.Path()), 1)
        << log.toStdString();
}

} // namespace
} // namespace quorvel::testing
