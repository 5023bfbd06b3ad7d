#include "webdata/display_link.h"

#include "support/ports.h"
#include "webdata/talu_web_data.h"

#include <utility>

namespace quorvel {

DisplayLink::DisplayLink(CTALUWebData& web, TraceView& view) : web_(web), view_(view) {
    const auto status = [this](const QString& text) { view_.ShowStatus(text); };
    finished_ = QObject::connect(&web, &CTALUWebData::Finished, &web, status);
    status_ = QObject::connect(&web, &CTALUWebData::ShowStatus, &web, status);
    log_ = QObject::connect(&web, &CTALUWebData::ShowLog, &web,
                            [this](const QString& text) { view_.AddTrace(text); });
    // ProgressShow is not connected: the object draws its own progress.
}

DisplayLink::~DisplayLink() {
    for (const QMetaObject::Connection& c : {finished_, status_, log_, received_})
        QObject::disconnect(c);
}

void DisplayLink::SetTracesShown(bool shown) {
    if (shown == static_cast<bool>(received_)) return;
    if (shown)
        received_ = QObject::connect(&web_, &CTALUWebData::ShowReceived, &web_,
                                     [this](const QString& text) { view_.AddTrace(text); });
    else
        QObject::disconnect(std::exchange(received_, {}));
}

} // namespace quorvel
