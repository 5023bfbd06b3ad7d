#include "app/locations.h"

#include "app/file_record.h"
#include "support/files.h"
#include "support/paths.h"

#include <QRegularExpression>

namespace quorvel {

namespace {

// The part of a location's folder below its base folder.
QString RelativePart(const LocationFolders& folders, int locationId) {
    switch (locationId) {
    case kLocationUser:
        return folders.user;
    case kLocationUserCurrent:
        return AddTrailingSlash(folders.user) + folders.userCurrent;
    case kLocationOther:
        return folders.other;
    default:
        return {};
    }
}

// The service gives the user folder as "/ann": joined to a folder it must
// not make "DATA//ann", which names the same folder but no longer compares
// equal to it (a file dropped from there would not find its location).
QString Join(const QString& base, const QString& relative) {
    if (relative.isEmpty()) return base;
    const QString folder = AddTrailingSlash(base);
    if (!folder.isEmpty() && IsSeparator(folder.back()) && IsSeparator(relative.front()))
        return folder + relative.mid(1);
    return folder + relative;
}

QString ForSide(const QString& path, int which) {
    return which == kAtService ? QString(path).replace(u'\\', u'/') : ToNativeSeparators(path);
}

// The location whose folder a side's path uses.
int LocationUsed(int userLocationId, int adminLocationId, bool userFoldersOnly, int which) {
    if (which == kOnThisPc) return userLocationId;
    if (!userFoldersOnly) return adminLocationId;
    return adminLocationId == kLocationUserCurrent ? kLocationUserCurrent : kLocationUser;
}

QString Refusal(const QString& what, const QString& text) {
    return QStringLiteral("The %1 \"%2\" leads out of its folder with \"..\"").arg(what, text);
}

} // namespace

QString GetLocationFolder(const LocationFolders& folders, int locationId, int which) {
    const QString relative = RelativePart(folders, locationId);
    if (which == kAtService) return Join(folders.web, relative).replace(u'\\', u'/');
    if (locationId == kLocationApplication) {
        return ToNativeSeparators(Join(folders.application, relative));
    }
    if (locationId == kLocationOther && IsFullPath(folders.other)) {
        return ToNativeSeparators(folders.other);
    }
    return ToNativeSeparators(Join(folders.data, relative));
}

bool ClimbsOutOfFolder(const QString& relativePath) {
    static const QRegularExpression separators(QStringLiteral("[\\\\/]"));
    int depth = 0;
    for (const QString& part : relativePath.split(separators, Qt::SkipEmptyParts)) {
        if (part == QStringLiteral("..")) {
            if (--depth < 0) return true;
        } else if (part != QStringLiteral(".")) {
            ++depth;
        }
    }
    return false;
}

LocationPath ProcessFilename(const LocationFolders& folders, const QString& fileName,
                             int userLocationId, int adminLocationId, bool userFoldersOnly,
                             int which) {
    const int side = which == kOnThisPc ? kOnThisPc : kAtService;
    const int id = LocationUsed(userLocationId, adminLocationId, userFoldersOnly, side);
    if (ClimbsOutOfFolder(fileName)) return {{}, Refusal(QStringLiteral("file name"), fileName)};
    const bool otherIsRelative = side == kAtService || !IsFullPath(folders.other);
    if (id == kLocationOther && otherIsRelative && ClimbsOutOfFolder(folders.other)) {
        return {{}, Refusal(QStringLiteral("folder"), folders.other)};
    }
    const QString folder = GetLocationFolder(folders, id, side);
    return {ForSide(AddTrailingSlash(folder) + fileName, side), {}};
}

AnalysedFilename AnalyseFilename(const LocationFolders& folders, const QString& path) {
    AnalysedFilename result;
    result.name = GetFileName(path);
    const QString dir = ToNativeSeparators(GetPath(path));
    for (int id = kLocationUserCurrent; id >= kLocationApplication; --id) {
        if (GetLocationFolder(folders, id, kOnThisPc).compare(dir, Qt::CaseInsensitive) == 0) {
            result.locationId = id;
            return result;
        }
    }
    result.locationId = kLocationOther;
    result.folder = dir;
    return result;
}

bool CheckDataFolders(const LocationFolders& folders) {
    return CheckLocalFolders(folders.application) && CheckLocalFolders(folders.data);
}

bool CheckUserFolders(const LocationFolders& folders) {
    return CheckLocalFolders(GetLocationFolder(folders, kLocationUser, kOnThisPc)) &&
           CheckLocalFolders(GetLocationFolder(folders, kLocationUserCurrent, kOnThisPc));
}

} // namespace quorvel
