#pragma once
// A list that, while empty, says in its own area what would fill it, so that
// an empty list on a first start points to the next step instead of a blank.

#include <QListWidget>

namespace quorvel {

class HintList : public QListWidget {
    Q_OBJECT
public:
    using QListWidget::QListWidget;
    // The text shown while the list has no entries; empty shows nothing.
    void SetEmptyHint(const QString& text);
    QString EmptyHint() const { return hint_; }

protected:
    void paintEvent(QPaintEvent* event) override;

private:
    QString hint_;
};

} // namespace quorvel
