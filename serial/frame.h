#pragma once
// Framing of the 12-character messages and the search for the echoing reply.
//
// Frame: STX, message, ETX, two check characters (0xFF XOR message and ETX,
// as two nibble characters). A reply is accepted only when it echoes the sent
// frame's STX, command, bus ID and address, ends in ETX and checks correctly.

#include <QByteArray>

namespace kv::KvSerialPort {

constexpr char STX = 0x02;
constexpr char ETX = 0x03;
constexpr int MessageLength = 12;
constexpr int FrameLength = 16;
// Bus ID of ordinary requests and the live polling; multi-part registers count up from it.
constexpr qint16 OrdinaryBusId = 16;

// The 12-character message: command, bus ID, address, the 8-character data
// field and the request status "F".
QByteArray BuildMessage(char command, qint16 busId, qint32 address, const QByteArray& data);
// A read request; its data field is the filler "30303030".
QByteArray ReadMessage(qint16 busId, qint32 address);

// The 16-byte frame of a 12-character message, sent as given.
QByteArray BuildFrame(const QByteArray& message);

// Scans `accumulator` for the reply to `sent`. On success returns true with the
// 12-character reply message. Otherwise keeps an incomplete candidate at the
// front of the accumulator (the next read appends to it) or empties it.
// `debug` logs "Check Sum Failed" for a candidate with wrong check characters.
bool ScanReply(QByteArray& accumulator, const QByteArray& sent, QByteArray& reply, bool debug);

}  // namespace kv::KvSerialPort
