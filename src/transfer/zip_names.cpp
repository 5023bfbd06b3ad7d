#include "transfer/zip_codes.h"

#include <algorithm>
#include <map>

namespace quorvel {

namespace {
const std::map<int, const char*>& Messages() {
    static const std::map<int, const char*> messages = {
        {10, "Warning general"},
        {30, "No zip file"},
        {40, "Some files were skipped"},
        {50, "Zip file empty"},
        {100, "Could not find the ZIP file"},
        {110, "ZIP file is corrupted - try using the Fix option"},
        {120, "Ran out of memory"},
        {130, "Invalid property settings"},
        {140, "Nothing to do"},
        {150, "Full disk was inserted instead of an empty one"},
        {160, "ZIP file is corrupted - try using the Fix option"},
        {180, "Another application is currently performing a similar task. Wait until the "
              "other application has completed its operation."},
        {190, "Process abandoned"},
        {200, "Test failed - errors in zip file"},
        {210, "No files ended up being tested in the archive"},
        {240, "DLL not found"},
        {280, "Problem with the temporary file"},
        {290, "Problem reading from file"},
        {300, "Problem writing to file"},
        {310, "Problem creating file"},
        {350, "Attempt to remove parent directory"},
        {370, "Names repeated in archive after discarding pathnames"},
        {380, "Could not update the Zip archive date - file only contains directories or is "
              "empty."},
        {400, "Read/Write error with the Zip file or one of the files to process"},
        {410, "Cannot work on multiple-disk archives when not in Multidisk mode"},
        {420, "Wrong disk was inserted too many times"},
        {430, "Operation not supported for Multidisk Zip archives"},
        {440, "Could not open the self-extractor binary"},
        {450, "Could not open the self-extractor configuration file"},
        {460, "Invalid command parameter passed to an Xceed Zip event"},
        {470, "Not enough space on first disk to write self-extractor"},
        {490, "Invalid self-extractor binary version"},
        {510, "Problem creating destination directory"},
        {520, "An entry of the ZIP file would be written outside its folder - nothing extracted"},
        {530, "Not enough free space for the files of the ZIP file - nothing extracted"},
    };
    return messages;
}
} // namespace

QString ZipFileName(const QString& name) {
    // The zip goes beside the data file, so the folder must stay the same.
    const qsizetype cut =
        std::max(name.lastIndexOf(QLatin1Char('\\')), name.lastIndexOf(QLatin1Char('/'))) + 1;
    QString fileName = name.mid(cut);
    fileName.replace(QLatin1Char('*'), QStringLiteral("AllFiles"));
    fileName.replace(QLatin1Char('.'), QLatin1Char('_'));
    return name.left(cut) + fileName + QStringLiteral(".zip");
}

bool IsZipError(int code) {
    return code >= 100 && code != kZipNothingToDo;
}

QString ZipErrorText(int code, const QString& word) {
    const auto found = Messages().find(code);
    const QString message =
        found != Messages().end()
            ? QString::fromUtf8(found->second)
            : QStringLiteral("Error ") + QString::number(code) + QStringLiteral(" occured");
    return word + QLatin1Char(':') + message;
}

} // namespace quorvel
