#include "serial/adapter_test.h"

#include "engine/diagnostics.h"
#include "serial/frame.h"
#include "serial/port_handle.h"

#include <QElapsedTimer>

namespace kv::KvSerialPort {

namespace {
constexpr int PrimingBlocks = 10;
constexpr int MaxReads = 51;
constexpr int AccumulatorLimit = 800;
constexpr qint64 DecayMaxMs = 200;
constexpr qint64 DecayMinMs = 40;

QString millis(qint64 ms, const char* pattern) {
    return QStringLiteral("%1%2").arg(ms, 3, 10, QLatin1Char('0')).arg(QLatin1String(pattern));
}

// Runs the exchange on an open port; returns the outcome text without its prefix.
bool judgeAdapter(PortHandle& handle, const QByteArray& frame, QString& text) {
    const QByteArray priming(FrameLength, 'd');
    int written = 0;
    int sysError = 0;
    for (int block = 0; block < PrimingBlocks; ++block) {
        if (!handle.writeBlock(priming.constData(), FrameLength, written, sysError)) {
            text = QStringLiteral("Prime fail:%1").arg(sysError);
            return false;
        }
        if (written != FrameLength) {
            text = QStringLiteral("Prime Len Fail:%1").arg(written);
            return false;
        }
    }
    DebugMessage(DiagSerialStep, QStringLiteral("COM"), QStringLiteral("0 >>>"), frame,
                 QStringLiteral("St"));
    QElapsedTimer clock;
    clock.start();
    if (!handle.writeBlock(frame.constData(), FrameLength, written, sysError)) {
        text = QStringLiteral("WriteFile failed:%1").arg(sysError);
        return false;
    }
    if (written != FrameLength) {
        text = QStringLiteral("Send Lenght Failed:%1").arg(written);
        return false;
    }

    QByteArray received;
    received.reserve(AccumulatorLimit);
    char buffer[FrameLength + 1];
    for (int read = 1; read <= MaxReads; ++read) {
        int count = 0;
        if (!handle.readBlock(buffer, FrameLength, count, sysError)) {
            text = QStringLiteral("ReadFile failed: %1").arg(sysError);
            return false;
        }
        received.append(buffer, qMin<qsizetype>(count, AccumulatorLimit - received.size()));
        const qint64 elapsed = clock.elapsed();
        DebugMessage(DiagSerialStep, QStringLiteral("COM"), millis(elapsed, " +"), received,
                     QStringLiteral("Sc"));
        if (count > 0)
            continue;
        if (elapsed > DecayMaxMs) {
            text = QStringLiteral("decay") + millis(elapsed, " > 200mS ");
            return false;
        }
        if (elapsed < DecayMinMs) {
            text = QStringLiteral("decay") + millis(elapsed, " < 40mS ");
            return false;
        }
        QByteArray reply;
        if (ScanReply(received, frame, reply, false)) {
            text = millis(elapsed, " mS ");
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
    QByteArray message("R");
    message += char(16);
    message += char(255);
    message += "30303030F";
    return message;
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
