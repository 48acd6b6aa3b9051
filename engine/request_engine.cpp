#include "engine/request_engine.h"

#include "engine/diagnostics.h"
#include "model/codec.h"
#include "model/register_map.h"
#include "model/register_text.h"
#include "model/register_values.h"
#include "serial/frame.h"
#include "serial/transact.h"

#include <QCoreApplication>
#include <QElapsedTimer>
#include <QEventLoop>
#include <QTime>
#include <QTimer>

#include <cmath>

namespace kv {

namespace {
constexpr qint32 LowestAddress = 16;
constexpr int ReserveWaitMs = 5000;

QString timeOfDay(const char* suffix) {
    const double seconds = QTime::currentTime().msecsSinceStartOfDay() / 1000.0;
    return QString::asprintf("%06.2f%s", seconds, suffix).right(7);
}

qint32 asLong(const QVariant& value) {
    // Whole numbers round half to even, as the module's own tools do.
    return qint32(std::nearbyint(value.toDouble()));
}

quint32 charCode(const QVariant& value) {
    const QString text = value.toString();
    return text.isEmpty() ? 0u : quint32(quint8(text.at(0).toLatin1()));
}

QByteArray dataField(const QVariant& v1, const QVariant& v2, const QVariant& v3, const QVariant& v4,
                     qint16 valueType) {
    switch (valueType) {
    case ValueLong:
    case ValueLongToo:
        return LongToWire(asLong(v1));
    case ValueSingle:
        return SingleToWire(v1.toFloat());
    case ValueTwoWords:
        return ToWireDigits(quint32(asLong(v1)), 4) + ToWireDigits(quint32(asLong(v2)), 4);
    case ValueFourChars:
        return ToWireDigits(charCode(v1), 2) + ToWireDigits(charCode(v2), 2) +
               ToWireDigits(charCode(v3), 2) + ToWireDigits(charCode(v4), 2);
    case ValueFourBytes:
        return ToWireDigits(quint32(asLong(v1)), 2) + ToWireDigits(quint32(asLong(v2)), 2) +
               ToWireDigits(quint32(asLong(v3)), 2) + ToWireDigits(quint32(asLong(v4)), 2);
    default:
        return "00000000";
    }
}
}  // namespace

RequestEngine::RequestEngine(QObject* parent) : QObject(parent) {}

QString RequestEngine::StateName(qint32 state) {
    switch (state) {
    case StateClosed:
        return QStringLiteral("Closed     ");
    case StateOpening:
        return QStringLiteral("Opening    ");
    case StateModuleType:
        return QStringLiteral("ModuleType ");
    case StateWriteData:
        return QStringLiteral("W_DataOK   ");
    case StateRun:
        return QStringLiteral("Run        ");
    case StateCallBackVal:
        return QStringLiteral("CallBackVal");
    case StateDelayCB:
        return QStringLiteral("W_DelayCB  ");
    case StateUnknownModule:
        return QStringLiteral(" ??        ");
    default:
        return QStringLiteral("Default");
    }
}

void RequestEngine::registerReceiver(const QString& tag, CallbackReceiver* receiver) {
    receivers_.emplace_back(tag, receiver);
}

void RequestEngine::unregisterReceiver(const QString& tag) {
    for (auto it = receivers_.begin(); it != receivers_.end(); ++it) {
        if (it->first == tag) {
            receivers_.erase(it);
            return;
        }
    }
}

void RequestEngine::setConnected(bool connected) {
    connected_ = connected;
    retryCount_ = 0;
    reserved_ = false;
    if (!connected) {
        state_ = StateClosed;
        return;
    }
    state_ = StateOpening;
    callbackKind_ = CallbackNone;
    awaitedAddress_ = 0;
    delayCounter_ = 0;
    callerTag_.clear();
    currentMessage_.clear();
}

QString RequestEngine::refusal(qint32 address) const {
    if (address < LowestAddress)
        return QStringLiteral("Address < 16 not allowed");
    if (state_ != StateRun)
        return QStringLiteral("Must be in run mode");
    return {};
}

void RequestEngine::refuse(const QString& procedure, const QString& why, QString& error) {
    error = why;
    DebugMessage(DiagGeneral, procedure, why);
}

void RequestEngine::take(qint32 address, qint16 busId, const QString& tag, qint32 kind,
                         qint32 state) {
    awaitedAddress_ = address;
    busId_ = busId;
    callerTag_ = tag;
    callbackKind_ = kind;
    state_ = state;
}

bool RequestEngine::R_CB(qint32 address, qint16 busId, const QString& tag, qint32 kind,
                         QString& error) {
    QString why = refusal(address);
    if (why.isEmpty() && busId < KvSerialPort::OrdinaryBusId)
        why = QStringLiteral("ID must be 16 or above");
    if (!why.isEmpty()) {
        refuse(QStringLiteral("R_CB"), why, error);
        return false;
    }
    currentMessage_ = KvSerialPort::ReadMessage(busId, address);
    take(address, busId, tag, kind, StateCallBackVal);
    return true;
}

bool RequestEngine::PollRead(qint32 address, QString& error) {
    const QString why = refusal(address);
    if (!why.isEmpty()) {
        refuse(QStringLiteral("R_CB"), why, error);
        return false;
    }
    currentMessage_ = KvSerialPort::ReadMessage(KvSerialPort::OrdinaryBusId, address);
    take(address, KvSerialPort::OrdinaryBusId, QStringLiteral("hub"), CallbackHub, StatePollRead);
    return true;
}

bool RequestEngine::W_DataOK(qint32 address, qint16 busId, const QString& tag, const QVariant& v1,
                             const QVariant& v2, const QVariant& v3, const QVariant& v4,
                             qint16 valueType, const QString& command, QString& error) {
    QString why = refusal(address);
    const bool validCommand =
        command.isEmpty() || command == QLatin1String("W") || command == QLatin1String("T");
    if (why.isEmpty() && !validCommand)
        why = command + QStringLiteral("? Retry Control");
    if (!why.isEmpty()) {
        refuse(QStringLiteral("W_DataOK"), why, error);
        return false;
    }
    const char letter = command == QLatin1String("T") ? 'T' : 'W';
    currentMessage_ =
        KvSerialPort::BuildMessage(letter, busId, address, dataField(v1, v2, v3, v4, valueType));
    take(address, busId, tag, CallbackSet, StateWriteData);
    return true;
}

bool RequestEngine::W_DelayCB(qint32 address, const QVariant& value, qint16 valueType,
                              const QString& tag, qint32 kind, QString& error) {
    const QString why = refusal(address);
    if (!why.isEmpty()) {
        refuse(QStringLiteral("R_CB"), why, error);
        return false;
    }
    const bool typed =
        valueType == ValueLong || valueType == ValueSingle || valueType == ValueLongToo;
    const QByteArray data =
        typed ? dataField(value, {}, {}, {}, valueType) : QByteArray("00000000");
    delayedWrite_ = KvSerialPort::BuildMessage('W', KvSerialPort::OrdinaryBusId, address, data);
    delayedRead_ = KvSerialPort::ReadMessage(KvSerialPort::OrdinaryBusId, address);
    take(address, KvSerialPort::OrdinaryBusId, tag, kind, StateDelayCB);
    return true;
}

bool RequestEngine::SendKVcom2(const QByteArray& msg, QByteArray& reply, bool& portFault) {
    if (!connected_) {
        portFault = true;
        reply = "COM port not open";
        return false;
    }
    portFault = false;
    if (DebugFlag() && describeMessages_)
        AddMessage(GetSentMessageTXT(msg) + QLatin1Char('\n'));
    QString kind;
    QByteArray logged = msg;
    switch (msg.isEmpty() ? '\0' : msg[0]) {
    case 'R':
        kind = QStringLiteral("RV");
        break;
    case 'W':
        kind = QStringLiteral("WV");
        break;
    case 'T':
        kind = QStringLiteral("TV");
        logged[0] = 'W';
        rawData_.clear();
        break;
    default:
        DebugMessage(DiagGeneral, QStringLiteral("COM"), timeOfDay(" -? RWC"));
        reply = "Unknown RWC";
        portFault = true;
        return false;
    }
    DebugMessage(DiagSend, QStringLiteral("COM"), timeOfDay(" >"), logged, kind);
    QString error;
    if (KvSerialPort::Transact(port_, msg, connector_, DebugFlag(), reply, error, portFault)) {
        DebugMessage(DiagReceive, QStringLiteral("COM"), timeOfDay(" <"), reply, kind);
        return true;
    }
    DebugMessage(DiagGeneral, QStringLiteral("COM"), QStringLiteral("apCOM4 FAIL ") + error, reply);
    reply = error.toLatin1();
    return false;
}

bool RequestEngine::exchange(const QString& failText) {
    QByteArray reply;
    if (SendKVcom2(currentMessage_, reply, lastPortFault_)) {
        retryCount_ = 0;
        ProcessMessage(currentMessage_, reply);
        return true;
    }
    lastError_ = QString::fromLatin1(reply);
    if (!failText.isEmpty())
        DebugMessage(DiagGeneral, QStringLiteral("Communicate"), failText);
    ++retryCount_;
    afterFailedAttempt();
    return false;
}

void RequestEngine::Communicate() {
    if (!connected_)
        return;
    if (state_ == StateOpening) {
        state_ = lastState_ = StateModuleType;
        if (hub_)
            hub_->cbGet(RegMapFor(NoModuleMap).Mod_Type, 50);
        return;
    }
    if (retryCount_ != 0) {
        if (currentMessage_.size() != KvSerialPort::MessageLength) {
            retryCount_ = 0;
            return;
        }
        const QByteArray sent = currentMessage_;
        if (exchange({})) {
            // A write half that needed a retry is done; a read half that needed
            // one must hand the counter back to the live polling.
            if (state_ == StateDelayCB && delayCounter_ < DelayStart)
                delayCounter_ = DelayStart;
            else if (delayCounter_ >= DelayStart)
                delayCounter_ = 0;
            if (DebugFlag())
                DebugMessage(DiagGeneral, QStringLiteral("Communicate"),
                             QStringLiteral("Retry Passed:") + StrToHex(sent));
        }
        return;
    }
    switch (state_) {
    case StateCallBackVal:
    case StatePollRead:
    case StateWriteData:
        lastState_ = state_;
        exchange(state_ == StateWriteData ? QStringLiteral("Fail opW_DataOK")
                                          : QStringLiteral("Fail Call Back Value"));
        break;
    case StateDelayCB:
        lastState_ = StateDelayCB;
        if (delayCounter_ < DelayStart) {
            currentMessage_ = delayedWrite_;
            if (exchange(QStringLiteral("Fail Call Write Data")))
                delayCounter_ = DelayStart;
        } else if (++delayCounter_ < DelayReadTick) {
            ShowStatus(QStringLiteral("Delay Read"));
        } else {
            currentMessage_ = delayedRead_;
            state_ = lastState_ = StateCallBackVal;
            if (exchange(QStringLiteral("Fail Call Back Delay Read")))
                delayCounter_ = 0;
        }
        break;
    default:
        break;
    }
}

void RequestEngine::afterFailedAttempt() {
    if (retryCount_ < MaxAttempts) {
        if (DebugFlag())
            DebugMessage(DiagGeneral, QStringLiteral("Communicate"), QStringLiteral("Fail Retry:"),
                         currentMessage_);
        if (lastPortFault_) {
            DebugMessage(DiagGeneral, QStringLiteral("Communicate"), lastError_);
            emit disconnectRequested();
        }
        return;
    }
    giveUp();
}

void RequestEngine::giveUp() {
    const QString text = QStringLiteral("Too many retries:") + lastError_;
    switch (lastState_) {
    case StateCallBackVal:
    case StateDelayCB:
    case StateWriteData:  // a waiting writer must learn of it too, or it stays busy for ever
        ProcessCallBack(awaitedAddress_, busId_, text, false);
        break;
    case StateClosed:
    case StateOpening:
    case StateModuleType:
    case StateRun:
    case StateUnknownModule:
        break;
    default:
        DebugMessage(DiagGeneral, QStringLiteral("Communicate"),
                     QStringLiteral("? LastOperationStatus:%1").arg(lastState_));
        break;
    }
    if (DebugFlag())
        DebugMessage(DiagGeneral, QStringLiteral("Communicate"),
                     QStringLiteral("Fail%1 times:").arg(retryCount_), currentMessage_);
    else
        ShowStatus(GetSentMessageTXT(currentMessage_) + QStringLiteral(" !Fail! "));
    emit disconnectRequested();
}

void RequestEngine::ProcessMessage(const QByteArray& sent, const QByteArray& reply) {
    Q_UNUSED(sent);
    if (reply.size() < KvSerialPort::MessageLength)
        return;
    const char command = reply[0];
    const qint16 busId = qint16(quint8(reply[1]));
    const qint32 address = qint32(quint8(reply[2]));
    const QByteArray data = reply.mid(3, 8);
    lastReplyData_ = data;

    if (command == 'W' || command == 'T') {
        if (state_ != StateWriteData)
            return;
        ShowStatus(GetRegDescription(address, busId));
        if (address == awaitedAddress_) {
            state_ = StateRun;
            ProcessCallBack(address, busId, QString(), true);
        }
        return;
    }
    if (command != 'R') {
        ShowStatus(QLatin1Char(command) + QStringLiteral("RorW ??"));
        return;
    }
    switch (state_) {
    case StateRun:
        emit beep();
        break;
    case StatePollRead:
        if (address == RegAdd.Mod_Type || address == RegAdd.Serial_No) {
            const qint32 known = address == RegAdd.Mod_Type ? RegVal.Mod_Type : RegVal.Serial_No;
            if (WireToLong(data) == known) {
                state_ = StateRun;
            } else {
                ModuleMap = NoModuleMap;
                state_ = StateOpening;
                emit moduleSwapped();
            }
            break;
        }
        UpdateRegValue(address, data, busId, 0);
        emit registerStored(address);
        // Every poll reply ends the poll, whatever register it was.
        state_ = StateRun;
        break;
    case StateCallBackVal:
        ShowStatus(GetRegDescription(address, busId));
        if (callbackKind_ == CallbackRawGet)
            rawData_ = data;
        UpdateRegValue(address, data, busId, 0);
        if (address != awaitedAddress_)
            break;
        emit registerStored(address);
        state_ = StateRun;
        ProcessCallBack(address, busId, QString(), true);
        break;
    case StateUnknownModule:
        ShowStatus(QStringLiteral("Address:%1").arg(address));
        break;
    default:
        break;
    }
}

void RequestEngine::ProcessCallBack(qint32 address, qint16 busId, const QString& text, bool ok) {
    if (callbackKind_ == CallbackHub) {
        if (hub_)
            hub_->cbGet(address, busId);
        return;
    }
    CallbackReceiver* receiver = nullptr;
    for (const auto& [tag, candidate] : receivers_) {
        if (tag == callerTag_) {
            receiver = candidate;
            break;
        }
    }
    if (!receiver) {
        ShowStatus(QStringLiteral("Missing CB form?"));
        return;
    }
    switch (callbackKind_) {
    case CallbackGet:
    case CallbackRawGet:
        receiver->cbGet(address, busId);
        break;
    case CallbackSet:
        receiver->cbSet(address, busId, text, ok);
        break;
    default:
        break;
    }
}

bool RequestEngine::ReserveSomeTime() {
    if (reserved_) {
        ShowStatus(QStringLiteral("Try Again Later ...!!"));
        return false;
    }
    // Nothing is ever sent for a module of unknown type, so there is nothing to wait for.
    if (state_ != StateClosed && state_ != StateRun && state_ != StateUnknownModule) {
        ShowStatus(QStringLiteral("Please wait ...!!"));
        QElapsedTimer clock;
        clock.start();
        while (state_ != StateRun && state_ != StateClosed) {
            if (clock.elapsed() >= ReserveWaitMs) {
                ShowStatus(QStringLiteral("Try Again Later ...!!"));
                return false;
            }
            QEventLoop pause;
            QTimer::singleShot(5, &pause, &QEventLoop::quit);
            pause.exec();
        }
    }
    reserved_ = true;
    return true;
}

QString RequestEngine::GetSentMessageTXT(const QByteArray& msg) const {
    if (msg.size() < 3)
        return QStringLiteral("<>R/W?");
    QString text = msg[0] == 'R'   ? QStringLiteral("R:")
                   : msg[0] == 'W' ? QStringLiteral("W:")
                                   : QStringLiteral("<>R/W?");
    const int address = quint8(msg[2]);
    text += QStringLiteral("%1 Mode:").arg(address, 3, 10, QLatin1Char('0'));
    text += StateName(state_);
    text += QStringLiteral(" WaitAdd:%1 ID:").arg(awaitedAddress_);
    text += QStringLiteral("%1 ").arg(quint8(msg[1]), 3, 10, QLatin1Char('0'));
    text += GetRegDescription(address, quint8(msg[1]));
    if (state_ == StateUnknownModule)
        DebugMessage(DiagGeneral, QStringLiteral("GetSendMessageTXT"),
                     QStringLiteral("? Module Run"));
    return text;
}

}  // namespace kv
