#pragma once
// The single-request engine: one current request, sent on the next tick,
// retried on the following ticks, decoded into RegVal and answered by a
// callback to the requester found by its tag.

#include "engine/callback_receiver.h"

#include <QByteArray>
#include <QObject>
#include <QVariant>

#include <utility>
#include <vector>

namespace kv {

enum EngineState : qint32 {
    StateClosed = 0,
    StateOpening = 1,
    StateModuleType = 2,
    StateWriteData = 3,
    StatePollRead = 5,
    StateRun = 6,
    StateCallBackVal = 7,
    StateDelayCB = 8,
    StateUnknownModule = 13,
    StateStartUp = 15,
};

enum CallbackKind : qint32 {
    CallbackNone = 0,
    CallbackGet = 1,
    CallbackSet = 2,
    CallbackHub = 4,
    CallbackRawGet = 5,
};

// Value types of a write: how the data field is built.
enum ValueType : qint16 {
    ValueLong = 1,
    ValueSingle = 2,
    ValueTwoWords = 3,
    ValueFourChars = 4,
    ValueFourBytes = 5,
    ValueLongToo = 6,
};

constexpr int MaxAttempts = 6;
constexpr int DelayStart = 100;     // delay counter once the write half has gone out
constexpr int DelayReadTick = 106;  // the read half goes out on this count

class RequestEngine : public QObject {
    Q_OBJECT
public:
    explicit RequestEngine(QObject* parent = nullptr);

    // Where replies of kind 4 go: the main window's identification and polling.
    void setHubReceiver(CallbackReceiver* hub) { hub_ = hub; }
    // Receivers in registration order; the first with the caller's tag is called.
    void registerReceiver(const QString& tag, CallbackReceiver* receiver);
    void unregisterReceiver(const QString& tag);

    bool R_CB(qint32 address, qint16 busId, const QString& tag, qint32 kind, QString& error);
    bool W_DataOK(qint32 address, qint16 busId, const QString& tag, const QVariant& v1,
                  const QVariant& v2, const QVariant& v3, const QVariant& v4, qint16 valueType,
                  const QString& command, QString& error);
    bool W_DelayCB(qint32 address, const QVariant& value, qint16 valueType, const QString& tag,
                   qint32 kind, QString& error);
    // The live polling's read: bus ID 16, kind 4, state 5.
    bool PollRead(qint32 address, QString& error);

    // One engine tick.
    void Communicate();
    bool SendKVcom2(const QByteArray& message, QByteArray& reply, bool& portFault);
    void ProcessMessage(const QByteArray& message, const QByteArray& reply);
    void ProcessCallBack(qint32 address, qint16 busId, const QString& text, bool ok);
    QString GetSentMessageTXT(const QByteArray& message) const;

    // Waits (processing events) until the engine is idle, then reserves it.
    bool ReserveSomeTime();
    bool reserved() const { return reserved_; }
    void setReserved(bool on) { reserved_ = on; }

    // Logical connection: connecting resets the request fields and enters Opening.
    void setConnected(bool connected);
    bool connected() const { return connected_; }

    qint32 state() const { return state_; }
    void setState(qint32 state) { state_ = state; }
    void setLastState(qint32 state) { lastState_ = state; }
    qint16 retryCount() const { return retryCount_; }
    qint32 awaitedAddress() const { return awaitedAddress_; }
    // Data field of the last reply handled.
    QByteArray lastReplyData() const { return lastReplyData_; }
    qint16 port() const { return port_; }
    void setPort(qint16 port) { port_ = port; }
    qint16 connector() const { return connector_; }
    void setConnector(qint16 connector) { connector_ = connector; }
    // The delay counter doubles as the live polling's cycle counter.
    qint16& delayCounter() { return delayCounter_; }
    // Raw data field of the last kind-5 read.
    QByteArray rawData() const { return rawData_; }
    // Whether "Descript" lines go to the log.
    void setDescribeMessages(bool on) { describeMessages_ = on; }
    static QString StateName(qint32 state);

signals:
    // The engine gave up or met a port fault: the connection must be closed.
    void disconnectRequested();
    // A register value was stored: the live display may refresh it.
    void registerStored(qint32 address);
    // The polled module type or serial number differs from the identified one.
    void moduleSwapped();
    // A reply nobody waited for.
    void beep();

private:
    // Why a request for `address` cannot be taken now; empty when it can.
    QString refusal(qint32 address) const;
    void refuse(const QString& procedure, const QString& why, QString& error);
    bool exchange(const QString& failText);
    void afterFailedAttempt();
    void giveUp();
    // Makes the request the current one: who waits for which address, and how.
    void take(qint32 address, qint16 busId, const QString& tag, qint32 kind, qint32 state);

    CallbackReceiver* hub_ = nullptr;
    std::vector<std::pair<QString, CallbackReceiver*>> receivers_;

    qint16 port_ = 0;
    qint16 connector_ = 0;
    bool connected_ = false;
    bool reserved_ = false;
    bool describeMessages_ = false;
    qint16 retryCount_ = 0;
    qint32 state_ = StateClosed;
    qint32 lastState_ = StateClosed;
    qint32 callbackKind_ = CallbackNone;
    QString callerTag_;
    qint32 awaitedAddress_ = 0;
    qint16 busId_ = 0;
    QByteArray currentMessage_;
    qint16 delayCounter_ = 0;
    QByteArray delayedWrite_;
    QByteArray delayedRead_;
    QByteArray rawData_;
    QByteArray lastReplyData_;
    QString lastError_;
    bool lastPortFault_ = false;
};

}  // namespace kv
