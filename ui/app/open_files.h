#pragma once
// Hands a file named on the command line to the program already running for
// this user, which opens it in a new tab. A local socket in the user's own
// runtime folder replaces the desktop's inter-program link; a lock file next
// to it decides which start is the first.

#include <QLocalServer>
#include <QLockFile>
#include <QObject>

#include <memory>

class QLocalSocket;

namespace kv {

constexpr qint64 OpenFilesMaxMessage = 64 * 1024;  // a path is far shorter
constexpr int OpenFilesPeerTimeoutMs = 5000;
constexpr int OpenFilesSendTimeoutMs = 3000;

// The socket of this user's running instance.
QString OpenFilesServerName();

enum class OpenFilesRole {
    First,        // this start listens for files
    Second,       // another start of the program is running
    Unavailable,  // the first, but the socket could not be offered
};

class OpenFilesServer : public QObject {
    Q_OBJECT
public:
    explicit OpenFilesServer(const QString& name = OpenFilesServerName(),
                             int peerTimeoutMs = OpenFilesPeerTimeoutMs, QObject* parent = nullptr);
    ~OpenFilesServer() override;

    // Takes the lock and listens; `error` tells why when the result is Unavailable.
    OpenFilesRole listen(QString& error);

signals:
    // A path received from another start of the program, without quotes.
    void fileReceived(const QString& path);

private:
    void accept();
    void read(QLocalSocket* peer);

    QString name_;
    int peerTimeoutMs_;
    QLockFile lock_;
    QLocalServer server_;
};

// Sends `path` to the first start; false with a reason when none took it.
bool SendFileToRunningInstance(const QString& path, QString& error,
                               const QString& name = OpenFilesServerName());

// The path in one message, or empty for anything that is not one: invalid
// UTF-8, control characters, or nothing at all.
QString PathFromMessage(const QByteArray& message);

}  // namespace kv
