// Moving values between the file records and the record fields, and the
// file-list buttons.

#include "app/ui/frm_web_data_client.h"
#include "app/ui/loading_scope.h"
#include "app/ui/route_view.h"
#include "support/paths.h"
#include "support/ui/list_ops.h"
#include "support/ui/status_label.h"

#include <QRadioButton>

namespace quorvel {

namespace {

// The value a check box holds: 1 checked, 0 clear, 2 grey.
std::int16_t CheckValue(const QCheckBox* box) {
    switch (box->checkState()) {
    case Qt::Checked:
        return 1;
    case Qt::PartiallyChecked:
        return 2;
    default:
        return 0;
    }
}

void SetCheckValue(QCheckBox* box, int value) {
    if (value == 2) {
        box->setCheckState(Qt::PartiallyChecked);
        return;
    }
    box->setTristate(false);
    box->setCheckState(value != 0 ? Qt::Checked : Qt::Unchecked);
}

} // namespace

int frm_WebDataClient::SelectedRow() const {
    return ListSelectedRow(c_.Lst_Files);
}

bool frm_WebDataClient::LoadDataFile(const QString& path) {
    // The fields no longer belong to any record of the list that replaces this one.
    currentRecord_ = 0;
    const ListLoadResult result = files_.LoadDataFile(path);
    for (const AppError& error : result.errors)
        ShowError(error);
    SetLoadedFile(path);
    AddToRecentFiles(path);
    return result.ok;
}

void frm_WebDataClient::LoadFilesListBox() {
    c_.Lst_Files->clear();
    QStringList names;
    names.reserve(files_.Count());
    for (const FileRecord& record : files_.Records())
        names << record.Name;
    c_.Lst_Files->addItems(names);
    if (c_.Lst_Files->count() > 0) c_.Lst_Files->setCurrentRow(0);
}

bool frm_WebDataClient::OpenFileList(const QString& path) {
    if (!LoadDataFile(path)) return false;
    LoadFilesListBox();
    return true;
}

std::optional<AppError> frm_WebDataClient::SaveChangedList() {
    // A new list has no file yet: it waits for the name the user is asked
    // for when it is replaced or the window closes, instead of failing here.
    if (files_.LoadedFile.isEmpty()) return std::nullopt;
    return files_.SaveFileList(Folders());
}

bool frm_WebDataClient::SaveFileList() {
    if (const auto error = SaveChangedList()) return ShowError(*error);
    return true;
}

FileRecord frm_WebDataClient::FieldsRecord() const {
    FileRecord r = RecordAt(currentRecord_);
    r.Active = CheckValue(c_.Chk_Active);
    r.Name = c_.Txt_Name->text();
    r.FileName = c_.Txt_FileName->text();
    r.TypeID = static_cast<std::int16_t>(SelectedTypeID());
    r.AdminLocationID = static_cast<std::int16_t>(c_.Opt_AdminLocationID->SelectedIndex());
    r.UserLocationID = static_cast<std::int16_t>(c_.Opt_UserLocationID->SelectedIndex());
    r.MethodID = static_cast<std::int16_t>(c_.Opt_MethodID->SelectedIndex());
    r.Download = static_cast<std::int16_t>(c_.Opt_Download->SelectedIndex());
    r.Upload = static_cast<std::int16_t>(c_.Opt_Upload->SelectedIndex());
    r.Zip = CheckValue(c_.Chk_Zip);
    r.Folder = c_.Txt_Folder->text();
    r.FileDate = c_.Txt_FileDate->text();
    r.FileDateLocal = c_.Txt_FileDateLocal->text();
    return r;
}

bool frm_WebDataClient::StoreCurrentRecord() {
    StoreFields();
    EnableControls();
    return true;
}

void frm_WebDataClient::StoreFields() {
    // FileID and SpareNumber are the record's own; FieldsRecord keeps them.
    if (currentRecord_ > 0 && currentRecord_ <= files_.Count())
        files_.At(currentRecord_ - 1) = FieldsRecord();
    flags_.RecordEdited = false;
}

void frm_WebDataClient::ShowLocalDate(int index, const QString& date) {
    if (index == currentRecord_ - 1)
        c_.Txt_FileDateLocal->setText(date);
    else if (index >= 0 && index < files_.Count())
        files_.At(index).FileDateLocal = date;
}

void frm_WebDataClient::ShowCurrentRecord() {
    if (SelectedRow() < 0) {
        // Nothing selected: no current record, and fields that show none.
        ClearRecordFields();
    } else {
        LoadingScope loading(flags_.IsLoading);
        currentRecord_ = SelectedRow() + 1;
        const FileRecord& r = RecordAt(currentRecord_);
        SetCheckValue(c_.Chk_Active, r.Active);
        c_.Txt_Name->setText(r.Name);
        c_.Txt_FileName->setText(r.FileName);
        ListSelectItemData(c_.Cmb_TypeID, r.TypeID);
        c_.Opt_AdminLocationID->SetIndex(r.AdminLocationID);
        c_.Opt_UserLocationID->SetIndex(r.UserLocationID);
        c_.Opt_MethodID->SetIndex(r.MethodID);
        c_.Opt_Download->SetIndex(r.Download);
        c_.Opt_Upload->SetIndex(r.Upload);
        SetCheckValue(c_.Chk_Zip, r.Zip);
        c_.Txt_Folder->setText(r.Folder);
        c_.Txt_FileDate->setText(r.FileDate);
        c_.Txt_FileDateLocal->setText(r.FileDateLocal);
    }
    flags_.RecordEdited = false;
    EnableControls();
    RefreshFileStatus();
}

void frm_WebDataClient::ClearRecordFields() {
    LoadingScope loading(flags_.IsLoading);
    currentRecord_ = 0;
    SetCheckValue(c_.Chk_Active, 2);
    SetCheckValue(c_.Chk_Zip, 2);
    c_.Txt_FileName->clear();
    c_.Txt_Folder->clear();
    c_.Txt_Name->clear();
    c_.Cmb_TypeID->setCurrentIndex(-1);
    for (OptionButtons* group : {c_.Opt_AdminLocationID, c_.Opt_UserLocationID, c_.Opt_MethodID,
                                 c_.Opt_Download, c_.Opt_Upload})
        group->SetIndex(-1);
}

void frm_WebDataClient::AddNewFileRecord(const QString& path) {
    // The fields go back into their record before the numbers move.
    StoreCurrentRecord();
    const int index = quorvel::AddNewFileRecord(files_, Folders(), path, SelectedRow());
    if (index < 0) {
        ShowError(QStringLiteral("AddNewFileRecord"),
                  QStringLiteral("The file list is full (%1 files)").arg(FileList::kMaxRecords));
        return;
    }
    {
        LoadingScope loading(flags_.IsLoading);
        ListAddItem(c_.Lst_Files, files_.At(index).Name, 0);
    }
    ShowCurrentRecord();
}

void frm_WebDataClient::DoFile(int index) {
    ConfigureClass();
    if (!StoreCurrentRecord()) return;
    LoadingScope loading(flags_.IsLoading);
    const int row = SelectedRow();
    switch (index) {
    case kFileNew: {
        const QStringList chosen = dialogs_.openFiles(
            this, QStringLiteral("Add data files"),
            AddTrailingSlash(c_.Txt_LocalFolder[1]->text()) + c_.Txt_UserFolder->text(),
            QStringLiteral("All files (*)"));
        for (const QString& path : chosen)
            AddNewFileRecord(path);
        c_.SSTab1->setCurrentIndex(1);
        break;
    }
    case kFileMoveUp:
    case kFileMoveDown: {
        const int delta = index == kFileMoveUp ? -1 : 1;
        if (row < 0 || !files_.Move(row, delta)) break;
        ListMoveItem(c_.Lst_Files, index);
        ShowCurrentRecord();
        files_.ListChanged = true;
        break;
    }
    case kFileDelete: {
        if (row < 0) break;
        const QString question =
            QStringLiteral("Remove '") + c_.Txt_FileName->text() + QStringLiteral("' ?");
        if (CurrentPrompter().SystemMsgBox(question, kButtonsYesNo | kIconQuestion) != kAnswerYes)
            break;
        files_.Remove(row);
        ListRemoveItem(c_.Lst_Files);
        ShowCurrentRecord();
        files_.ListChanged = true;
        break;
    }
    default: // kFileSave: the fields went into the record above
        break;
    }
}

} // namespace quorvel
