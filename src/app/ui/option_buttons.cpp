#include "app/ui/option_buttons.h"

#include "support/ui/option_group.h"

#include <QRadioButton>

namespace quorvel {

OptionButtons::OptionButtons(const QString& name, const QStringList& captions, QWidget* parent)
    : QObject(parent) {
    setObjectName(name);
    for (int i = 0; i < captions.size(); ++i) {
        auto* button = new QRadioButton(captions.at(i), parent);
        button->setObjectName(QStringLiteral("%1(%2)").arg(name).arg(i));
        connect(button, &QRadioButton::toggled, this, [this, i](bool on) {
            if (on) Q_EMIT Clicked(i);
        });
        buttons_.push_back(button);
    }
}

int OptionButtons::SelectedIndex() const {
    return SelectedOptionIndex(buttons_);
}

int OptionButtons::CheckedIndex() const {
    for (int i = 0; i < buttons_.size(); ++i)
        if (buttons_.at(i)->isChecked()) return i;
    return -1;
}

void OptionButtons::SetIndex(int index) {
    SetOptionIndex(buttons_, index);
}

} // namespace quorvel
