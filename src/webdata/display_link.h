#pragma once
// How a window wires the web-data object to its displays: Finished and
// ShowStatus go to the status display, ShowLog to the trace pane, and
// ShowReceived to the trace pane only while the pane shows anything (the
// window's "Status" box). While it shows nothing, the object turns no arrival
// into text at all: no copy, no line-end conversion, no decoding.
//
// The window makes one link beside the object and calls SetTracesShown from
// its ConfigureClass with the state of the "Status" box.

#include <QMetaObject>

namespace quorvel {

class CTALUWebData;
class TraceView;

class DisplayLink {
public:
    DisplayLink(CTALUWebData& web, TraceView& view);
    ~DisplayLink();
    DisplayLink(const DisplayLink&) = delete;
    DisplayLink& operator=(const DisplayLink&) = delete;

    void SetTracesShown(bool shown);

private:
    CTALUWebData& web_;
    TraceView& view_;
    QMetaObject::Connection finished_, status_, log_, received_;
};

} // namespace quorvel
