// The handlers of the record fields and their mutual rules: "Always" in one
// direction excludes "Always" in the other, and zipped files travel whole.

#include "app/ui/frm_web_data_client.h"
#include "support/ui/list_ops.h"

#include <QRadioButton>

namespace quorvel {

void frm_WebDataClient::ConnectRecordHandlers() {
    auto quiet = [this](auto handler) {
        return [this, handler](auto&&...) {
            if (!flags_.IsLoading) handler();
        };
    };
    auto changed = [this] {
        if (!flags_.IsLoading) SetChanged();
    };
    connect(c_.Txt_Name, &QLineEdit::textChanged, this, [this] { Txt_Name_Change(); });
    connect(c_.Txt_FileName, &QLineEdit::textChanged, this, changed);
    connect(c_.Txt_Folder, &QLineEdit::textChanged, this, changed);
    connect(c_.Chk_Active, &QCheckBox::stateChanged, this, changed);
    for (OptionButtons* group : {c_.Opt_AdminLocationID, c_.Opt_UserLocationID}) {
        connect(group, &OptionButtons::Clicked, this, quiet([this] {
                    SetChanged();
                    EnableControls();
                }));
    }
    connect(c_.Opt_Download, &OptionButtons::Clicked, this,
            [this](int index) { Opt_Download_Click(index); });
    connect(c_.Opt_Upload, &OptionButtons::Clicked, this,
            [this](int index) { Opt_Upload_Click(index); });
    connect(c_.Opt_MethodID, &OptionButtons::Clicked, this,
            [this](int index) { Opt_MethodID_Click(index); });
    connect(c_.Chk_Zip, &QCheckBox::stateChanged, this, [this] { Chk_Zip_Click(); });
    connect(c_.Cmb_TypeID, &QComboBox::currentIndexChanged, this, [this] { Cmb_TypeID_Click(); });
    connect(c_.Lst_Files, &QListWidget::currentRowChanged, this, [this] { Lst_Files_Click(); });
}

void frm_WebDataClient::Txt_Name_Change() {
    if (flags_.IsLoading) return;
    if (auto* item = c_.Lst_Files->currentItem()) item->setText(c_.Txt_Name->text());
    SetChanged();
}

void frm_WebDataClient::Opt_Download_Click(int index) {
    if (flags_.IsLoading) return;
    SetChanged();
    if (index == kDownloadAlways) c_.Opt_Upload->SetIndex(kUploadNever);
    EnableControls();
}

void frm_WebDataClient::Opt_Upload_Click(int index) {
    if (flags_.IsLoading) return;
    SetChanged();
    if (index == kUploadAlways && c_.Opt_Download->Button(kDownloadAlways)->isChecked())
        c_.Opt_Download->SetIndex(kDownloadNever);
    EnableControls();
}

void frm_WebDataClient::Opt_MethodID_Click(int) {
    if (flags_.IsLoading) return;
    if (c_.Opt_MethodID->Button(kMethodOnlyNewData)->isChecked())
        c_.Chk_Zip->setCheckState(Qt::Unchecked);
    SetChanged();
    EnableControls();
}

void frm_WebDataClient::Chk_Zip_Click() {
    if (flags_.IsLoading) return;
    if (c_.Chk_Zip->checkState() == Qt::Checked &&
        c_.Opt_MethodID->Button(kMethodOnlyNewData)->isChecked())
        c_.Opt_MethodID->SetIndex(kMethodCompleteFile);
    SetChanged();
    EnableControls();
}

void frm_WebDataClient::Cmb_TypeID_Click() {
    if (flags_.IsLoading) return;
    c_.Opt_MethodID->SetIndex(SelectedTypeID() == 0 ? kMethodCompleteFile : kMethodOnlyNewData);
    SetChanged();
    EnableControls();
}

void frm_WebDataClient::Lst_Files_Click() {
    if (flags_.IsLoading) return;
    if (StoreCurrentRecord()) ShowCurrentRecord();
}

} // namespace quorvel
