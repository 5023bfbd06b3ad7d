// The handlers of the record fields. The rules that keep a record's transfer
// choices consistent are the core's (ChooseDownload and the others); here the
// fields are read, the rules applied and the settled values shown.

#include "app/run/transfer_decision.h"
#include "app/ui/frm_web_data_client.h"
#include "app/ui/loading_scope.h"
#include "support/ui/list_ops.h"

#include <QRadioButton>

namespace quorvel {

namespace {

TransferRules FieldRules(const WindowControls& c) {
    return {c.Opt_Download->SelectedIndex(), c.Opt_Upload->SelectedIndex(),
            c.Opt_MethodID->SelectedIndex(), c.Chk_Zip->checkState() == Qt::Checked};
}

} // namespace

void frm_WebDataClient::ConnectRecordHandlers() {
    auto changed = [this] {
        if (!flags_.IsLoading) SetChanged();
    };
    connect(c_.Txt_Name, &QLineEdit::textChanged, this, [this] { Txt_Name_Change(); });
    connect(c_.Txt_FileName, &QLineEdit::textChanged, this, changed);
    connect(c_.Txt_Folder, &QLineEdit::textChanged, this, changed);
    connect(c_.Chk_Active, &QCheckBox::stateChanged, this, changed);
    for (OptionButtons* group : {c_.Opt_AdminLocationID, c_.Opt_UserLocationID})
        connect(group, &OptionButtons::Clicked, this, [this] { Opt_Location_Click(); });
    connect(c_.Opt_Download, &OptionButtons::Clicked, this,
            [this](int index) { Opt_Download_Click(index); });
    connect(c_.Opt_Upload, &OptionButtons::Clicked, this,
            [this](int index) { Opt_Upload_Click(index); });
    connect(c_.Opt_MethodID, &OptionButtons::Clicked, this,
            [this](int index) { Opt_MethodID_Click(index); });
    connect(c_.Chk_Zip, &QCheckBox::stateChanged, this, [this] { Chk_Zip_Click(); });
    connect(c_.Cmb_TypeID, &QComboBox::currentIndexChanged, this, [this] { Cmb_TypeID_Click(); });
    // The record shown follows what the list highlights: a click on the empty
    // part of the list or a Ctrl+click clears the selection without moving the
    // current row, and Ctrl+arrow moves the current row alone.
    connect(c_.Lst_Files, &QListWidget::currentRowChanged, this, [this] { Lst_Files_Click(); });
    connect(c_.Lst_Files, &QListWidget::itemSelectionChanged, this, [this] { Lst_Files_Click(); });
}

void frm_WebDataClient::ShowTransferRules(const TransferRules& rules) {
    const TransferRules shown = FieldRules(c_);
    LoadingScope loading(flags_.IsLoading);
    if (rules.download != shown.download) c_.Opt_Download->SetIndex(rules.download);
    if (rules.upload != shown.upload) c_.Opt_Upload->SetIndex(rules.upload);
    if (rules.method != shown.method) c_.Opt_MethodID->SetIndex(rules.method);
    if (rules.zip != shown.zip) c_.Chk_Zip->setCheckState(rules.zip ? Qt::Checked : Qt::Unchecked);
}

void frm_WebDataClient::Txt_Name_Change() {
    if (flags_.IsLoading) return;
    if (auto* item = c_.Lst_Files->item(SelectedRow())) item->setText(c_.Txt_Name->text());
    SetChanged();
}

void frm_WebDataClient::Opt_Location_Click() {
    if (flags_.IsLoading) return;
    SetChanged();
    EnableControls();
    RefreshFileStatus();
}

void frm_WebDataClient::Opt_Download_Click(int index) {
    if (flags_.IsLoading) return;
    ShowTransferRules(ChooseDownload(FieldRules(c_), index));
    SetChanged();
    EnableControls();
    RefreshFileStatus(); // the service side's folder follows the upload rule
}

void frm_WebDataClient::Opt_Upload_Click(int index) {
    if (flags_.IsLoading) return;
    ShowTransferRules(ChooseUpload(FieldRules(c_), index));
    SetChanged();
    EnableControls();
    RefreshFileStatus();
}

void frm_WebDataClient::Opt_MethodID_Click(int index) {
    if (flags_.IsLoading) return;
    ShowTransferRules(ChooseMethod(FieldRules(c_), index));
    SetChanged();
    EnableControls();
}

void frm_WebDataClient::Chk_Zip_Click() {
    if (flags_.IsLoading) return;
    ShowTransferRules(ChooseZip(FieldRules(c_), c_.Chk_Zip->checkState() == Qt::Checked));
    SetChanged();
    EnableControls();
}

void frm_WebDataClient::Cmb_TypeID_Click() {
    if (flags_.IsLoading) return;
    ShowTransferRules(ChooseDataType(FieldRules(c_), SelectedTypeID()));
    SetChanged();
    EnableControls();
    RefreshFileStatus(); // the last dates are read in the chosen layout
}

void frm_WebDataClient::Lst_Files_Click() {
    if (flags_.IsLoading || SelectedRow() + 1 == currentRecord_) return;
    // The states are derived once, when the next record is shown.
    StoreFields();
    ShowCurrentRecord();
}

} // namespace quorvel
