// Cost of opening the port for every exchange: the median time of one read
// through Transact against an instant peer, next to the same write and read on
// a descriptor that stays open.
#include "serial/frame.h"
#include "serial/port_handle.h"
#include "serial/transact.h"
#include "tests/support/pty_peer.h"

#include <QElapsedTimer>

#include <algorithm>
#include <cstdio>
#include <vector>

using namespace kv::KvSerialPort;

namespace {
constexpr int Rounds = 500;

double medianMs(std::vector<qint64>& nanos) {
    std::sort(nanos.begin(), nanos.end());
    return double(nanos[nanos.size() / 2]) / 1e6;
}
}  // namespace

int main() {
    PtyPeer peer;
    if (!peer.isReady()) {
        std::fprintf(stderr, "no pseudo-terminal available\n");
        return 1;
    }
    peer.setResponder([](const QByteArray& frame) {
        return std::vector<PeerChunk>{{0, PtyPeer::replyTo(frame, "00000004")}};
    });
    QByteArray message("R\x10\xFF"
                       "30303030F");
    QByteArray reply;
    QString error;
    bool fault = false;

    std::vector<qint64> transact;
    QElapsedTimer clock;
    for (int i = 0; i < Rounds; ++i) {
        clock.start();
        if (!Transact(peer.port(), message, ConnectorPlain, false, reply, error, fault)) {
            std::fprintf(stderr, "exchange failed: %s\n", qPrintable(error));
            return 1;
        }
        transact.push_back(clock.nsecsElapsed());
    }

    PortHandle handle;
    if (!OpenPort(peer.port(), handle, error)) {
        std::fprintf(stderr, "open failed: %s\n", qPrintable(error));
        return 1;
    }
    const QByteArray frame = BuildFrame(message);
    std::vector<qint64> open;
    char buffer[FrameLength + 1];
    for (int i = 0; i < Rounds; ++i) {
        int written = 0, count = 0, sysError = 0;
        clock.start();
        handle.writeBlock(frame.constData(), FrameLength, written, sysError);
        handle.readBlock(buffer, FrameLength, count, sysError);
        open.push_back(clock.nsecsElapsed());
        if (count != FrameLength) {
            std::fprintf(stderr, "short reply on the open descriptor\n");
            return 1;
        }
    }

    const double a = medianMs(transact);
    const double b = medianMs(open);
    std::printf("Transact read, median of %d:          %.3f ms\n", Rounds, a);
    std::printf("write+read on an open port, median:   %.3f ms\n", b);
    std::printf("ratio: %.2f   open/configure/close overhead: %.3f ms (target < 1 ms)\n", a / b,
                a - b);
    return 0;
}
