#pragma once
// A scripted peer on the master side of a pseudo-terminal, published as a COM
// port in a private port folder. Each complete frame it receives is handed to
// the responder, whose chunks are written back with the given delays.

#include <QByteArray>
#include <QString>
#include <QTemporaryDir>

#include <atomic>
#include <functional>
#include <mutex>
#include <thread>
#include <vector>

struct PeerChunk {
    int delayMs;  // pause before the bytes are written
    QByteArray bytes;
};
using PeerResponder = std::function<std::vector<PeerChunk>(const QByteArray& frame)>;

class PtyPeer {
public:
    // Publishes the slave as COM `port` and points KV700_PORT_DIR at its folder.
    explicit PtyPeer(qint16 port = 1);
    ~PtyPeer();

    bool isReady() const { return masterFd_ >= 0; }
    qint16 port() const { return port_; }
    QString slavePath() const { return slavePath_; }
    QString portDir() const { return dir_.path(); }

    void setResponder(PeerResponder responder);
    // Everything received so far, priming bytes included.
    QByteArray received() const;
    int framesReceived() const { return frames_; }

    // A reply frame echoing `sent` with `data` (8 characters) and status `status`.
    static QByteArray replyTo(const QByteArray& sent, const QByteArray& data, char status = '0');

private:
    void run();

    QTemporaryDir dir_;
    qint16 port_;
    int masterFd_ = -1;
    int slaveFd_ = -1;  // kept open so the master never sees a hang-up between exchanges
    QString slavePath_;
    std::atomic<bool> stop_{false};
    std::atomic<int> frames_{0};
    mutable std::mutex mutex_;
    PeerResponder responder_;
    QByteArray received_;
    std::thread thread_;
};
