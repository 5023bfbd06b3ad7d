#pragma once
// Lets the user pick a local folder, starting at the folder chosen before.

#include <QString>
#include <QUrl>

#include <functional>

class QWidget;

namespace quorvel {

// The dialog itself: owner, prompt and starting folder in, the chosen folder
// out (an empty URL when cancelled).
using FolderDialog =
    std::function<QUrl(QWidget* owner, const QString& prompt, const QString& start)>;

// QFileDialog::getExistingDirectoryUrl limited to local folders.
QUrl SystemFolderDialog(QWidget* owner, const QString& prompt, const QString& start);

// Shows "Choose <word> folder" starting at folder (the current directory when
// empty). True and the chosen path (native separators) in folder when the user
// chose a local folder; false and folder unchanged when cancelled or when the
// choice has no local path.
bool BrowseForFolder(QWidget* owner, QString& folder, const QString& word);

// Replaces the dialog BrowseForFolder opens for its lifetime (tests, scripted use).
class ScopedFolderDialog {
public:
    explicit ScopedFolderDialog(FolderDialog dialog);
    ~ScopedFolderDialog();
    ScopedFolderDialog(const ScopedFolderDialog&) = delete;
    ScopedFolderDialog& operator=(const ScopedFolderDialog&) = delete;

private:
    FolderDialog saved_;
};

} // namespace quorvel
