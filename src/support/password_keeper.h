#pragma once
// Keeps the user's passwords (the service password, the FTP password) out of
// the settings file whenever the desktop's secret store answers.
//
// With a store: the password lives there under the settings file's path and
// the key, and the settings file holds "Null" for it. Without one (a headless
// machine, a locked keyring nobody can open): it stays in the owner-only
// settings file as before. A password found in the settings file (written
// before there was a store, or while it did not answer) is the newest one: it
// is moved into the store as soon as the store answers.
//
// The program log says where passwords are kept the first time it is decided
// in a run, and again only when that changes.

#include <QString>

namespace quorvel {

class LocalSettings;
class SecretStore;

class PasswordKeeper {
public:
    enum class Place { SecretStore, SettingsFile };

    // store may be null: the settings file alone.
    PasswordKeeper(LocalSettings& settings, SecretStore* store);

    QString Load(const QString& key);
    // False when the password could be kept nowhere.
    bool Save(const QString& key, const QString& password);

    Place LastPlace() const { return place_; }
    // Why the store was not used, when it was not.
    QString StoreProblem() const { return storeProblem_; }

    // The log text for a place (tests compare with it).
    static QString PlaceText(Place place, const QString& settingsFile, const QString& why);
    // Forgets what the log was told (tests).
    static void ResetLogMemory();

private:
    QString StoreKey(const QString& key) const;
    void UseFile(const QString& why);
    void UseStore();
    bool MoveIntoStore(const QString& key, const QString& password);

    LocalSettings& settings_;
    SecretStore* store_;
    Place place_ = Place::SettingsFile;
    QString storeProblem_;
};

} // namespace quorvel
