#pragma once
// The simulator's own reading and writing of the wire frames. It deliberately
// shares no code with the program's framing, so a fault in one is not masked by
// the same fault in the other.
//
// Frame: STX, command, bus ID, address, 8 data characters, status, ETX and two
// check characters: x = 0xFF XOR the 13 bytes from the command to ETX, sent as
// 0x30 + high nibble, 0x30 + low nibble.

#include <QByteArray>
#include <vector>

namespace kv::sim {

constexpr char Stx = 0x02;
constexpr char Etx = 0x03;
constexpr char PrimingByte = 0x64;  // the adapter's priming blocks are made of it
constexpr int FrameSize = 16;
constexpr int DataSize = 8;

struct Request {
    char command = 0;  // 'R' or 'W'; a table step arrives as 'W'
    int busId = 0;
    int address = 0;
    QByteArray data;  // the 8 data characters as received
};

// Status characters of a reply; the program does not interpret them.
enum ReplyStatus : char {
    StatusDone = '0',
    StatusReadOnly = '1',    // write refused, the reply carries the unchanged value
    StatusNoSuchPart = '2',  // a multi-part register asked for a part it lacks
};

// The two check characters of `body` (command to ETX).
QByteArray CheckCharacters(const QByteArray& body);

// `digits` nibble characters of the low bits of `value`, most significant first.
QByteArray NibbleText(quint32 value, int digits);
// False when a character is not a nibble character (0x30..0x3F).
bool NibbleValue(const QByteArray& text, quint32& value);

// The 16-byte reply frame; `corruptCheck` sends check characters that do not match.
QByteArray EncodeReply(const Request& request, const QByteArray& data, char status,
                       bool corruptCheck = false);

// Splits the byte stream from the program into frames, priming bytes and bytes
// that belong to no valid frame. A candidate frame that does not check is
// dropped one byte at a time, so a real frame hidden behind noise is still found.
class FrameScanner {
public:
    struct Event {
        enum Kind { Frame, Priming, Garbage };
        Kind kind = Garbage;
        Request request;   // Frame
        QByteArray bytes;  // Priming and Garbage: the bytes themselves
    };

    void feed(const QByteArray& bytes, std::vector<Event>& events);
    // Bytes of an incomplete candidate still waiting for the rest of its frame.
    int pending() const { return int(buffer_.size()); }

private:
    QByteArray buffer_;
};

// Decodes exactly 16 bytes; false unless they form a valid request frame.
bool DecodeRequest(const QByteArray& frame, Request& request);

}  // namespace kv::sim
