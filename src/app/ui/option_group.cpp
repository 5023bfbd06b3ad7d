#include "app/ui/option_group.h"

#include <QButtonGroup>
#include <QRadioButton>

#include <algorithm>

namespace quorvel {

OptionGroup::OptionGroup(const QString& name, const QStringList& captions, QWidget* parent)
    : QObject(parent), group_(new QButtonGroup(this)) {
    setObjectName(name);
    for (int i = 0; i < captions.size(); ++i) {
        auto* button = new QRadioButton(captions.at(i), parent);
        button->setObjectName(QStringLiteral("%1(%2)").arg(name).arg(i));
        group_->addButton(button, i);
        connect(button, &QRadioButton::toggled, this, [this, i](bool on) {
            if (on) Q_EMIT Clicked(i);
        });
        buttons_.push_back(button);
    }
}

int OptionGroup::SelectedIndex() const { return std::max(0, CheckedIndex()); }

int OptionGroup::CheckedIndex() const { return group_->checkedId(); }

void OptionGroup::SetIndex(int index) {
    if (buttons_.isEmpty()) return;
    if (index == -1) {
        // An exclusive group refuses to clear its last selected button.
        group_->setExclusive(false);
        for (auto* button : buttons_)
            button->setChecked(false);
        group_->setExclusive(true);
        return;
    }
    buttons_[std::clamp(index, 0, Count() - 1)]->setChecked(true);
}

} // namespace quorvel
