#pragma once
// An array of option buttons that behaves like one group: selecting a button by
// index clears the others, and -1 clears them all (which an exclusive
// QButtonGroup cannot do on its own).

#include <QObject>
#include <QString>
#include <QStringList>
#include <QVector>

class QButtonGroup;
class QRadioButton;
class QWidget;

namespace quorvel {

class OptionGroup : public QObject {
    Q_OBJECT
public:
    // Creates one button per caption, named "<name>(<index>)", parented to parent.
    OptionGroup(const QString& name, const QStringList& captions, QWidget* parent);

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
    QVector<QRadioButton*> buttons_;
    QButtonGroup* group_;
};

} // namespace quorvel
