#include "app/run/list_run_host.h"

#include "app/run/transfer_decision.h"

namespace quorvel {

int ListRunHost::ActiveCount() const {
    int count = 0;
    for (const FileRecord& record : list_.Records())
        count += record.Active != 0 ? 1 : 0;
    return count;
}

FileRecord ListRunHost::BeginFile(int index) {
    current_ = index;
    return AsShownInFields(list_.At(index));
}

void ListRunHost::EndFile(int index, const FileRecord& record) {
    list_.At(index).FileDateLocal = record.FileDateLocal;
}

void ListRunHost::SetFromDate(int choice, const QString& afterDate) {
    settings_.account.fromDateChoice = choice;
    settings_.account.afterDate = afterDate;
}

} // namespace quorvel
