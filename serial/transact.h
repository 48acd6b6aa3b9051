#pragma once
// One request/reply exchange with a module: open the port, send one frame,
// read until the echoing reply arrives or the read budget is used, close.

#include <QByteArray>
#include <QString>

namespace kv::KvSerialPort {

class PortHandle;

// Adapter types of the connection settings; the second needs priming blocks.
enum Connector : qint16 { ConnectorPlain = 0, ConnectorPrimed = 1 };

constexpr int ReadBudget = 20;       // read cycles for "R" and "W"
constexpr int TableReadBudget = 50;  // read cycles for a table step "T"

// `message` is 12 characters: command ("R", "W" or "T"), bus ID, address,
// 8 data characters, "F". A "T" step goes out as "W"; if it gets no reply within
// its budget it counts as done and `reply` is the message itself.
// `error` is written only on the failures that carry a text; a plain time-out
// returns false with `error` untouched. `portFault` is true when the port could
// not be opened or the command is unknown: the caller closes the connection.
bool Transact(qint16 port, const QByteArray& message, qint16 connector, bool debug,
              QByteArray& reply, QString& error, bool& portFault);

// Writes the 16-byte frame; the texts of a failed or short write are the
// exchange's own, shared with the adapter self-test.
bool SendFrame(PortHandle& handle, const QByteArray& frame, QString& error);
// Writes `blocks` priming blocks, which the primed adapter needs to pass data on.
bool SendPriming(PortHandle& handle, int blocks, QString& error);
// Reads up to one frame's length into `buffer`; `count` may be 0.
bool ReceiveBlock(PortHandle& handle, char* buffer, int& count, QString& error);
// Milliseconds with at least three digits followed by `pattern`: "026 +".
QString MillisecondsText(qint64 ms, const char* pattern);

}  // namespace kv::KvSerialPort
