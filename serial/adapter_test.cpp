#include "serial/adapter_test.h"

#include "engine/diagnostics.h"
#include "model/register_map.h"
#include "serial/frame.h"
#include "serial/port_handle.h"
#include "serial/transact.h"

#include <QElapsedTimer>

namespace kv::KvSerialPort {

namespace {
constexpr int PrimingBlocks = 10;
constexpr int MaxReads = 51;
constexpr int AccumulatorLimit = 800;
constexpr qint64 DecayMaxMs = 200;
constexpr qint64 DecayMinMs = 40;

// Runs the exchange on an open port; returns the outcome text without its prefix.
bool judgeAdapter(PortHandle& handle, const QByteArray& frame, QString& text) {
    if (!SendPriming(handle, PrimingBlocks, text))
        return false;
    DebugMessage(DiagSerialStep, QStringLiteral("COM"), QStringLiteral("0 >>>"), frame,
                 QStringLiteral("St"));
    QElapsedTimer clock;
    clock.start();
    if (!SendFrame(handle, frame, text))
        return false;

    QByteArray received;
    received.reserve(AccumulatorLimit);
    char buffer[FrameLength + 1];
    for (int read = 1; read <= MaxReads; ++read) {
        int count = 0;
        if (!ReceiveBlock(handle, buffer, count, text))
            return false;
        received.append(buffer, qMin<qsizetype>(count, AccumulatorLimit - received.size()));
        const qint64 elapsed = clock.elapsed();
        DebugMessage(DiagSerialStep, QStringLiteral("COM"), MillisecondsText(elapsed, " +"),
                     received, QStringLiteral("Sc"));
        if (count > 0)
            continue;
        if (elapsed > DecayMaxMs) {
            text = QStringLiteral("decay") + MillisecondsText(elapsed, " > 200mS ");
            return false;
        }
        if (elapsed < DecayMinMs) {
            text = QStringLiteral("decay") + MillisecondsText(elapsed, " < 40mS ");
            return false;
        }
        QByteArray reply;
        if (ScanReply(received, frame, reply, false)) {
            text = MillisecondsText(elapsed, " mS ");
            return true;
        }
        text = QStringLiteral("Reply not found ?");
        return false;
    }
    text = QStringLiteral("KV705 too many loops");
    return false;
}
}  // namespace

QByteArray AdapterTestMessage() {
    return ReadMessage(OrdinaryBusId, RegMapFor(NoModuleMap).Mod_Type);
}

AdapterTestOutcome TestAdapter(qint16 port, const QByteArray& message) {
    AdapterTestOutcome outcome;
    PortHandle handle;
    QString error;
    if (!OpenPort(port, handle, error)) {
        outcome.report = QStringLiteral("FAIL KV705 ") + error;
        DebugMessage(DiagGeneral, outcome.report, QStringLiteral("KV ?"), "?");
        return outcome;
    }
    QString text;
    outcome.passed = judgeAdapter(handle, BuildFrame(message), text);
    outcome.report =
        (outcome.passed ? QStringLiteral("PASS KV705 !!! ") : QStringLiteral("FAIL KV705 ")) + text;
    DebugMessage(DiagGeneral, QStringLiteral("COM"), outcome.report);
    return outcome;
}

}  // namespace kv::KvSerialPort
