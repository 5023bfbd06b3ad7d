// Login and account configuration from the window: "Login", the two "Get"
// buttons and the account steps of start-up. The steps themselves are the
// core's (AccountLogin); here the fields go in and come back out.

#include "app/account_login.h"
#include "app/app_services.h"
#include "app/run/run_engine.h"
#include "app/ui/frm_web_data_client.h"

namespace quorvel {

void frm_WebDataClient::ConnectLoginHandlers() {
    connect(c_.Cmd_Login, &QPushButton::clicked, this, [this] { Cmd_Login_Click(); });
    connect(c_.Cmd_GetCFG, &QPushButton::clicked, this, [this] { Cmd_GetCFG_Click(); });
    connect(c_.Cmd_GetFileList, &QPushButton::clicked, this, [this] { Cmd_GetFileList_Click(); });
}

AccountFields frm_WebDataClient::AccountFieldsShown() const {
    AccountFields f;
    f.cfgUrl = c_.Txt_CFG_URL->text();
    f.userId = c_.Txt_UserID->text();
    f.password = c_.Txt_Password->text();
    f.ftpServer = c_.Txt_ftpServer->text();
    f.ftpUserId = c_.txt_ftpUserID->text();
    f.ftpPassword = c_.Txt_ftpPassword->text();
    f.httpServer = c_.Txt_httpServer->text();
    f.webFolder = c_.Txt_WebFolder->text();
    f.gotSecure = c_.Chk_GotSecure->isChecked();
    f.gotPHP = c_.Chk_GotPHP->isChecked();
    f.gotFileList = c_.Chk_GotFileList->isChecked();
    f.userName = c_.Lbl_UserName->text();
    f.userFolderOnSite = c_.Lbl_UserFolder->text();
    f.userFolder = c_.Txt_UserFolder->text();
    f.userCurrentFolder = c_.Txt_UserCurrentFolder->text();
    f.applicationFolder = c_.Txt_LocalFolder[0]->text();
    f.dataFolder = c_.Txt_LocalFolder[1]->text();
    f.foldersFromAdministrator = c_.Opt_GetLocalFolders->SelectedIndex() == 1;
    return f;
}

void frm_WebDataClient::ShowAccountFields(const AccountFields& f) {
    const auto set = [](QLineEdit* edit, const QString& text) {
        if (edit->text() != text) edit->setText(text);
    };
    set(c_.Txt_ftpServer, f.ftpServer);
    set(c_.txt_ftpUserID, f.ftpUserId);
    set(c_.Txt_ftpPassword, f.ftpPassword);
    set(c_.Txt_httpServer, f.httpServer);
    set(c_.Txt_WebFolder, f.webFolder);
    c_.Chk_GotSecure->setChecked(f.gotSecure);
    c_.Chk_GotPHP->setChecked(f.gotPHP);
    c_.Chk_GotFileList->setChecked(f.gotFileList);
    c_.Lbl_UserName->setText(f.userName);
    c_.Lbl_UserFolder->setText(f.userFolderOnSite);
    set(c_.Txt_UserFolder, f.userFolder);
    set(c_.Txt_UserCurrentFolder, f.userCurrentFolder);
    set(c_.Txt_LocalFolder[1], f.dataFolder);
}

bool frm_WebDataClient::GetSecureFTPDetails() {
    AccountFields f = AccountFieldsShown();
    AccountLogin login(*services_, *this);
    const bool ok = login.GetSecureFTPDetails(f);
    ShowAccountFields(f);
    if (!ok && !login.LastError().isEmpty()) ShowStatus(login.LastError());
    return ok;
}

bool frm_WebDataClient::GetUserDetails() {
    AccountFields f = AccountFieldsShown();
    AccountLogin login(*services_, *this);
    const bool ok = login.GetUserDetails(f, FieldAccount());
    ShowAccountFields(f);
    EnableControls();
    return ok;
}

bool frm_WebDataClient::GetFileListFromServer() {
    AccountFields f = AccountFieldsShown();
    if (f.gotFileList) return true;
    AccountLogin login(*services_, *this);
    // The fields no longer belong to a record once the list is replaced.
    const int shown = currentRecord_;
    currentRecord_ = 0;
    const bool ok = login.GetFileListFromServer(f, FieldAccount(), files_);
    ShowAccountFields(f);
    if (!ok) {
        currentRecord_ = shown;
        return false;
    }
    for (const AppError& error : login.LoadErrors())
        ShowError(error);
    LoadFilesListBox();
    SetLoadedFile(files_.LoadedFile);
    AddToRecentFiles(files_.LoadedFile);
    EnableControls();
    RefreshFileStatus();
    return true;
}

bool frm_WebDataClient::AccountSteps(bool& listFromService) {
    listFromService = false;
    if (!GetSecureFTPDetails()) return false;
    if (!GetUserDetails()) return false;
    if (c_.Opt_GetLocalFolders->SelectedIndex() != 1) return true;
    listFromService = true;
    return GetFileListFromServer();
}

// A run walks the list and reads the account fields: neither changes under it.
void frm_WebDataClient::Cmd_Login_Click() {
    if (engine_->IsBusy()) return;
    for (QCheckBox* box : {c_.Chk_GotPHP, c_.Chk_GotSecure, c_.Chk_GotFileList})
        box->setChecked(false);
    flags_.InMessage = true;
    if (!GetSecureFTPDetails()) {
        CurrentPrompter().SystemMsgBox(QStringLiteral("Could not get details from: ") +
                                           c_.Txt_CFG_URL->text(),
                                       kButtonsOk | kIconExclamation);
        return;
    }
    if (!GetUserDetails()) {
        CurrentPrompter().SystemMsgBox(QStringLiteral("Login failed"),
                                       kButtonsOk | kIconExclamation);
        return;
    }
    if (c_.Opt_GetLocalFolders->SelectedIndex() == 1) GetFileListFromServer();
    CurrentPrompter().SystemMsgBox(
        c_.Lbl_UserName->text() + QStringLiteral(" - welcome to Quorvel"), kButtonsOk);
}

void frm_WebDataClient::Cmd_GetCFG_Click() {
    c_.Chk_GotSecure->setChecked(false);
    GetSecureFTPDetails();
}

void frm_WebDataClient::Cmd_GetFileList_Click() {
    if (engine_->IsBusy()) return;
    GetFileListFromServer();
}

} // namespace quorvel
