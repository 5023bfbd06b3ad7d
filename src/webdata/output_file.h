#pragma once
// The data file a reply's records are appended to: each record ends with CR LF
// and is written whole; writes are gathered so a large reply costs few calls.

#include <QByteArray>
#include <QByteArrayView>
#include <QFile>
#include <QString>

#include <string>

namespace quorvel {

class OutputFile {
public:
    ~OutputFile();

    bool IsOpen() const { return file_.isOpen(); }
    // Creates the file, or opens it for appending when it exists. A file whose
    // last record lacks its line end gets one first, so the new records never
    // join it. Throws WebDataError when the file cannot be opened.
    // created tells which of the two happened.
    void Open(const QString& path, bool& created);
    // Throws WebDataError when the file cannot be written.
    void WriteLine(QByteArrayView line);
    // Whole lines that already end with CR LF, written as they are.
    void WriteLines(QByteArrayView lines);
    // Writes what is gathered and closes; throws WebDataError on a write failure.
    void Close();

private:
    void Flush();

    QFile file_;
    std::string pending_; // clear() keeps its capacity, so gathering never reallocates
};

} // namespace quorvel
