#include "app/ui/window_run.h"

#include "app/run/run_engine.h"
#include "app/ui/frm_web_data_client.h"
#include "support/ui/progress_bar.h"

namespace quorvel {

RunSettings WindowRun::Settings() const {
    return window_.FieldSettings();
}

int WindowRun::EntryCount() const {
    return window_.Controls().Lst_Files->count();
}

int WindowRun::ActiveCount() const {
    int count = 0;
    for (const FileRecord& record : window_.Files().Records())
        count += record.Active != 0 ? 1 : 0;
    return count;
}

int WindowRun::CurrentEntry() const {
    return window_.Controls().Lst_Files->currentRow();
}

FileRecord WindowRun::BeginFile(int index) {
    // Selecting stores the fields of the entry shown before and shows this one.
    window_.Controls().Lst_Files->setCurrentRow(index);
    return window_.FieldsRecord();
}

void WindowRun::EndFile(int index, const FileRecord& record) {
    window_.ShowLocalDate(index, record.FileDateLocal);
}

void WindowRun::SetFromDate(int choice, const QString& afterDate) {
    window_.Controls().Txt_AfterDate->setText(afterDate);
    window_.Controls().Opt_Whichdates->SetIndex(choice);
}

std::optional<AppError> WindowRun::SaveFileList() {
    return window_.SaveChangedList();
}

void WindowRun::StampLastRun(const QString& when) {
    window_.Controls().Lbl_LastDownload->setText(when);
}

void WindowRun::BusyChanged(bool busy) {
    window_.EnableControls();
    if (!busy) window_.RefreshFileStatus();
}

void WindowRun::FilesBegin(int activeCount) {
    window_.Controls().Pic_ProgressFile->Initialise(activeCount, 0, QStringLiteral("Files"));
}

void WindowRun::FileBegins(int number, const FileRecord& record) {
    window_.Controls().Pic_ProgressFile->Show(number, record.Name);
}

void WindowRun::FilesEnd(int) {
    window_.Controls().Pic_ProgressFile->Finish();
}

void WindowRun::MessageShown() {
    window_.Flags().InMessage = true;
}

} // namespace quorvel
