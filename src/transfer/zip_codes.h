#pragma once
// Zip packaging: result codes and the rules that go with them.
//
// Intended use (the processing engine):
//   before an upload of a zipped record:  ZipForUpload(local, progress) zips the
//     file or pattern into ZipFileName(local); on IsZipError(code) the status is
//     ZipUploadErrorText(...), else both names become their ZipFileName forms
//   after a download of a zipped record:  UnzipAfterDownload(localZip, progress);
//     on IsZipError(code) the status is ZipErrorText(code, "UnZip")
// Codes below 100 are success or a warning, 140 means nothing to do, every
// other code from 100 up is an error.

#include <QString>

namespace quorvel {

enum ZipCode : int {
    kZipOk = 0,
    kZipWarningGeneral = 10,
    kZipNoZipFile = 30,
    kZipFilesSkipped = 40,
    kZipEmpty = 50,
    kZipNotFound = 100,
    kZipCorrupt = 110,
    kZipOutOfMemory = 120,
    kZipInvalidSettings = 130,
    kZipNothingToDo = 140,
    kZipCorruptEntry = 160,
    kZipAbandoned = 190,
    kZipTestFailed = 200,
    kZipTempFileProblem = 280,
    kZipReadProblem = 290,
    kZipWriteProblem = 300,
    kZipCreateProblem = 310,
    kZipNamesRepeated = 370,
    kZipReadWriteProblem = 400,
    kZipFolderProblem = 510,
    kZipUnsafeEntry = 520,
    kZipNoRoom = 530,
};

// In the file-name part, "*" becomes "AllFiles" and every "." becomes "_";
// then ".zip" is appended: data.csv gives data_csv.zip, and the folder stays as
// it is (/home/first.last/site1.dat gives /home/first.last/site1_dat.zip).
QString ZipFileName(const QString& name);
bool IsZipError(int code);
// word + ":" + the code's message; "Error <code> occured" for unknown codes.
QString ZipErrorText(int code, const QString& word);

} // namespace quorvel
