#include "serial/transact.h"

#include "engine/diagnostics.h"
#include "serial/frame.h"
#include "serial/port_handle.h"

#include <QElapsedTimer>

namespace kv::KvSerialPort {

namespace {
const QString comTag = QStringLiteral("COM");

void logStep(const QString& text, const QByteArray& data) {
    DebugMessage(DiagSerialStep, comTag, text, data, QStringLiteral("Sc"));
}

const QByteArray primingBlock(FrameLength, 'd');
constexpr int PrimingBlocksPerRead = 2;
}  // namespace

bool SendFrame(PortHandle& handle, const QByteArray& frame, QString& error) {
    int written = 0;
    int sysError = 0;
    if (!handle.writeBlock(frame.constData(), FrameLength, written, sysError)) {
        error = QStringLiteral("WriteFile failed:%1").arg(sysError);
        return false;
    }
    if (written != FrameLength) {
        error = QStringLiteral("Send Lenght Failed:%1").arg(written);
        return false;
    }
    return true;
}

bool SendPriming(PortHandle& handle, int blocks, QString& error) {
    int written = 0;
    int sysError = 0;
    for (int block = 0; block < blocks; ++block) {
        if (!handle.writeBlock(primingBlock.constData(), FrameLength, written, sysError)) {
            error = QStringLiteral("Prime fail:%1").arg(sysError);
            return false;
        }
        if (written != FrameLength) {
            error = QStringLiteral("Prime Len Fail:%1").arg(written);
            return false;
        }
    }
    return true;
}

bool ReceiveBlock(PortHandle& handle, char* buffer, int& count, QString& error) {
    int sysError = 0;
    if (handle.readBlock(buffer, FrameLength, count, sysError))
        return true;
    error = QStringLiteral("ReadFile failed: %1").arg(sysError);
    return false;
}

bool Transact(qint16 port, const QByteArray& message, qint16 connector, bool debug,
              QByteArray& reply, QString& error, bool& portFault) {
    portFault = false;
    if (message.size() != MessageLength) {
        // A malformed request is a program fault, not a port fault: it is never sent.
        error = QStringLiteral("/Message length %1 not 12").arg(message.size());
        return false;
    }
    int budget = ReadBudget;
    QByteArray frameMessage = message;
    switch (message[0]) {
    case 'R':
    case 'W':
        break;
    case 'T':
        budget = TableReadBudget;
        frameMessage[0] = 'W';
        break;
    default:
        error = QStringLiteral("/Unknown RWC");
        portFault = true;
        return false;
    }
    const QByteArray frame = BuildFrame(frameMessage);

    PortHandle handle;
    if (!OpenPort(port, handle, error)) {
        portFault = true;
        return false;
    }
    QElapsedTimer clock;
    clock.start();
    DebugMessage(DiagSerialStep, comTag, QStringLiteral("0 >>>"), frame, QStringLiteral("St"));

    if (!SendFrame(handle, frame, error))
        return false;

    QByteArray accumulator;
    accumulator.reserve(2 * FrameLength);
    char buffer[FrameLength + 1];
    for (int cycle = 1; cycle <= budget; ++cycle) {
        if (connector == ConnectorPrimed && !SendPriming(handle, PrimingBlocksPerRead, error))
            return false;
        int count = 0;
        if (!ReceiveBlock(handle, buffer, count, error))
            return false;
        accumulator.append(buffer, count);
        if (debug)
            logStep(MillisecondsText(clock.elapsed(), " +"), accumulator);
        if (ScanReply(accumulator, frame, reply, debug))
            return true;
        if (debug)
            logStep(MillisecondsText(clock.elapsed(), " F"), {});
        if (cycle == TableReadBudget) {
            logStep(MillisecondsText(clock.elapsed(), " Write Table Time Out"), {});
            reply = message;
            return true;
        }
    }
    return false;
}

QString MillisecondsText(qint64 ms, const char* pattern) {
    return QStringLiteral("%1%2").arg(ms, 3, 10, QLatin1Char('0')).arg(QLatin1String(pattern));
}

}  // namespace kv::KvSerialPort
