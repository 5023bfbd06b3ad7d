#include "support/password_keeper.h"

#include "support/ini_store.h"
#include "support/log_file.h"
#include "support/secret_store.h"

#include <optional>

namespace quorvel {

namespace {
std::optional<PasswordKeeper::Place>& ToldPlace() {
    static std::optional<PasswordKeeper::Place> told;
    return told;
}

void TellOnce(PasswordKeeper::Place place, const QString& text) {
    if (ToldPlace() == place) return;
    ToldPlace() = place;
    WriteLogFile(text);
}
} // namespace

PasswordKeeper::PasswordKeeper(LocalSettings& settings, SecretStore* store)
    : settings_(settings), store_(store) {}

QString PasswordKeeper::PlaceText(Place place, const QString& settingsFile, const QString& why) {
    if (place == Place::SecretStore)
        return QStringLiteral("Passwords are kept in the desktop's secret store (service "
                              "\"Quorvel\"); the settings file ") +
               settingsFile + QStringLiteral(" holds none");
    return QStringLiteral("No secret store answered (") + why +
           QStringLiteral("): passwords are kept in the settings file ") + settingsFile +
           QStringLiteral(", readable only by its owner");
}

void PasswordKeeper::ResetLogMemory() {
    ToldPlace().reset();
}

QString PasswordKeeper::StoreKey(const QString& key) const {
    // One program home, one account: two homes never share a password.
    return settings_.Path() + QLatin1Char('|') + key;
}

void PasswordKeeper::UseFile(const QString& why) {
    place_ = Place::SettingsFile;
    storeProblem_ = why;
    TellOnce(place_, PlaceText(place_, settings_.Path(), why));
}

void PasswordKeeper::UseStore() {
    place_ = Place::SecretStore;
    storeProblem_.clear();
    TellOnce(place_, PlaceText(place_, settings_.Path(), {}));
}

bool PasswordKeeper::MoveIntoStore(const QString& key, const QString& password) {
    const SecretStore::Result written = store_->Write(StoreKey(key), password);
    if (written.status != SecretStore::Status::Ok) {
        UseFile(written.error);
        return false;
    }
    UseStore();
    // Only once the store holds it does the file give it up.
    settings_.SaveLocalSetting(key, QString());
    return true;
}

QString PasswordKeeper::Load(const QString& key) {
    const QString inFile = settings_.GetLocalSetting(key, QString());
    if (!store_) {
        UseFile(QStringLiteral("none is used here"));
        return inFile;
    }
    const SecretStore::Result read = store_->Read(StoreKey(key));
    if (read.status == SecretStore::Status::Unavailable) {
        UseFile(read.error);
        return inFile;
    }
    if (!inFile.isEmpty()) {
        MoveIntoStore(key, inFile);
        return inFile;
    }
    if (read.status == SecretStore::Status::NotFound) {
        // Finding nothing proves no more than that the store is there; the
        // log waits for a password actually kept.
        place_ = Place::SecretStore;
        storeProblem_.clear();
        return QString();
    }
    UseStore();
    return read.secret;
}

bool PasswordKeeper::Save(const QString& key, const QString& password) {
    if (store_) {
        const SecretStore::Result done = password.isEmpty()
                                             ? store_->Remove(StoreKey(key))
                                             : store_->Write(StoreKey(key), password);
        if (done.status != SecretStore::Status::Unavailable) {
            UseStore();
            return settings_.SaveLocalSetting(key, QString());
        }
        UseFile(done.error);
    } else {
        UseFile(QStringLiteral("none is used here"));
    }
    return settings_.SaveLocalSetting(key, password);
}

} // namespace quorvel
