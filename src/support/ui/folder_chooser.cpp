#include "support/ui/folder_chooser.h"

#include <QDir>
#include <QFileDialog>

#include <utility>

namespace quorvel {

namespace {

FolderDialog& CurrentDialog() {
    static FolderDialog dialog = SystemFolderDialog;
    return dialog;
}

} // namespace

QUrl SystemFolderDialog(QWidget* owner, const QString& prompt, const QString& start) {
    return QFileDialog::getExistingDirectoryUrl(owner, prompt, QUrl::fromLocalFile(start),
                                                QFileDialog::ShowDirsOnly,
                                                {QStringLiteral("file")});
}

bool BrowseForFolder(QWidget* owner, QString& folder, const QString& word) {
    // A backslash in a stored folder is a separator here too.
    QString start = folder.isEmpty() ? QDir::currentPath() : folder;
    start.replace(QLatin1Char('\\'), QLatin1Char('/'));
    const QString prompt = QStringLiteral("Choose ") + word + QStringLiteral(" folder");
    const QUrl chosen = CurrentDialog()(owner, prompt, start);
    if (chosen.isEmpty() || !chosen.isLocalFile()) return false;
    const QString path = chosen.toLocalFile();
    if (path.isEmpty()) return false;
    folder = QDir::toNativeSeparators(QDir::cleanPath(path));
    return true;
}

ScopedFolderDialog::ScopedFolderDialog(FolderDialog dialog)
    : saved_(std::exchange(CurrentDialog(), std::move(dialog))) {}

ScopedFolderDialog::~ScopedFolderDialog() {
    CurrentDialog() = std::move(saved_);
}

} // namespace quorvel
