#include "support/ui/msg_box_layout.h"

#include "support/value_rules.h"

#include <algorithm>

namespace quorvel {

namespace {

constexpr int kTextLeft = 12;
constexpr int kTextTop = 24;
constexpr int kButtonGap = 2;
constexpr int kBottomMargin = 16;

} // namespace

int MsgBoxButtonCount(int buttons) {
    switch (buttons & 7) {
    case 1:
    case 4:
    case 5:
        return 2;
    case 2:
    case 3:
        return 3;
    default:
        return 1;
    }
}

MsgBoxLayout ComputeMsgBoxLayout(int messageLength, QSize letter, QSize button, int buttons,
                                 int neededTextHeight) {
    MsgBoxLayout out;
    out.charsPerLine = messageLength >= 50 ? 40 : 20;
    out.lines =
        std::max(3, static_cast<int>(RoundHalfEven(double(messageLength) / out.charsPerLine)));
    const int textWidth = std::max(kMsgBoxMinTextWidth, out.charsPerLine * letter.width());
    const int textHeight =
        std::max({kMsgBoxMinTextHeight, out.lines * letter.height(), neededTextHeight});
    out.textRect = QRect(kTextLeft, kTextTop, textWidth, textHeight);

    out.buttonTop = textHeight + 32;
    out.buttonCount = MsgBoxButtonCount(buttons);
    const int bw = button.width();
    out.width = std::max(textWidth + 48, out.buttonCount * bw + 24);
    out.height = out.buttonTop + button.height() + kBottomMargin;

    // One row from right to left in index order: Yes/No/Cancel reads Cancel, No, Yes.
    const int middle = out.width / 2;
    switch (out.buttonCount) {
    case 1:
        out.buttonLeft[0] = middle - bw / 2;
        break;
    case 2:
        out.buttonLeft[0] = middle + kButtonGap;
        out.buttonLeft[1] = middle - bw;
        break;
    default:
        out.buttonLeft[1] = middle - bw / 2;
        out.buttonLeft[0] = out.buttonLeft[1] + bw + kButtonGap;
        out.buttonLeft[2] = out.buttonLeft[1] - kButtonGap - bw;
        break;
    }
    return out;
}

} // namespace quorvel
