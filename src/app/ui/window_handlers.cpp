// The handlers of the window's buttons and switches outside the record fields.

#include "app/run/run_engine.h"
#include "app/ui/frm_web_data_client.h"
#include "support/program_home.h"
#include "support/run_at_startup.h"
#include "support/shell_open.h"

#include <QRadioButton>
#include <QShortcut>

namespace quorvel {

void frm_WebDataClient::ConnectWindowHandlers() {
    auto states = [this](auto&&...) {
        if (!flags_.IsLoading) EnableControls();
    };
    connect(c_.Opt_GetFileList, &OptionButtons::Clicked, this, states);
    for (auto* box : c_.chk_ShowDate)
        connect(box, &QCheckBox::stateChanged, this, [this] {
            if (!flags_.IsLoading) RefreshFileStatus();
        });
    connect(c_.Opt_GetLocalFolders, &OptionButtons::Clicked, this, states);
    connect(c_.Chk_Trace, &QCheckBox::stateChanged, this, [this] { Chk_Trace_Click(); });
    connect(c_.Chk_RunAtStartUp, &QCheckBox::stateChanged, this,
            [this] { Chk_RunAtStartUp_Click(); });
    connect(c_.Cmd_ClearFiles, &QPushButton::clicked, this, [this] { Cmd_ClearFiles_Click(); });
    connect(c_.Cmd_Clear, &QPushButton::clicked, c_.Lst_Trace, &QListWidget::clear);
    connect(c_.Cmd_Cancel, &QPushButton::clicked, this, [this] { Cmd_Cancel_Click(); });
    connect(c_.Cmd_Close, &QPushButton::clicked, this, &QWidget::close);
    connect(c_.Cmd_EditFile, &QPushButton::clicked, this, [this] { Cmd_EditFile_Click(); });
    connect(c_.Cmd_LocateFile, &QPushButton::clicked, this, [this] { Cmd_LocateFile_Click(); });
    for (int i = 0; i < 2; ++i)
        connect(c_.Cmd_LocateFolder[i], &QPushButton::clicked, this,
                [this, i] { Cmd_LocateFolder_Click(i); });
    for (int i = 0; i < 5; ++i)
        connect(c_.Cmd_DoFile[i], &QPushButton::clicked, this, [this, i] { DoFile(i); });
    for (int which : {RunEngine::kProcessAll, RunEngine::kProcessFile})
        connect(c_.Cmd_Process[which], &QPushButton::clicked, this,
                [this, which] { Cmd_Process_Click(which); });
    // The Delete key on the list does what the "Delete" button does, when it may.
    auto* remove =
        new QShortcut(QKeySequence::Delete, c_.Lst_Files, nullptr, nullptr, Qt::WidgetShortcut);
    connect(remove, &QShortcut::activated, this, [this] {
        if (c_.Cmd_DoFile[kFileDelete]->isEnabled()) DoFile(kFileDelete);
    });
}

QStringList frm_WebDataClient::StartupArguments() {
    // Started at log-on, the program must find the same settings and list.
    QStringList arguments{QStringLiteral("/S")};
    if (!ProgramHome::IsDefault()) arguments << QStringLiteral("--home") << ProgramHome::Folder();
    return arguments;
}

void frm_WebDataClient::Cmd_Process_Click(int which) {
    if (!Process(which).lockHeld) return;
    flags_.InMessage = true;
    CurrentPrompter().MyMsgBox(
        QStringLiteral("A run is under way elsewhere (another Quorvel working on %1). "
                       "Try again when it has finished.")
            .arg(ProgramHome::Folder()),
        kButtonsOk | kIconExclamation);
}

void frm_WebDataClient::Chk_Trace_Click() {
    ShowStatus(QString());
    EnableControls();
}

void frm_WebDataClient::Chk_RunAtStartUp_Click() {
    SetRunAtStartup(c_.Chk_RunAtStartUp->isChecked() ? 1 : 0, false, StartupArguments());
}

void frm_WebDataClient::Cmd_ClearFiles_Click() {
    {
        // Emptying the list box must not store the fields into a record.
        const bool loading = flags_.IsLoading;
        flags_.IsLoading = true;
        c_.Lst_Files->clear();
        flags_.IsLoading = loading;
    }
    ClearRecordFields();
    EnableControls();
    RefreshFileStatus();
}

void frm_WebDataClient::Cmd_Cancel_Click() {
    engine_->Cancel();
}

void frm_WebDataClient::Cmd_EditFile_Click() {
    const LocationPath local = FullFilename(kOnThisPc);
    if (!local.ok()) {
        ShowError(QStringLiteral("EditFile"), local.refusal);
        return;
    }
    ShellOpenFile(local.path);
}

} // namespace quorvel
