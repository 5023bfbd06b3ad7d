#pragma once
// A run-time error inside the web-data object: the procedure that traps it
// reports it by its own name and leaves.

#include <QString>

#include <stdexcept>

namespace quorvel {

class WebDataError : public std::runtime_error {
public:
    explicit WebDataError(const QString& description)
        : std::runtime_error(description.toStdString()), description_(description) {}
    const QString& Description() const { return description_; }

private:
    QString description_;
};

} // namespace quorvel
