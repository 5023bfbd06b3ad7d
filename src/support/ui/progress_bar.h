#pragma once
// A progress bar with a caption: the part of the caption over the bar is white
// on blue, the rest black on light blue. Transfers feed it byte counts, zip
// steps percentages; Finish leaves a one-line summary with the elapsed time.

#include "support/ports.h"

#include <QColor>
#include <QDateTime>
#include <QWidget>

#include <cstdint>

namespace quorvel {

class CProgress : public QWidget, public ProgressView {
    Q_OBJECT
public:
    static inline const QColor kBackColour{129, 207, 254};
    static inline const QColor kTextColour{0, 0, 0};
    static inline const QColor kBarColour{18, 106, 254};
    static inline const QColor kBarTextColour{255, 255, 255};

    explicit CProgress(QWidget* parent = nullptr);

    // total < 0: values are percentages; total == 0: the bar is always full.
    // style: 0 caption left, 1 centred, 2 right, 3 travelling with the bar's end.
    void Initialise(std::int64_t total, int style, const QString& units) override;
    void Show(std::int64_t value, const QString& text) override;
    void Finish() override;

    // What is drawn now (for the window's readers and for tests).
    int BarWidth() const;
    QString Caption() const { return caption_; }
    bool Finished() const { return finished_; }

    // Bar width in pixels for a value over an area of the given width.
    static int BarWidthFor(std::int64_t value, std::int64_t total, int areaWidth);
    // The caption with the blanks its style adds.
    static QString CaptionFor(int style, const QString& text);

    QSize sizeHint() const override;

protected:
    void paintEvent(QPaintEvent* event) override;

private:
    void PaintBar(QPainter& painter);
    Qt::Alignment CaptionAlignment() const;

    std::int64_t total_ = 0;
    int style_ = 0;
    QString units_;
    QDateTime start_;
    std::int64_t value_ = 0;
    int barWidth_ = 0; // at the last Show, to skip repaints that change nothing
    QString caption_;
    bool shown_ = false;
    bool finished_ = false;
};

} // namespace quorvel
