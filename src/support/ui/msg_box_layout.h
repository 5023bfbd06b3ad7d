#pragma once
// Geometry of the timed message box, worked out from the message length, the
// size of the letter "X" in the box's font and the size of its buttons.

#include <QRect>
#include <QSize>

#include <array>

namespace quorvel {

inline constexpr int kMsgBoxMinTextWidth = 250;
inline constexpr int kMsgBoxMinTextHeight = 60;

struct MsgBoxLayout {
    int charsPerLine = 0;
    int lines = 0;
    QRect textRect; // where the message is drawn, word-wrapped
    int width = 0;  // client width of the box
    int height = 0; // client height of the box
    int buttonTop = 0;
    int buttonCount = 0;
    std::array<int, 3> buttonLeft{}; // left edge of buttons 0, 1, 2 (unused ones 0)
};

// Number of buttons a button code shows (only its lowest three bits count).
int MsgBoxButtonCount(int buttons);

// messageLength: characters of the message; letter: size of "X"; button: size
// of one button; neededTextHeight: height the wrapped text really takes (0 when
// unknown), so that a message with many line breaks is never cut off.
MsgBoxLayout ComputeMsgBoxLayout(int messageLength, QSize letter, QSize button, int buttons,
                                 int neededTextHeight = 0);

} // namespace quorvel
