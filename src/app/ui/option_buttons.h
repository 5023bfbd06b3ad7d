#pragma once
// An array of option buttons that acts as one group, exchanged as the index of
// the selected button. All buttons of a group share one parent, whose other
// children are no option buttons, so the buttons keep themselves exclusive.

#include <QList>
#include <QObject>
#include <QString>
#include <QStringList>

class QRadioButton;
class QWidget;

namespace quorvel {

class OptionButtons : public QObject {
    Q_OBJECT
public:
    // Creates one button per caption, named "<name>(<index>)", parented to parent.
    OptionButtons(const QString& name, const QStringList& captions, QWidget* parent);

    int Count() const { return static_cast<int>(buttons_.size()); }
    QRadioButton* Button(int index) const { return buttons_.at(index); }

    // Index of the first selected button, 0 when none is.
    int SelectedIndex() const;
    // -1 when nothing is selected.
    int CheckedIndex() const;
    // -1 clears every button; other indices are clamped to the group.
    void SetIndex(int index);

Q_SIGNALS:
    // A button became selected, by the user or by the program.
    void Clicked(int index);

private:
    QList<QRadioButton*> buttons_;
};

} // namespace quorvel
