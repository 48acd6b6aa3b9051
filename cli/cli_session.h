#pragma once
// One command's time with the module: connect, identify up to "Run Mode",
// reserve the engine like a window does, then register requests that wait for
// their callback while the engine's own timer drives the exchanges.

#include "engine/callback_receiver.h"
#include "engine/module_connection.h"

#include <QByteArray>
#include <QElapsedTimer>
#include <QObject>
#include <QVariant>

#include <functional>

namespace kv::cli {

// A wait ends when it is over (or the connection closes); a failed end sets the text.
using WaitOver = std::function<bool(QString& error)>;

class ModuleSession : public QObject, public CallbackReceiver {
    Q_OBJECT
public:
    ModuleSession(qint16 port, qint16 connector, QObject* parent = nullptr);
    ~ModuleSession() override;

    // Connects, identifies the module and reserves the engine for the whole run.
    bool open(QString& error);
    // Reads one register into RegVal; dataField() is then its data field.
    bool read(qint32 address, qint16 busId, QString& error);
    // Writes one register and reads it back after the engine's delay.
    bool writeAndReadBack(qint32 address, const QVariant& value, qint16 valueType, QString& error);
    QByteArray dataField() const { return dataField_; }

    // Runs engine ticks until `over` says so after a tick, or the connection closes.
    bool runUntil(const WaitOver& over, QString& error);

    ModuleConnection& connection() { return connection_; }
    RequestEngine& engine() { return connection_.engine(); }
    QString tag() const { return tag_; }
    // Engine ticks, and milliseconds, since the session was opened.
    int ticks() const { return ticks_; }
    qint64 elapsedMs() const { return clock_.elapsed(); }

    void cbGet(qint32 address, qint16 busId) override;
    void cbSet(qint32 address, qint16 busId, const QString& text, bool ok) override;

private:
    bool awaitCallback(QString& error);

    ModuleConnection connection_;
    QString tag_;
    int ticks_ = 0;
    QElapsedTimer clock_;
    bool runMode_ = false;
    bool answered_ = false;
    QString answerError_;
    QByteArray dataField_;
};

}  // namespace kv::cli
