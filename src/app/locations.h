#pragma once
// Location IDs and the folders they stand for on this PC and at the service;
// the full paths of a record's file; turning a chosen path back into a
// location and a file name.
//
// Local results use the native separator (a "\" from a list file is read as a
// separator); service results always use "/".

#include <QString>

#include <cstdint>

namespace quorvel {

enum PathSide : std::int16_t { kOnThisPc = 0, kAtService = 1 };

// The folder fields of the main window.
struct LocationFolders {
    QString application; // application folder
    QString data;        // data folder
    QString user;        // the user's folder, relative to the data folder (and web folder)
    QString userCurrent; // the user's season folder, relative to the user folder
    QString web;         // the base folder at the service
    QString other;       // the current record's folder for kLocationOther
};

// The folder of a location on this PC (kOnThisPc) or at the service (kAtService).
// No folder is checked for existence.
QString GetLocationFolder(const LocationFolders& folders, int locationId, int which);

// The full path of a record's file, or a refusal when its file name (or its
// relative "Other" folder) climbs out of its location with "..".
struct LocationPath {
    QString path;
    QString refusal; // empty when path is usable

    bool ok() const { return refusal.isEmpty(); }
};

// which kOnThisPc: the file under the user location; kAtService: under the admin
// location, or only the user or user season folder when userFoldersOnly is set.
LocationPath ProcessFilename(const LocationFolders& folders, const QString& fileName,
                             int userLocationId, int adminLocationId, bool userFoldersOnly,
                             int which);

// True when a relative path steps above its starting folder with ".." components.
bool ClimbsOutOfFolder(const QString& relativePath);

struct AnalysedFilename {
    QString name;       // the part after the last separator
    int locationId = 4; // the most specific location whose folder holds the file
    QString folder;     // the file's folder for kLocationOther, else empty
};

// Which location holds a full path; the folders compare without regard to case.
AnalysedFilename AnalyseFilename(const LocationFolders& folders, const QString& path);

// The application and data folders exist or could be made (the data folder is
// not tried when the application folder fails).
bool CheckDataFolders(const LocationFolders& folders);
// The same for the user folder and then the user season folder.
bool CheckUserFolders(const LocationFolders& folders);

} // namespace quorvel
