#pragma once
// A failure the window reports through its error box: what went wrong and
// where (the procedure text, often followed by the file or line concerned).

#include <QString>

namespace quorvel {

struct AppError {
    QString description;
    QString where;

    bool operator==(const AppError&) const = default;
};

// The text of the common error box: the description, a line break and
// "Quorvel:" with the procedure text.
inline QString ErrorBoxText(const AppError& error) {
    return error.description + QStringLiteral("\r\nQuorvel:") + error.where;
}

} // namespace quorvel
