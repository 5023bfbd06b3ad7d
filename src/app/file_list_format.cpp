#include "app/file_list_format.h"

#include "support/value_rules.h"

#include <QRegularExpression>
#include <QStringConverter>
#include <QStringDecoder>

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

bool IsNumericText(QStringView text) {
    static const QRegularExpression number(
        QStringLiteral(R"(^\s*[+-]?(\d+\.?\d*|\.\d+)([eE][+-]?\d+)?\s*$)"));
    return number.match(text.toString()).hasMatch();
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

QStringList SplitListText(const QByteArray& bytes) {
    QByteArrayView view(bytes);
    if (view.startsWith("\xEF\xBB\xBF")) view = view.sliced(3);
    QStringDecoder utf8(QStringConverter::Utf8, QStringConverter::Flag::Stateless);
    QString text = utf8.decode(view);
    if (utf8.hasError()) text = QString::fromLatin1(view);
    static const QRegularExpression lineEnd(QStringLiteral("\r\n|\r|\n"));
    QStringList lines = text.split(lineEnd);
    // The line end after the last line opens no further line.
    if (!lines.isEmpty() && lines.last().isEmpty()) lines.removeLast();
    return lines;
}

} // namespace quorvel
