#include "support/ui/button_sets.h"

#include "support/ports.h"
#include "support/ui/msg_box_layout.h"

namespace quorvel {

ButtonSet ButtonSetFor(int buttons) {
    ButtonSet set;
    set.count = MsgBoxButtonCount(buttons);
    const auto fill = [&set](std::initializer_list<std::pair<const char*, int>> entries) {
        int i = 0;
        for (const auto& [caption, answer] : entries) {
            set.captions[i] = QString::fromLatin1(caption);
            set.answers[i] = answer;
            ++i;
        }
        set.defaultAnswer = set.answers[0];
    };
    switch (buttons & 7) {
    case kButtonsOk:
        fill({{"&Ok", kAnswerOk}});
        break;
    case kButtonsOkCancel:
        fill({{"&Ok", kAnswerOk}, {"&Cancel", kAnswerCancel}});
        break;
    case kButtonsYesNoCancel:
        fill({{"&Yes", kAnswerYes}, {"&No", kAnswerNo}, {"&Cancel", kAnswerCancel}});
        break;
    case kButtonsYesNo:
        fill({{"&Yes", kAnswerYes}, {"&No", kAnswerNo}});
        break;
    case kButtonsRetryCancel:
        fill({{"&Retry", kAnswerRetry}, {"&Cancel", kAnswerCancel}});
        break;
    default:
        // Codes 2, 6 and 7 have no captions or answers; no caller uses them.
        break;
    }
    return set;
}

} // namespace quorvel
