// Picking files and folders: dialogs and drag and drop from the file manager.

#include "app/ui/frm_web_data_client.h"

#include "support/paths.h"
#include "support/ui/folder_chooser.h"
#include <QDir>

#include <QDragEnterEvent>
#include <QDropEvent>
#include <QMimeData>
#include <QUrl>

namespace quorvel {

namespace {

// The local files a drag carries, in the order given; none for other data.
QStringList DroppedFiles(const QMimeData* data) {
    QStringList files;
    if (data == nullptr || !data->hasUrls()) return files;
    for (const QUrl& url : data->urls())
        if (url.isLocalFile()) files << QDir::toNativeSeparators(url.toLocalFile());
    return files;
}

} // namespace

void frm_WebDataClient::SaveFileName(const QString& path) {
    const AnalysedFilename found = AnalyseFilename(Folders(), path);
    c_.Txt_FileName->setText(found.name);
    c_.Txt_Folder->setText(found.folder);
    c_.Opt_UserLocationID->SetIndex(found.locationId);
}

void frm_WebDataClient::Cmd_LocateFile_Click() {
    const LocationPath local = FullFilename(kOnThisPc);
    const QString chosen = dialogs_.openFile(
        this, QStringLiteral("Locate data file on your PC"),
        local.ok() ? local.path : c_.Txt_FileName->text(),
        QStringLiteral("Data files (*.dat *.txt *.csv);;Data files (*.dat);;Text files (*.txt);;"
                       "CSV files (*.csv);;All Files (*)"));
    if (!chosen.isEmpty()) SaveFileName(QDir::toNativeSeparators(chosen));
}

void frm_WebDataClient::Cmd_LocateFolder_Click(int index) {
    QString folder = c_.Txt_LocalFolder[index]->text();
    if (BrowseForFolder(this, folder, c_.Txt_LocalFolder[index]->property("tag").toString()))
        c_.Txt_LocalFolder[index]->setText(folder);
}

bool frm_WebDataClient::AcceptsListDrop(const QMimeData* data) const {
    return !DroppedFiles(data).isEmpty();
}

bool frm_WebDataClient::AcceptsFileNameDrop(const QMimeData* data) const {
    return !DroppedFiles(data).isEmpty() && SelectedRow() >= 0;
}

void frm_WebDataClient::DropOnList(const QMimeData* data) {
    for (const QString& file : DroppedFiles(data))
        AddNewFileRecord(file);
}

void frm_WebDataClient::DropOnFileName(const QMimeData* data) {
    const QStringList files = DroppedFiles(data);
    if (!files.isEmpty() && AcceptsFileNameDrop(data)) SaveFileName(files.first());
}

void frm_WebDataClient::InstallDropTargets() {
    c_.Lst_Files->setAcceptDrops(true);
    c_.Lst_Files->viewport()->setAcceptDrops(true);
    c_.Lst_Files->viewport()->installEventFilter(this);
    c_.Txt_FileName->setAcceptDrops(true);
    c_.Txt_FileName->installEventFilter(this);
}

bool frm_WebDataClient::eventFilter(QObject* watched, QEvent* event) {
    const bool onList = watched == c_.Lst_Files->viewport();
    const bool onName = watched == c_.Txt_FileName;
    if (watched == c_.Frame_UserLocationID &&
        (event->type() == QEvent::Resize || event->type() == QEvent::Show))
        PlotRouteLines();
    if (!onList && !onName) return QMainWindow::eventFilter(watched, event);
    switch (event->type()) {
    case QEvent::DragEnter:
    case QEvent::DragMove: {
        auto* drag = static_cast<QDragMoveEvent*>(event);
        const bool ok =
            onList ? AcceptsListDrop(drag->mimeData()) : AcceptsFileNameDrop(drag->mimeData());
        if (ok) {
            drag->setDropAction(Qt::CopyAction);
            drag->accept();
        } else {
            drag->ignore();
        }
        return true;
    }
    case QEvent::Drop: {
        auto* drop = static_cast<QDropEvent*>(event);
        if (onList)
            DropOnList(drop->mimeData());
        else
            DropOnFileName(drop->mimeData());
        drop->acceptProposedAction();
        return true;
    }
    default:
        return QMainWindow::eventFilter(watched, event);
    }
}

} // namespace quorvel
