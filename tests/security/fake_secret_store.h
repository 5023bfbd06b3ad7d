#pragma once
// A secret store the test controls: it answers from a map, or not at all.

#include "support/secret_store.h"

#include <QMap>

namespace quorvel::testing {

class FakeStore : public SecretStore {
public:
    Result Read(const QString& key) override {
        if (!answers) return {Status::Unavailable, {}, "no bus"};
        if (!entries.contains(key)) return {Status::NotFound, {}, {}};
        return {Status::Ok, entries.value(key), {}};
    }
    Result Write(const QString& key, const QString& secret) override {
        if (!answers) return {Status::Unavailable, {}, "no bus"};
        entries[key] = secret;
        return {Status::Ok, {}, {}};
    }
    Result Remove(const QString& key) override {
        if (!answers) return {Status::Unavailable, {}, "no bus"};
        return {entries.remove(key) ? Status::Ok : Status::NotFound, {}, {}};
    }
    bool answers = true; // false: as a session without a secret service
    QMap<QString, QString> entries;
};

} // namespace quorvel::testing
