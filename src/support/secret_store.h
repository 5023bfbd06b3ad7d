#pragma once
// Where passwords are kept between runs: the desktop's secret store (the
// Secret Service of GNOME Keyring or KWallet, through QtKeychain) when one
// answers. No widgets: the command-line run uses it as the window does.
//
// Every call waits for the store's answer in a local event loop, at most the
// given time: a store that would ask a question nobody answers (a locked
// keyring on a headless machine) counts as unavailable instead of blocking.

#include <QString>

#include <chrono>
#include <memory>

namespace quorvel {

class SecretStore {
public:
    enum class Status { Ok, NotFound, Unavailable };
    struct Result {
        Status status = Status::Unavailable;
        QString secret; // what Read found
        QString error;  // why the store did not answer
    };

    virtual ~SecretStore() = default;
    virtual Result Read(const QString& key) = 0;
    virtual Result Write(const QString& key, const QString& secret) = 0;
    // NotFound when there was nothing to remove.
    virtual Result Remove(const QString& key) = 0;
};

// The desktop's store under the service name "Quorvel".
std::unique_ptr<SecretStore> MakeDesktopSecretStore(std::chrono::milliseconds wait);

// The store the program's settings keep passwords in; null (the settings
// file alone, as in tests) until the program sets one at start-up.
SecretStore* ProcessSecretStore();
void SetProcessSecretStore(SecretStore* store);

} // namespace quorvel
