#include "app/file_list_format.h"

#include "support/value_rules.h"

#include <algorithm>

namespace quorvel {

namespace {

// Fields in file order, with a flag telling texts from numbers.
enum Field {
    kFileID,
    kActive,
    kName,
    kFileName,
    kTypeID,
    kAdminLocationID,
    kUserLocationID,
    kMethodID,
    kZip,
    kDownload,
    kUpload,
    kFolder,
    kFileDate,
    kSpareNumber,
};

bool IsTextField(int field) {
    return field == kName || field == kFileName || field == kFolder || field == kFileDate;
}

void SetText(FileRecord& record, int field, const QString& value) {
    switch (field) {
    case kName:
        record.Name = value;
        break;
    case kFileName:
        record.FileName = value;
        break;
    case kFolder:
        record.Folder = value;
        break;
    case kFileDate:
        record.FileDate = value;
        break;
    default:
        break;
    }
}

void SetNumber(FileRecord& record, int field, std::int16_t value) {
    switch (field) {
    case kFileID:
        record.FileID = value;
        break;
    case kActive:
        record.Active = value;
        break;
    case kTypeID:
        record.TypeID = value;
        break;
    case kAdminLocationID:
        record.AdminLocationID = value;
        break;
    case kUserLocationID:
        record.UserLocationID = value;
        break;
    case kMethodID:
        record.MethodID = value;
        break;
    case kZip:
        record.Zip = value;
        break;
    case kDownload:
        record.Download = value;
        break;
    case kUpload:
        record.Upload = value;
        break;
    case kSpareNumber:
        record.SpareNumber = value;
        break;
    default:
        break;
    }
}

// A "~" or a line break inside a text would split the record when it is read
// again and shift every later field; they are written as "-" and a blank.
QString FieldText(QString text) {
    for (QChar& c : text) {
        if (c == kListFieldSeparator)
            c = u'-';
        else if (c == u'\r' || c == u'\n')
            c = u' ';
    }
    return text;
}

} // namespace

QString FormatListNumber(std::int32_t value) {
    const QString digits = QString::number(value);
    return value < 0 ? digits + u' ' : u' ' + digits + u' ';
}

QString FormatFileRecordLine(const FileRecord& r) {
    const QStringList fields{
        FormatListNumber(r.FileID),
        QString::number(r.Active),
        FieldText(r.Name),
        FieldText(r.FileName),
        QString::number(r.TypeID),
        QString::number(r.AdminLocationID),
        QString::number(r.UserLocationID),
        QString::number(r.MethodID),
        QString::number(r.Zip),
        QString::number(r.Download),
        QString::number(r.Upload),
        FieldText(r.Folder),
        FieldText(r.FileDate),
        QString::number(r.SpareNumber),
    };
    return fields.join(kListFieldSeparator);
}

namespace {

bool IsBlank(QChar c) {
    return c == u' ' || c == u'\t' || c == u'\n' || c == u'\v' || c == u'\f' || c == u'\r';
}

bool IsDigit(QChar c) {
    return c >= u'0' && c <= u'9';
}

// Moves past a run of digits; how many there were.
qsizetype SkipDigits(QStringView text, qsizetype& i) {
    const qsizetype start = i;
    while (i < text.size() && IsDigit(text[i]))
        ++i;
    return i - start;
}

} // namespace

// One pass over the text, so that a line of any length costs its length.
bool IsNumericText(QStringView text) {
    qsizetype i = 0;
    while (i < text.size() && IsBlank(text[i]))
        ++i;
    if (i < text.size() && (text[i] == u'+' || text[i] == u'-')) ++i;
    const qsizetype whole = SkipDigits(text, i);
    qsizetype fraction = 0;
    if (i < text.size() && text[i] == u'.') {
        ++i;
        fraction = SkipDigits(text, i);
    }
    if (whole == 0 && fraction == 0) return false;
    if (i < text.size() && (text[i] == u'e' || text[i] == u'E')) {
        ++i;
        if (i < text.size() && (text[i] == u'+' || text[i] == u'-')) ++i;
        if (SkipDigits(text, i) == 0) return false;
    }
    while (i < text.size() && IsBlank(text[i]))
        ++i;
    return i == text.size();
}

QString FileField(const QStringList& tokens, int n) {
    return n >= 0 && n < tokens.size() ? tokens.at(n) : QString();
}

std::optional<std::int16_t> FileFieldNumber(const QStringList& tokens, int n) {
    return ToInt16(RoundHalfEven(ValDouble(FileField(tokens, n))));
}

ParsedRecordLine ParseFileRecordLine(const QString& line) {
    ParsedRecordLine parsed;
    const QStringList tokens = line.split(kListFieldSeparator);
    if (tokens.size() < kListMinimumFields || !IsNumericText(tokens.first())) return parsed;
    parsed.kind = ParsedRecordLine::kRecord;
    for (int field = 0; field < kListFieldCount; ++field) {
        if (IsTextField(field)) {
            SetText(parsed.record, field, FileField(tokens, field));
            continue;
        }
        const auto number = FileFieldNumber(tokens, field);
        if (!number) {
            parsed.kind = ParsedRecordLine::kOverflow;
            parsed.failedField = field;
            return parsed;
        }
        SetNumber(parsed.record, field, *number);
    }
    return parsed;
}

std::vector<ByteLine> SplitListLines(const QByteArray& bytes) {
    QByteArrayView view(bytes);
    if (view.startsWith("\xEF\xBB\xBF")) view = view.sliced(3);
    return SplitByteLines(view);
}

QStringList SplitListText(const QByteArray& bytes) {
    QStringList lines;
    for (const ByteLine& line : SplitListLines(bytes))
        lines << DecodeLine(line.text);
    return lines;
}

QByteArray EncodeListLine(const QString& line, bool latin1) {
    if (latin1) {
        const bool fits =
            std::all_of(line.cbegin(), line.cend(), [](QChar c) { return c.unicode() <= 0xFF; });
        if (fits) return line.toLatin1();
    }
    return line.toUtf8();
}

} // namespace quorvel
