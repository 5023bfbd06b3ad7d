#pragma once
// Small adapters from the window's widgets to the core's display interfaces.

#include "support/ports.h"
#include "webdata/combo_sink.h"

class QComboBox;
class QLabel;
class QListWidget;

namespace quorvel {

// Fills a combo box of the window from the web-data object's lists.
class ComboBoxSink : public ComboSink {
public:
    explicit ComboBoxSink(QComboBox* combo) : combo_(combo) {}
    void Clear() override;
    void AddItem(const QString& text, int itemData) override;
    void SetCurrentIndex(int index) override;

private:
    QComboBox* combo_;
};

// The FTP module's view of the window: its trace lines have their own switch
// ("Trace", handed over by ConfigureClass) and its status texts go to the
// status label alone.
class FtpDisplay : public TraceView {
public:
    FtpDisplay(QListWidget* trace, QLabel* status) : trace_(trace), status_(status) {}
    void AddTrace(const QString& line) override;
    void ShowStatus(const QString& text) override;

private:
    QListWidget* trace_;
    QLabel* status_;
};

} // namespace quorvel
