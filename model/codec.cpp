#include "model/codec.h"

#include <atomic>
#include <cstring>

namespace kv {

namespace {
char nibbleChar(unsigned nibble) {
    return char(0x30 + (nibble & 0x0F));
}
unsigned charNibble(char c) {
    return unsigned(quint8(c) - 0x30) & 0x0F;
}
}  // namespace

qint32 WireToLong(const QByteArray& text) {
    quint32 value = 0;
    for (char c : text)
        value = (value << 4) | charNibble(c);
    return qint32(value);
}

bool WireToInt(const QByteArray& text, qint16& value) {
    const qint32 wide = WireToLong(text);
    if (wide < -32768 || wide > 32767)
        return false;
    value = qint16(wide);
    return true;
}

QByteArray ToWireDigits(quint32 value, int digits) {
    QByteArray text(digits, '0');
    for (int i = digits - 1; i >= 0; --i, value >>= 4)
        text[i] = nibbleChar(value & 0x0F);
    return text;
}

QByteArray LongToWire(qint32 value) {
    return ToWireDigits(quint32(value), 8);
}

float WireToSingle(const QByteArray& text) {
    const quint32 bits = quint32(WireToLong(text));
    float value;
    std::memcpy(&value, &bits, sizeof value);
    return value;
}

QByteArray SingleToWire(float value) {
    quint32 bits;
    std::memcpy(&bits, &value, sizeof bits);
    return ToWireDigits(bits, 8);
}

QString DecToBin(quint32 value, bool grouped) {
    QString text;
    for (int bit = 31; bit >= 0; --bit) {
        text += (value >> bit) & 1 ? QLatin1Char('1') : QLatin1Char('0');
        if (grouped && bit % 8 == 0 && bit > 0)
            text += QLatin1Char(' ');
    }
    return text;
}

bool BinToDec(const QString& text, bool sixteenBits, quint32& value, QString& error) {
    const QString digits = sixteenBits && text.size() > 16 ? text.right(16) : text;
    quint32 result = 0;
    for (QChar c : digits) {
        if (c != QLatin1Char('0') && c != QLatin1Char('1')) {
            error = QStringLiteral("Invalid Input");
            return false;
        }
        result = (result << 1) | (c == QLatin1Char('1') ? 1u : 0u);
    }
    value = result;
    return true;
}

QString ToBin(quint32 value) {
    const int digits = value < 256 ? 8 : 16;
    QString text;
    for (int bit = digits - 1; bit >= 0; --bit) {
        text += (value >> bit) & 1 ? QLatin1Char('1') : QLatin1Char('0');
        if (bit % 4 == 0 && bit > 0)
            text += QLatin1Char(' ');
    }
    return text;
}

quint16 SetBit(quint16 flags, int bit) {
    return quint16(flags | (1u << bit));
}
quint16 ClearBit(quint16 flags, int bit) {
    return quint16(flags & ~(1u << bit));
}
bool TestBit(quint16 flags, int bit) {
    return (flags >> bit) & 1u;
}

qint32 ShiftLeft(qint32 value, int count) {
    return qint32(quint32(value) << count);
}
qint32 ShiftRight(qint32 value, int count) {
    return qint32(quint32(value) >> count);
}

void SplitNibbles(quint8 byte, quint8& low, quint8& high) {
    low = byte & 0x0F;
    high = byte >> 4;
}

QString StrToHex(const QByteArray& text) {
    QString hex;
    for (char c : text)
        hex += QStringLiteral(" %1").arg(quint8(c), 2, 16, QLatin1Char('0')).toUpper();
    return hex;
}

QString TextPart(const QString& text, const QString& separator, bool before) {
    const QString trimmed = text.trimmed();
    const int at = trimmed.indexOf(separator);
    if (trimmed.isEmpty() || separator.isEmpty() || at < 0)
        return trimmed;
    return before ? trimmed.left(at) : trimmed.mid(at + separator.size());
}

QString NextTag(bool settingsWindow) {
    static std::atomic<int> counter{0};
    const int n = ++counter;
    return settingsWindow ? QStringLiteral("MCT%1").arg(n, 5, 10, QLatin1Char('0'))
                          : QStringLiteral("FT%1").arg(n, 6, 10, QLatin1Char('0'));
}

QByteArray FrameChecksum(const QByteArray& bytes) {
    quint8 x = 0xFF;
    for (char c : bytes)
        x ^= quint8(c);
    const char check[2] = {nibbleChar(x >> 4), nibbleChar(x)};
    return QByteArray(check, 2);
}

}  // namespace kv
