#pragma once
// Groups of option buttons, stored and exchanged as the index of the selected one.

#include <QList>

#include <span>
#include <vector>

class QRadioButton;

namespace quorvel {

using OptionGroup = std::span<QRadioButton* const>;

// -1 clears every button; any other index selects the button at that index,
// clamped to the group. An empty group is left alone.
void SetOptionIndex(OptionGroup group, int index);
inline void SetOptionIndex(const QList<QRadioButton*>& group, int index) {
    SetOptionIndex(OptionGroup(group.data(), group.size()), index);
}

// Index of the first checked button; 0 when none is.
int SelectedOptionIndex(OptionGroup group);
inline int SelectedOptionIndex(const QList<QRadioButton*>& group) {
    return SelectedOptionIndex(OptionGroup(group.data(), group.size()));
}

} // namespace quorvel
