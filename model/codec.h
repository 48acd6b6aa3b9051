#pragma once
// Register data texts and the small numeric helpers around them.
// A data text carries one 4-bit nibble per character as the byte 0x30 + nibble,
// most significant nibble first: 0x7ABC travels as "00007:;<".

#include <QByteArray>
#include <QString>
#include <cstdint>

namespace kv {

// 32-bit register values; the 8 nibbles are read as a 32-bit two's-complement
// pattern, so "0000????" is 65535 (not -1).
qint32 WireToLong(const QByteArray& text);
// The same narrowed to 16 bits; false when the value does not fit (an overflow).
bool WireToInt(const QByteArray& text, qint16& value);
QByteArray LongToWire(qint32 value);
// Nibble text of the low `digits` nibbles of value (4 for a table value, 2 for a byte).
QByteArray ToWireDigits(quint32 value, int digits);

float WireToSingle(const QByteArray& text);
QByteArray SingleToWire(float value);

QString DecToBin(quint32 value, bool grouped);
// false with "Invalid Input" (error 1002 of BinToDec) for a character other than 0 or 1.
bool BinToDec(const QString& text, bool sixteenBits, quint32& value, QString& error);
QString ToBin(quint32 value);

quint16 SetBit(quint16 flags, int bit);
quint16 ClearBit(quint16 flags, int bit);
bool TestBit(quint16 flags, int bit);

qint32 ShiftLeft(qint32 value, int count);
qint32 ShiftRight(qint32 value, int count);
void SplitNibbles(quint8 byte, quint8& low, quint8& high);

// " 41 42" for "AB": the message log's raw view of a frame.
QString StrToHex(const QByteArray& text);
QString TextPart(const QString& text, const QString& separator, bool before);

// Unique callback tags: "MCT" + 5 digits for settings windows, "FT" + 6 digits otherwise.
QString NextTag(bool settingsWindow);

// Two check characters of a frame: 0xFF XOR every byte, as two nibble characters.
QByteArray FrameChecksum(const QByteArray& bytes);

}  // namespace kv
