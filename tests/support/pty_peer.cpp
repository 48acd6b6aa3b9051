#include "tests/support/pty_peer.h"

#include <QFile>

#include <chrono>
#include <fcntl.h>
#include <poll.h>
#include <stdlib.h>
#include <termios.h>
#include <unistd.h>

PtyPeer::PtyPeer(qint16 port) : port_(port) {
    masterFd_ = posix_openpt(O_RDWR | O_NOCTTY | O_CLOEXEC);
    if (masterFd_ < 0 || grantpt(masterFd_) != 0 || unlockpt(masterFd_) != 0)
        return;
    slavePath_ = QString::fromLocal8Bit(ptsname(masterFd_));
    slaveFd_ = ::open(slavePath_.toLocal8Bit().constData(), O_RDWR | O_NOCTTY | O_CLOEXEC);
    termios tio{};
    tcgetattr(slaveFd_, &tio);
    cfmakeraw(&tio);
    tcsetattr(slaveFd_, TCSANOW, &tio);
    QFile::link(slavePath_, dir_.path() + QStringLiteral("/com%1").arg(port));
    qputenv("KV700_PORT_DIR", dir_.path().toLocal8Bit());
    thread_ = std::thread([this] { run(); });
}

PtyPeer::~PtyPeer() {
    stop_ = true;
    if (thread_.joinable())
        thread_.join();
    if (slaveFd_ >= 0)
        ::close(slaveFd_);
    if (masterFd_ >= 0)
        ::close(masterFd_);
}

void PtyPeer::setResponder(PeerResponder responder) {
    std::lock_guard<std::mutex> lock(mutex_);
    responder_ = std::move(responder);
}

QByteArray PtyPeer::received() const {
    std::lock_guard<std::mutex> lock(mutex_);
    return received_;
}

QByteArray PtyPeer::replyTo(const QByteArray& sent, const QByteArray& data, char status) {
    QByteArray message = sent.mid(1, 3) + data + status;
    quint8 x = 0xFF;
    for (char c : message + '\x03')
        x ^= quint8(c);
    return '\x02' + message + '\x03' + char(0x30 + (x >> 4)) + char(0x30 + (x & 0x0F));
}

void PtyPeer::run() {
    QByteArray pending;
    while (!stop_) {
        pollfd p{masterFd_, POLLIN, 0};
        if (poll(&p, 1, 5) <= 0 || !(p.revents & POLLIN))
            continue;
        char buffer[256];
        const ssize_t n = ::read(masterFd_, buffer, sizeof buffer);
        if (n <= 0)
            continue;
        PeerResponder responder;
        {
            std::lock_guard<std::mutex> lock(mutex_);
            received_.append(buffer, n);
            responder = responder_;
        }
        pending.append(buffer, n);
        // Frames start with STX; priming bytes and other noise in between are skipped.
        for (;;) {
            const qsizetype start = pending.indexOf('\x02');
            if (start < 0) {
                pending.clear();
                break;
            }
            if (pending.size() - start < 16) {
                pending.remove(0, start);
                break;
            }
            const QByteArray frame = pending.mid(start, 16);
            pending.remove(0, start + 16);
            ++frames_;
            if (!responder)
                continue;
            for (const PeerChunk& chunk : responder(frame)) {
                if (chunk.delayMs > 0)
                    std::this_thread::sleep_for(std::chrono::milliseconds(chunk.delayMs));
                if (::write(masterFd_, chunk.bytes.constData(), size_t(chunk.bytes.size())) < 0)
                    break;
            }
        }
    }
}
