#pragma once
// The object's character substitution: a XOR of each character's 6-bit value
// with the key, its own inverse when the key's characters lie below code 64.

#include <QString>

#include <optional>

namespace quorvel {

// Doubles the key until it is longer than 50 characters.
QString ExpandKey(const QString& key);

// Characters outside 0-9, ?-Z and a-z pass unchanged. nullopt when a character
// of that alphabet stands beyond the key's length.
std::optional<QString> EncryptSimple(const QString& text, const QString& key);

} // namespace quorvel
