#include "support/ui/option_group.h"

#include <QRadioButton>

#include <algorithm>

namespace quorvel {

namespace {

// An exclusive button refuses to be unchecked directly; lift that for a moment.
void Uncheck(QRadioButton* button) {
    const bool exclusive = button->autoExclusive();
    button->setAutoExclusive(false);
    button->setChecked(false);
    button->setAutoExclusive(exclusive);
}

} // namespace

void SetOptionIndex(OptionGroup group, int index) {
    if (group.empty()) return;
    if (index == -1) {
        for (QRadioButton* button : group)
            Uncheck(button);
        return;
    }
    const auto chosen = static_cast<std::size_t>(std::clamp<int>(index, 0, int(group.size()) - 1));
    // Buttons of one group need not share a parent, so clear the others by hand.
    for (std::size_t i = 0; i < group.size(); ++i) {
        if (i != chosen) Uncheck(group[i]);
    }
    group[chosen]->setChecked(true);
}

int SelectedOptionIndex(OptionGroup group) {
    const auto found = std::find_if(group.begin(), group.end(),
                                    [](const QRadioButton* button) { return button->isChecked(); });
    return found == group.end() ? 0 : int(found - group.begin());
}

} // namespace quorvel
