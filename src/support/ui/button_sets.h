#pragma once
// The button sets of the program's message boxes: captions, answer codes and
// the answer given when nobody clicks.

#include <QString>

#include <array>

namespace quorvel {

struct ButtonSet {
    int count = 1;
    std::array<QString, 3> captions; // index 0 is the right-most, default button
    std::array<int, 3> answers{};    // 0 where the set gives no answer
    int defaultAnswer = 0;
};

// Only the lowest three bits of the code choose the set; icon flags are ignored.
ButtonSet ButtonSetFor(int buttons);

} // namespace quorvel
