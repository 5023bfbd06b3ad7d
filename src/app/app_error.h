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

} // namespace quorvel
