#include "app/run/directory_listing.h"

#include "support/paths.h"
#include "support/texts.h"

#include <QDir>
#include <QFileInfo>
#include <QSaveFile>

namespace quorvel {

namespace {

constexpr int kIndentStep = 4;
constexpr int kNameWidth = 20;
constexpr int kSizeWidth = 10;
constexpr int kTimeWidth = 22;
const QString kSectionEnd = QStringLiteral(" ===========");
const QString kLineEnd = QStringLiteral("\r\n");

bool StartsWithFolder(const QString& longer, const QString& shorter) {
    return longer.size() > shorter.size() && longer.startsWith(shorter, Qt::CaseInsensitive);
}

// Builds the listing in memory: a file being written in a listed folder would
// otherwise show up in its own listing.
class ListingText {
public:
    void Line(const QString& text) { text_ += (text + kLineEnd).toUtf8(); }

    void Directory(const QString& folder, int depth) {
        Line(ListingFolderLine(depth, folder));
        const QDir dir(folder);
        const QString parent = AddTrailingSlash(folder);
        for (const QFileInfo& sub :
             dir.entryInfoList(QDir::Dirs | QDir::NoDotAndDotDot, QDir::Name)) {
            if (sub.isSymLink())
                Line(ListingLinkLine(depth + 1, parent + sub.fileName(), sub.symLinkTarget()));
            else
                Directory(parent + sub.fileName(), depth + 1);
        }
        for (const QFileInfo& file : dir.entryInfoList(QDir::Files, QDir::Name))
            Line(ListingFileLine(depth, file.fileName(), file.size(),
                                 FromQDateTime(file.lastModified())));
    }

    const QByteArray& Bytes() const { return text_; }

private:
    QByteArray text_;
};

} // namespace

QString ListingFolderLine(int depth, const QString& path) {
    return QString(kIndentStep * depth, u'=') + path + kSectionEnd;
}

QString ListingLinkLine(int depth, const QString& path, const QString& target) {
    return ListingFolderLine(depth, path) + QStringLiteral(" link to ") + target +
           QStringLiteral(", not entered");
}

QString ListingFileLine(int depth, const QString& name, std::int64_t size, DateValue modified) {
    return QString(kIndentStep * depth, u' ') + AlignLeft(name, kNameWidth) +
           AlignRight(FormatThousands(static_cast<double>(size)), kSizeWidth) +
           AlignRight(FormatDate(modified, QString::fromLatin1(kPatternLong)), kTimeWidth);
}

QStringList ListingTrees(const QString& application, const QString& data) {
    if (application.compare(data, Qt::CaseInsensitive) == 0) return {application};
    if (StartsWithFolder(application, data)) return {data};
    if (StartsWithFolder(data, application)) return {application};
    return {application, data};
}

std::optional<AppError> GenerateAllFiles(const QString& output, const LocationFolders& folders,
                                         DateValue now) {
    ListingText listing;
    listing.Line(QStringLiteral("Date: ") + FormatDate(now, QString::fromLatin1(kPatternLong)));
    listing.Line(QStringLiteral("Application folder: ") + folders.application);
    listing.Line(QStringLiteral("Data folder: ") + folders.data);
    listing.Line(QStringLiteral("User folder: ") + folders.user);
    listing.Line(QStringLiteral("User current folder: ") + folders.userCurrent);
    for (const QString& tree : ListingTrees(folders.application, folders.data))
        listing.Directory(tree, 0);
    QSaveFile file(output);
    if (!file.open(QIODevice::WriteOnly) || file.write(listing.Bytes()) != listing.Bytes().size() ||
        !file.commit())
        return AppError{file.errorString(), QStringLiteral("GenerateAllFiles")};
    return std::nullopt;
}

} // namespace quorvel
