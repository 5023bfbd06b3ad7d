#pragma once
// The status line: highlighted while it shows a text, plain when empty.

#include <QColor>

class QLabel;
class QString;

namespace quorvel {

inline const QColor kStatusHighlight{255, 251, 240};

// No label: nothing. Otherwise sets the caption, the background (the button
// face when the text is empty, the highlight otherwise) and repaints at once.
void SetStatusLabel(QLabel* label, const QString& text);

} // namespace quorvel
