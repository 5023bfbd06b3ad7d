#include "support/ui/wrapped_text.h"

#include <QTextOption>

#include <cmath>

namespace quorvel {

std::unique_ptr<QTextLayout> WrapText(const QString& text, const QFont& font, int width) {
    QString lines = text;
    lines.replace(QLatin1String("\r\n"), QLatin1String("\n"));
    lines.replace(QLatin1Char('\r'), QLatin1Char('\n'));
    lines.replace(QLatin1Char('\n'), QChar::LineSeparator);

    auto layout = std::make_unique<QTextLayout>(lines, font);
    QTextOption option;
    option.setWrapMode(QTextOption::WrapAtWordBoundaryOrAnywhere);
    layout->setTextOption(option);
    layout->beginLayout();
    qreal y = 0;
    for (QTextLine line = layout->createLine(); line.isValid(); line = layout->createLine()) {
        line.setLineWidth(width);
        line.setPosition(QPointF(0, y));
        y += line.height();
    }
    layout->endLayout();
    return layout;
}

int WrappedTextHeight(const QString& text, const QFont& font, int width) {
    if (text.isEmpty()) return 0;
    return static_cast<int>(std::ceil(WrapText(text, font, width)->boundingRect().height()));
}

} // namespace quorvel
