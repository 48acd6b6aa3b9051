#include "serial/frame.h"

#include "engine/diagnostics.h"
#include "model/codec.h"

namespace kv::KvSerialPort {

QByteArray BuildMessage(char command, qint16 busId, qint32 address, const QByteArray& data) {
    QByteArray message(1, command);
    message += char(busId);
    message += char(address);
    message += data;
    message += 'F';
    return message;
}

QByteArray ReadMessage(qint16 busId, qint32 address) {
    return BuildMessage('R', busId, address, "30303030");
}

QByteArray BuildFrame(const QByteArray& message) {
    QByteArray frame;
    frame.reserve(FrameLength);
    frame += STX;
    frame += message;
    frame += ETX;
    frame += FrameChecksum(message + ETX);
    return frame;
}

bool ScanReply(QByteArray& accumulator, const QByteArray& sent, QByteArray& reply, bool debug) {
    const int count = int(accumulator.size());
    // Positions compared against the sent frame, in this order: command, bus ID,
    // address, then the ETX that closes the message.
    static constexpr int echoed[] = {1, 2, 3, 13};
    for (int i = 0; i < count; ++i) {
        if (accumulator[i] != sent[0])
            continue;
        bool mismatch = false;
        bool incomplete = false;
        for (int offset : echoed) {
            if (i + offset >= count) {
                incomplete = true;
                break;
            }
            if (accumulator[i + offset] != sent[offset]) {
                mismatch = true;
                break;
            }
        }
        if (!mismatch && !incomplete && i + FrameLength - 1 >= count)
            incomplete = true;
        if (incomplete) {
            accumulator.remove(0, i);
            return false;
        }
        if (mismatch)
            continue;
        const QByteArray message = accumulator.mid(i + 1, MessageLength);
        const QByteArray check = accumulator.mid(i + 14, 2);
        if (FrameChecksum(message + ETX) == check) {
            reply = message;
            return true;
        }
        if (debug)
            DebugMessage(DiagSerialStep, QStringLiteral("COM"), QStringLiteral("Check Sum Failed"),
                         {}, QStringLiteral("Sc"));
    }
    accumulator.clear();
    return false;
}

}  // namespace kv::KvSerialPort
