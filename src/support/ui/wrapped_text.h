#pragma once
// A message laid out in lines of a given width: broken at word boundaries, or
// anywhere when a single word (a long path) is wider than a line.

#include <QFont>
#include <QString>
#include <QTextLayout>

#include <memory>

namespace quorvel {

// The text with CR LF, CR and LF all taken as line breaks, laid out in lines
// of the given width starting at y = 0.
std::unique_ptr<QTextLayout> WrapText(const QString& text, const QFont& font, int width);

// Height the wrapped text takes, in pixels (rounded up).
int WrappedTextHeight(const QString& text, const QFont& font, int width);

} // namespace quorvel
