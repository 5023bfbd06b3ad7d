#include "support/secret_store.h"

#include <qt6keychain/keychain.h>

#include <QEventLoop>
#include <QTimer>

#include <functional>

namespace quorvel {

namespace {

const QString kService = QStringLiteral("Quorvel");

class KeychainStore : public SecretStore {
public:
    explicit KeychainStore(std::chrono::milliseconds wait) : wait_(wait) {}

    Result Read(const QString& key) override {
        auto* job = new QKeychain::ReadPasswordJob(kService);
        job->setKey(key);
        return Run(job, [job](Result& result) { result.secret = job->textData(); });
    }

    Result Write(const QString& key, const QString& secret) override {
        auto* job = new QKeychain::WritePasswordJob(kService);
        job->setKey(key);
        job->setTextData(secret);
        return Run(job);
    }

    Result Remove(const QString& key) override {
        auto* job = new QKeychain::DeletePasswordJob(kService);
        job->setKey(key);
        return Run(job);
    }

private:
    // Runs the job to its end or to the limit. A job still running at the
    // limit is left to end and delete itself; its answer is no longer wanted.
    Result Run(QKeychain::Job* job, const std::function<void(Result&)>& take = {}) {
        job->setAutoDelete(false);
        QEventLoop loop;
        bool done = false;
        QObject::connect(job, &QKeychain::Job::finished, &loop, [&] {
            done = true;
            loop.quit();
        });
        QTimer limit;
        limit.setSingleShot(true);
        QObject::connect(&limit, &QTimer::timeout, &loop, &QEventLoop::quit);
        job->start();
        limit.start(wait_);
        if (!done) loop.exec();
        Result result;
        if (!done) {
            QObject::disconnect(job, nullptr, &loop, nullptr);
            job->setAutoDelete(true);
            result.error = QStringLiteral("the secret store did not answer within ") +
                           QString::number(wait_.count()) + QStringLiteral(" ms");
            return result;
        }
        switch (job->error()) {
        case QKeychain::NoError:
            result.status = Status::Ok;
            if (take) take(result);
            break;
        case QKeychain::EntryNotFound:
            result.status = Status::NotFound;
            break;
        default:
            result.error = job->errorString();
            if (result.error.isEmpty()) result.error = QStringLiteral("the secret store refused");
            break;
        }
        job->deleteLater();
        return result;
    }

    std::chrono::milliseconds wait_;
};

} // namespace

std::unique_ptr<SecretStore> MakeDesktopSecretStore(std::chrono::milliseconds wait) {
    return std::make_unique<KeychainStore>(wait);
}

namespace {
SecretStore*& ProcessStore() {
    static SecretStore* store = nullptr;
    return store;
}
} // namespace

SecretStore* ProcessSecretStore() {
    return ProcessStore();
}

void SetProcessSecretStore(SecretStore* store) {
    ProcessStore() = store;
}

} // namespace quorvel
