// The whole reply handling of the web-data object, through a socket stand-in:
// a GETDATA reply of any bytes, arriving whole or in any pieces, leaves the
// same data file, and that file always begins with what it held before.
#include "fuzz_input.h"
#include "support/ports.h"
#include "support/program_home.h"
#include "webdata/line_dates.h"
#include "webdata/socket_control.h"
#include "webdata/talu_web_data.h"

#include <QCoreApplication>
#include <QFile>
#include <QTemporaryDir>
#include <QTimer>

#include <cstdlib>

namespace {

using namespace quorvel;

// Answers GETLASTDATE at once and GETDATA with the given pieces, each in an
// event of its own, then closes.
class StandInSocket : public SocketControl {
public:
    QList<QByteArray> dataReply;

    int State() const override { return state_; }
    void Close() override {
        state_ = kSocketClosed;
        incoming_.clear();
        ++generation_;
    }
    void SetRemotePort(int) override {}
    void SetRemoteHost(const QString&) override {}
    void Connect() override { state_ = kSocketConnected; }
    bool SendData(const QByteArray& bytes) override {
        if (state_ != kSocketConnected) return false;
        request_ += bytes;
        if (!request_.endsWith("\r\n\r\n")) return true;
        if (request_.contains("cmd=GETLASTDATE"))
            Deliver({"HTTP/1.1 200 OK\r\nContent-Length: 15\r\n\r\nOK 2006-05-03\r\n"}, false);
        else
            Deliver(dataReply, true);
        request_.clear();
        return true;
    }
    QByteArray GetData() override { return std::exchange(incoming_, QByteArray()); }
    void Accept(std::int32_t) override {}

private:
    void Deliver(const QList<QByteArray>& pieces, bool close) {
        const int generation = generation_;
        for (const QByteArray& piece : pieces)
            QTimer::singleShot(0, this, [this, piece, generation] {
                if (generation != generation_) return;
                incoming_ += piece;
                Q_EMIT DataArrived(0, piece.size());
            });
        if (close)
            QTimer::singleShot(0, this, [this, generation] {
                if (generation != generation_ || state_ != kSocketConnected) return;
                state_ = kSocketPeerClosing;
                Q_EMIT Closed(0);
            });
    }

    int state_ = kSocketClosed;
    int generation_ = 0;
    QByteArray request_, incoming_;
};

class NoPrompts : public Prompter {
public:
    int MyMsgBox(const QString&, int buttons) override { return DefaultAnswer(buttons); }
    int SystemMsgBox(const QString&, int) override { return kAnswerNo; }
};

QTemporaryDir* home = nullptr;
const QByteArray kBefore = "2006-05-01 10:00:00,1\r\n";

struct Result {
    bool ok;
    QByteArray file;
};

Result Run(const QList<QByteArray>& pieces, int type) {
    const QString path = home->filePath(QStringLiteral("site.dat"));
    QFile file(path);
    if (file.open(QIODevice::WriteOnly | QIODevice::Truncate)) file.write(kBefore);
    file.close();
    StandInSocket socket;
    socket.dataReply = pieces;
    CTALUWebData web;
    web.MyWinsock(&socket);
    web.SetRemoteHost(QStringLiteral("stand-in"));
    web.SetProgramEnder([] { std::abort(); });
    const bool ok = web.GetNewData(path, 1, type);
    file.open(QIODevice::ReadOnly);
    return {ok, file.readAll()};
}

} // namespace

extern "C" int LLVMFuzzerInitialize(int* argc, char*** argv) {
    static QCoreApplication app(*argc, *argv);
    static QTemporaryDir folder;
    home = &folder;
    ProgramHome::SetFolder(folder.path());
    static NoPrompts prompts;
    static SystemClock clock;
    clock.SetWaits(WaitLengths{.replyGap = std::chrono::milliseconds(200)});
    static ScopedPorts ports({&prompts, &clock, nullptr});
    return 0;
}

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
    static int runs = 0;
    if (++runs % 200 == 0) QFile::remove(ProgramHome::LogFile());
    fuzz::Input input(data, size);
    static const int kTypes[] = {kDateTime, kDateComma, kYmdhm, kCsi, kDecagon, kNoDate};
    const int type = kTypes[input.Byte() % 6];
    const std::uint8_t seed = input.Byte();
    const QByteArray reply = input.Rest();
    const Result whole = Run({reply}, type);
    const Result split = Run(fuzz::Pieces(reply, seed), type);
    if (whole.ok != split.ok || whole.file != split.file) std::abort();
    // Appending keeps what was there; a file without dates is kept or replaced.
    if (type != kNoDate && !whole.file.startsWith(kBefore)) std::abort();
    if (!whole.file.isEmpty() && !whole.file.endsWith("\r\n")) std::abort();
    return 0;
}
