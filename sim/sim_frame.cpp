#include "sim/sim_frame.h"

namespace kv::sim {

namespace {
constexpr int StatusPos = 12;
constexpr int EtxPos = 13;
constexpr char RequestStatus = 'F';

bool isNibbleChar(char c) {
    return quint8(c) >= 0x30 && quint8(c) <= 0x3F;
}

void appendEvent(std::vector<FrameScanner::Event>& events, FrameScanner::Event::Kind kind,
                 char byte) {
    if (!events.empty() && events.back().kind == kind) {
        events.back().bytes.append(byte);
        return;
    }
    FrameScanner::Event event;
    event.kind = kind;
    event.bytes.append(byte);
    events.push_back(event);
}
}  // namespace

QByteArray CheckCharacters(const QByteArray& body) {
    quint8 x = 0xFF;
    for (char c : body)
        x ^= quint8(c);
    return NibbleText(x, 2);
}

QByteArray NibbleText(quint32 value, int digits) {
    QByteArray text(digits, '0');
    for (int i = digits - 1; i >= 0; --i, value >>= 4)
        text[i] = char(0x30 + (value & 0x0F));
    return text;
}

bool NibbleValue(const QByteArray& text, quint32& value) {
    quint32 result = 0;
    for (char c : text) {
        if (!isNibbleChar(c))
            return false;
        result = (result << 4) | quint32(quint8(c) - 0x30);
    }
    value = result;
    return true;
}

QByteArray EncodeReply(const Request& request, const QByteArray& data, char status,
                       bool corruptCheck) {
    QByteArray body;
    body.append(request.command);
    body.append(char(request.busId));
    body.append(char(request.address));
    body.append(data.left(DataSize).leftJustified(DataSize, '0'));
    body.append(status);
    body.append(Etx);
    QByteArray check = CheckCharacters(body);
    if (corruptCheck)
        check[1] = char(0x30 + ((quint8(check[1]) - 0x30 + 1) & 0x0F));
    return QByteArray(1, Stx) + body + check;
}

bool DecodeRequest(const QByteArray& frame, Request& request) {
    if (frame.size() != FrameSize || frame[0] != Stx || frame[EtxPos] != Etx)
        return false;
    if (frame[StatusPos] != RequestStatus)
        return false;
    if (frame.mid(EtxPos + 1, 2) != CheckCharacters(frame.mid(1, EtxPos)))
        return false;
    const char command = frame[1];
    const QByteArray data = frame.mid(4, DataSize);
    quint32 unused = 0;
    if (command == 'W') {
        if (!NibbleValue(data, unused))
            return false;
    } else if (command != 'R') {
        return false;
    }
    request.command = command;
    request.busId = quint8(frame[2]);
    request.address = quint8(frame[3]);
    request.data = data;
    return true;
}

void FrameScanner::feed(const QByteArray& bytes, std::vector<Event>& events) {
    buffer_.append(bytes);
    int at = 0;
    while (at < buffer_.size()) {
        const char byte = buffer_[at];
        if (byte == Stx) {
            if (buffer_.size() - at < FrameSize)
                break;  // wait for the rest
            Request request;
            if (DecodeRequest(buffer_.mid(at, FrameSize), request)) {
                Event event;
                event.kind = Event::Frame;
                event.request = request;
                events.push_back(event);
                at += FrameSize;
                continue;
            }
        }
        appendEvent(events, byte == PrimingByte ? Event::Priming : Event::Garbage, byte);
        ++at;
    }
    buffer_.remove(0, at);
}

}  // namespace kv::sim
