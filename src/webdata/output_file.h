#pragma once
// The data file a GETDATA reply's records go to. Each record ends with CR LF
// and is written whole; writes are gathered so a large reply costs few calls.
//
// Appending (a file with dates): whatever ends the reply early, the file ends
// at the end of the last whole record written. A failed write is cut back at
// once; a killed process leaves a note (append_note.h) from which the next run
// cuts the torn tail.
//
// Replacing (a file without dates, whose reply holds all its records): the
// records go to a file aside that takes the old one's place only when the
// reply ends with its final line; an early end leaves the old file as it was.

#include <QByteArray>
#include <QByteArrayView>
#include <QString>

#include <memory>
#include <string>

class QFile;

namespace quorvel {

class ReplacingFile;

class OutputFile {
public:
    enum class Mode { kAppend, kReplace };

    OutputFile();
    ~OutputFile();

    bool IsOpen() const { return append_ || replace_; }
    QString Path() const { return path_; }
    // Opens for appending (creating the file when it does not exist) or for
    // replacing. A file whose last record lacks its line end gets one first,
    // so the new records never join it. created tells whether the file is
    // new. Throws WebDataError when the file cannot be opened.
    void Open(const QString& path, Mode mode, bool& created);
    // One record, without its line end. Throws WebDataError when the file
    // cannot be written; the file is then cut back and closed.
    void WriteLine(QByteArrayView line);
    // Whole records that already end with CR LF, written as they are.
    void WriteLines(QByteArrayView lines);
    // The reply ended with its final line: writes what is gathered and
    // closes; a replacing file takes the old one's place. Throws WebDataError.
    void Close();
    // The reply ended early: appended whole records stay, a replacing file is
    // discarded. Throws WebDataError when the last records cannot be written.
    void Abandon();

private:
    void Write(const char* bytes, qint64 size);
    void Flush();
    [[noreturn]] void Fail();
    void Finish();

    QString path_;
    std::unique_ptr<QFile> append_;          // while appending
    std::unique_ptr<ReplacingFile> replace_; // while replacing
    qint64 whole_ = 0;    // length of the appended file up to its last whole record
    bool noted_ = false;  // an append note was written
    std::string pending_; // clear() keeps its capacity, so gathering never reallocates
};

} // namespace quorvel
