#include "ui/app/open_files.h"

#include <QDeadlineTimer>
#include <QLocalSocket>
#include <QStandardPaths>
#include <QStringDecoder>
#include <QThread>
#include <QTimer>

namespace kv {

namespace {
constexpr char endOfPath = '\n';
const QByteArray accepted = "OK\n";
constexpr int RetryPauseMs = 50;
}  // namespace

QString OpenFilesServerName() {
    // The runtime folder belongs to the user alone (mode 0700), so no other
    // user can take the name or listen in its place.
    return QStandardPaths::writableLocation(QStandardPaths::RuntimeLocation) +
           QStringLiteral("/kv700-open-files");
}

QString PathFromMessage(const QByteArray& message) {
    QStringDecoder decoder(QStringDecoder::Utf8, QStringDecoder::Flag::Stateless);
    const QString path = decoder.decode(message);
    if (decoder.hasError() || path.isEmpty())
        return {};
    for (const QChar c : path)
        if (c.unicode() < 0x20 || c.unicode() == 0x7F)
            return {};
    return path;
}

OpenFilesServer::OpenFilesServer(const QString& name, int peerTimeoutMs, QObject* parent)
    : QObject(parent), name_(name), peerTimeoutMs_(peerTimeoutMs),
      lock_(name + QStringLiteral(".lock")) {
    // Only a lock whose process has ended is stale, however long the program runs.
    lock_.setStaleLockTime(0);
    server_.setSocketOptions(QLocalServer::UserAccessOption);
    server_.setMaxPendingConnections(8);
    connect(&server_, &QLocalServer::newConnection, this, &OpenFilesServer::accept);
}

OpenFilesServer::~OpenFilesServer() {
    server_.close();
}

OpenFilesRole OpenFilesServer::listen(QString& error) {
    if (!lock_.tryLock(0)) {
        if (lock_.error() == QLockFile::LockFailedError)
            return OpenFilesRole::Second;
        error = QStringLiteral("Cannot create the lock file %1").arg(name_ + ".lock");
        return OpenFilesRole::Unavailable;
    }
    // A socket left behind by a start that crashed.
    QLocalServer::removeServer(name_);
    if (!server_.listen(name_)) {
        error = server_.errorString();
        return OpenFilesRole::Unavailable;
    }
    return OpenFilesRole::First;
}

void OpenFilesServer::accept() {
    while (QLocalSocket* peer = server_.nextPendingConnection()) {
        connect(peer, &QLocalSocket::disconnected, peer, &QObject::deleteLater);
        connect(peer, &QLocalSocket::readyRead, this, [this, peer] { read(peer); });
        // A peer that never finishes its message is dropped.
        QTimer::singleShot(peerTimeoutMs_, peer, [peer] { peer->abort(); });
        read(peer);
    }
}

void OpenFilesServer::read(QLocalSocket* peer) {
    const QByteArray pending = peer->peek(OpenFilesMaxMessage + 1);
    const qsizetype end = pending.indexOf(endOfPath);
    if (end < 0) {
        if (pending.size() > OpenFilesMaxMessage)
            peer->abort();
        return;
    }
    const QString path = PathFromMessage(peer->read(end + 1).chopped(1));
    if (path.isEmpty()) {
        peer->abort();
        return;
    }
    peer->write(accepted);
    peer->disconnectFromServer();
    emit fileReceived(path);
}

bool SendFileToRunningInstance(const QString& path, QString& error, const QString& name) {
    QLocalSocket socket;
    QDeadlineTimer deadline(OpenFilesSendTimeoutMs);
    // The first start may still be getting ready to listen.
    for (;;) {
        socket.connectToServer(name);
        if (socket.waitForConnected(int(deadline.remainingTime())))
            break;
        if (deadline.hasExpired()) {
            error = socket.errorString();
            return false;
        }
        QThread::msleep(RetryPauseMs);
    }
    socket.write(path.toUtf8() + endOfPath);
    while (socket.bytesAvailable() < accepted.size()) {
        if (!socket.waitForReadyRead(int(deadline.remainingTime()))) {
            error = socket.errorString();
            return false;
        }
    }
    if (socket.readAll() != accepted) {
        error = QStringLiteral("The running program refused the file.");
        return false;
    }
    return true;
}

}  // namespace kv
