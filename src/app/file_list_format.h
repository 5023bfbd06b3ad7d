#pragma once
// The text format of a list file: one record per line, fields separated by "~"
// in FileRecord's order, no quoting; lines end with CR LF when written and at
// CR LF, LF or CR when read. Each line is UTF-8 where it is valid UTF-8, else
// Latin-1, and is written back in the encoding it was read in.

#include "app/file_record.h"
#include "support/text_lines.h"

#include <QByteArray>
#include <QString>
#include <QStringList>
#include <QStringView>

#include <cstdint>

namespace quorvel {

inline constexpr QChar kListFieldSeparator = u'~';
inline constexpr int kListFieldCount = 14;
// A line with fewer fields than this is no record line.
inline constexpr int kListMinimumFields = 6;
// Longer lines are not read: no record comes near it, and it bounds the memory
// and time that one line of a hostile file can cost.
inline constexpr qsizetype kMaxListLineBytes = 1 << 20;

// The way the identifier is written: a blank (or the minus sign), the digits and
// one trailing blank: " 12 ", "-5 ".
QString FormatListNumber(std::int32_t value);

// One record as a line, without the line end. FileDateLocal is not written; a
// "~" or line break inside a text is written as "-" or a blank.
QString FormatFileRecordLine(const FileRecord& record);

// True when the whole text (blanks around it allowed) is a decimal number,
// with an optional fraction and exponent.
bool IsNumericText(QStringView text);

// Token n of a split line, empty when the line has fewer tokens.
QString FileField(const QStringList& tokens, int n);
// The leading number of token n rounded (halves to even) to 16 bits; nullopt on overflow.
std::optional<std::int16_t> FileFieldNumber(const QStringList& tokens, int n);

struct ParsedRecordLine {
    enum Kind { kNotRecord, kRecord, kOverflow };
    Kind kind = kNotRecord;
    // For kOverflow: the fields read before the overflowing one; the rest stay empty or 0.
    FileRecord record;
    int failedField = -1;
};

// Comment and header lines (too few fields, or a first field that is no number)
// give kNotRecord.
ParsedRecordLine ParseFileRecordLine(const QString& line);

// A list file's bytes as lines (split at CR LF, LF or CR; a leading byte-order
// mark is dropped).
std::vector<ByteLine> SplitListLines(const QByteArray& bytes);
// The same lines decoded one by one: UTF-8 where valid, else Latin-1.
QStringList SplitListText(const QByteArray& bytes);
// A line's bytes: Latin-1 when it was read as Latin-1 and still fits, else UTF-8.
QByteArray EncodeListLine(const QString& line, bool latin1);

} // namespace quorvel
