// Reply processing: the HTTP framing, the service's lines, received records.
#include "webdata/talu_web_data.h"

#include "support/log_file.h"
#include "support/value_rules.h"
#include "webdata/date_texts.h"
#include "webdata/line_dates.h"
#include "webdata/webdata_error.h"

#include <algorithm>
#include <cmath>
#include <cstring>

namespace quorvel {

namespace {

constexpr qint64 kProgressIntervalMs = 50;
// Lines between two looks at the progress clock.
constexpr std::int64_t kProgressStride = 64;

QString Text(QByteArrayView bytes) {
    return QString::fromUtf8(bytes);
}

QString TrimSpaces(const QString& text) {
    qsizetype start = 0;
    qsizetype end = text.size();
    while (start < end && text.at(start) == QLatin1Char(' '))
        ++start;
    while (end > start && text.at(end - 1) == QLatin1Char(' '))
        --end;
    return text.mid(start, end - start);
}

template <std::size_t N> bool StartsWith(QByteArrayView line, const char (&prefix)[N]) {
    return line.size() >= qsizetype(N - 1) && std::memcmp(line.data(), prefix, N - 1) == 0;
}

QByteArrayView WithoutLineEnd(QByteArrayView line) {
    if (line.endsWith('\n')) line.chop(1);
    if (line.endsWith('\r')) line.chop(1);
    return line;
}

bool StartsWithPhp(QByteArrayView line) {
    return line.size() >= 3 && (line[0] | 0x20) == 'p' && (line[1] | 0x20) == 'h' &&
           (line[2] | 0x20) == 'p';
}

} // namespace

ReplyStream::Next CTALUWebData::OnLine(QByteArrayView line) {
    const int stateBefore = httpState_;
    replyEnded_ = false;
    ProcessReply(line);
    if (stateBefore == 1 && httpState_ == 2) return ReplyStream::Next::Body;
    if (replyEnded_) {
        // A body that only the close ends cannot be told from the next reply.
        if (closeAfterReply_ || BodyFraming().kind == ReplyStream::Framing::kUntilClose)
            dropAfterDrain_ = true;
        return ReplyStream::Next::EndOfReply;
    }
    return ReplyStream::Next::Continue;
}

ReplyStream::Framing CTALUWebData::BodyFraming() const {
    if (chunkedBody_) return {ReplyStream::Framing::kChunked, 0};
    if (contentLength_ >= 0) return {ReplyStream::Framing::kLength, contentLength_};
    return {};
}

void CTALUWebData::OnDropped(QByteArrayView bytes) {
    if (Logging(3))
        TraceDebug(QStringLiteral("Dropped ") + QString::number(bytes.size()) +
                   QStringLiteral(" bytes that belong to no reply: ") +
                   Text(bytes.first(std::min<qsizetype>(bytes.size(), 80))));
}

// Plain data lines of a GETDATA body go to the open file in runs, as long as
// nobody asked to see each line.
bool CTALUWebData::TakesLinesInBulk() const {
    return httpState_ == 2 && replyKind_ == kDataLines && output_.IsOpen() && !traceServer_ &&
           !Logging(2) && !Logging(3);
}

qsizetype CTALUWebData::OnLines(QByteArrayView lines) {
    const char* const begin = lines.data();
    const char* const end = begin + lines.size();
    const char* run = begin; // start of the lines not yet written
    const char* p = begin;
    const char* lastLine = nullptr;
    try {
        while (p < end) {
            const qsizetype left = end - p;
            // Lines that need their own look: empty, final, or "php".
            if (p[0] == '\n' || (p[0] == '\r' && left > 1 && p[1] == '\n') ||
                (p[0] == 'O' && left > 1 && p[1] == 'K') ||
                (p[0] == 'N' && left > 2 && p[1] == 'O' && p[2] == 'K') ||
                StartsWithPhp(QByteArrayView(p, std::min<qsizetype>(left, 3))))
                break;
            const char* lf = static_cast<const char*>(std::memchr(p, '\n', std::size_t(left)));
            if (lf[-1] != '\r') {
                // Ended by LF alone: written with CR LF like every record.
                output_.WriteLines(QByteArrayView(run, p - run));
                output_.WriteLine(QByteArrayView(p, lf - p));
                run = lf + 1;
            }
            lastLine = p;
            p = lf + 1;
        }
        output_.WriteLines(QByteArrayView(run, p - run));
        if (lastLine)
            ShowRecordProgress(WithoutLineEnd(QByteArrayView(lastLine, p - lastLine)), true);
    } catch (const WebDataError& e) {
        httpState_ = 0;
        replyKind_ = kNothing;
        ErrorReport(QStringLiteral("ProcessReply"), e.Description());
        return run - begin;
    }
    return p - begin;
}

void CTALUWebData::ProcessReply(QByteArrayView line) {
    try {
        if (Logging(2)) TraceReceived(Text(line));
        if (!ProcessBrowserReplies(line)) return;
        if (Logging(3))
            TraceDebug(QStringLiteral("Processing>") + Text(line) + QStringLiteral("<"));
        const bool ok = StartsWith(line, "OK");
        const bool nok = !ok && StartsWith(line, "NOK");
        const bool final = ok || nok;
        QString message;
        if (ok)
            message = Text(line);
        else if (nok)
            message = Text(line) + QStringLiteral(" (") + lastCommand_ + QStringLiteral(")");
        switch (replyKind_) {
        case kDataLines:
            ProcessDataLine(line, final, ok, message);
            break;
        case kLastDate:
            if (ok) {
                ProcessLastDate(TrimSpaces(Text(line.sliced(2))));
                lastCommand_.clear();
                replyKind_ = kNothing;
            }
            break;
        case kUser:
            ProcessUserFolders(line);
            replyKind_ = kNothing;
            break;
        default:
            break;
        }
        if (!final) return;
        replyStatus_ = ok ? 1 : 2;
        lastError_ = message;
        Q_EMIT Finished(message);
        replyKind_ = kNothing;
        httpState_ = 0;
        RestorePointer();
        replyEnded_ = true;
    } catch (const WebDataError& e) {
        httpState_ = 0;
        replyKind_ = kNothing;
        ErrorReport(QStringLiteral("ProcessReply"), e.Description());
    }
}

bool CTALUWebData::ProcessBrowserReplies(QByteArrayView line) {
    if (StartsWithPhp(line)) return false;
    switch (httpState_) {
    case 0:
        ProcessStatusLine(Text(line));
        return false;
    case 1:
        ProcessHeaderLine(line);
        return false;
    case 2:
        if (!line.isEmpty()) return true;
        TraceDebug(QStringLiteral("HTTP receiving data, but empty line received"));
        return false;
    default:
        ReportAsyncError(QStringLiteral("Unknown HTTPState:") + QString::number(httpState_));
        return false;
    }
}

void CTALUWebData::ProcessStatusLine(const QString& line) {
    const QString state = QString::number(httpState_);
    if (line.isEmpty()) {
        ReportAsyncError(QStringLiteral("Empty line when expecting HTTP header reply HTTPState:") +
                         state);
        return;
    }
    const QStringList words = line.split(QLatin1Char(' '));
    if (words.size() < 2) {
        ReportAsyncError(QStringLiteral("Invalid line when expecting HTTP header reply: ") + line);
        return;
    }
    const double code = RoundHalfEven(ValDouble(words.at(1)));
    const QString codeText = QString::number(code, 'f', 0);
    if (code >= 200 && code <= 300) {
        httpState_ = 1;
        chunkedBody_ = false;
        contentLength_ = -1;
        closeAfterReply_ = words.at(0) == QLatin1String("HTTP/1.0");
        TraceDebug(QStringLiteral("ReplyCode=") + codeText + QStringLiteral(" so Ok HTTPState:") +
                   QString::number(httpState_) + QStringLiteral(" |") + line);
    } else if (code > 300) {
        ReportAsyncError(QStringLiteral("ReplyCode=") + codeText +
                         QStringLiteral(" - error HTTPState:") + state + QStringLiteral(" |") +
                         line);
        ShowStatusText(line);
        RestorePointer();
    } else {
        TraceDebug(QStringLiteral("ReplyCode=") + codeText + QStringLiteral(" - wait HTTPState:") +
                   state + QStringLiteral(" |") + line);
    }
}

void CTALUWebData::ProcessHeaderLine(QByteArrayView line) {
    if (line.isEmpty()) {
        httpState_ = 2;
        TraceDebug(QStringLiteral("Blank line - rest must be data HTTPState:2 |"));
        return;
    }
    if (Logging(3)) TraceDebug(QStringLiteral("Must be HTTP header line:1 |") + Text(line));
    // Only the framing of the body and the fate of the connection matter here.
    const qsizetype colon = line.indexOf(':');
    if (colon < 0) return;
    const QByteArray name = line.first(colon).trimmed().toByteArray().toLower();
    const QByteArray value = line.sliced(colon + 1).trimmed().toByteArray().toLower();
    if (name == "transfer-encoding") {
        chunkedBody_ = value.contains("chunked");
    } else if (name == "content-length") {
        bool ok = false;
        const qint64 length = value.toLongLong(&ok);
        contentLength_ = ok && length >= 0 ? length : -1;
    }
    if (name == "connection" && value.contains("close"))
        closeAfterReply_ = true;
    else if (name == "connection" && value.contains("keep-alive"))
        closeAfterReply_ = false;
}

void CTALUWebData::ProcessDataLine(QByteArrayView line, bool final, bool ok, QString& message) {
    if (traceServer_) {
        ReportAsyncError(QStringLiteral("Should be saving, but TraceServer mode:") + Text(line));
        return;
    }
    if (!final) {
        WriteDataLine(line);
        return;
    }
    if (output_.IsOpen()) {
        // A reply that ends with "NOK" keeps the records it appended, but
        // never replaces a file.
        if (ok)
            output_.Close();
        else
            output_.Abandon();
        TraceDebug(QStringLiteral("Closing file: ") + localFile_);
        ShowStatusText(QStringLiteral("Data in: ") + localFile_);
        RestorePointer();
    } else if (ok) {
        message = QStringLiteral("No new data");
        ShowStatusText(message);
    }
    if (!ok) WriteLogFile(lastCommand_ + QStringLiteral(">") + Text(line));
    lastCommand_.clear();
    replyKind_ = kNothing;
    if (progress_) progress_->Finish();
}

void CTALUWebData::WriteDataLine(QByteArrayView line) {
    if (!output_.IsOpen()) {
        bool created = false;
        // A file without dates is asked for all its records: they replace it.
        output_.Open(localFile_,
                     ReadsDates(dateFormat_) ? OutputFile::Mode::kAppend
                                             : OutputFile::Mode::kReplace,
                     created);
        TraceDebug((created ? QStringLiteral("Open Output file: ")
                            : QStringLiteral("Open append file: ")) +
                   localFile_);
        recordsSinceProgress_ = 0;
        lastProgressMs_ = -1;
        progressClock_.start();
    }
    ShowRecordProgress(line);
    output_.WriteLine(line);
    if (Logging(3))
        TraceDebug(QStringLiteral("Save to: ") + localFile_ + QStringLiteral(">") + Text(line) +
                   QStringLiteral("<"));
}

void CTALUWebData::ShowRecordProgress(QByteArrayView line, bool manyLines) {
    if (!progress_ || !(serverLastDate_ > localLastDate_)) return;
    if (!manyLines && recordsSinceProgress_++ % kProgressStride != 0) return;
    const qint64 now = progressClock_.elapsed();
    if (lastProgressMs_ >= 0 && now - lastProgressMs_ < kProgressIntervalMs) return;
    lastProgressMs_ = now;
    // The date only moves the bar: a line whose date cannot be read counts as
    // 0 and is still saved, without stopping the download for a question.
    DateValue date = 0;
    try {
        const LineDate read = DateOfLine(Text(line), dateFormat_);
        if (read.hasDate) date = read.value;
    } catch (const WebDataError&) {
        date = 0;
    }
    const double percent = (date - localLastDate_) * 100.0 / (serverLastDate_ - localLastDate_);
    const double shown = std::clamp(RoundHalfEven(percent), 0.0, 100.0);
    progress_->Show(static_cast<std::int64_t>(shown), FormatDateLong(date));
}

void CTALUWebData::ProcessLastDate(const QString& value) {
    if (value.startsWith(QLatin1String("NO FILE")) || value == QLatin1String("0"))
        serverLastDate_ = 0;
    else
        serverLastDate_ = DateTimeValue(value);
}

void CTALUWebData::ProcessUserFolders(QByteArrayView line) {
    const QString text = Text(line);
    const QStringList items = text.split(QLatin1Char('|'));
    if (items.size() < 5) {
        TraceDebug(QStringLiteral("Expecting user folders, but data= ") + text);
        return;
    }
    userFolder_ = items.at(0);
    userCurrentFolder_ = items.at(1);
    userFurtherFolder_ = items.at(2);
    userDataFolder_ = items.at(3);
    userName_ = items.at(4);
    TraceDebug(QStringLiteral("UserFolder: ") + userFolder_ +
               QStringLiteral(" UserCurrentFolder: ") + userCurrentFolder_);
}

void CTALUWebData::EndReplyWithError(const QString& message) {
    ReportAsyncError(message);
    CloseOutputFile(false);
    replyStatus_ = 2;
    lastError_ = message;
    Q_EMIT Finished(message);
    replyKind_ = kNothing;
    httpState_ = 0;
    RestorePointer();
    DropConnection();
}

void CTALUWebData::CloseOutputFile(bool complete) {
    try {
        if (complete)
            output_.Close();
        else
            output_.Abandon();
    } catch (const WebDataError& e) {
        ErrorReport(QStringLiteral("ProcessReply"), e.Description());
    }
}

} // namespace quorvel
