#pragma once
// Self-test of a programming adapter of the primed type: after ten priming
// blocks and one read request its output must stop 40 to 200 ms after the
// request and contain a valid reply.

#include <QByteArray>
#include <QString>

namespace kv::KvSerialPort {

struct AdapterTestOutcome {
    bool passed = false;
    QString report;  // "PASS KV705 !!! 104 mS " or "FAIL KV705 " + reason
};

// The read request of the module type on bus 16, the test's usual message.
QByteArray AdapterTestMessage();

// Runs the test on `port`; the report also goes out as a level-2 diagnostic,
// which puts it on the status line.
AdapterTestOutcome TestAdapter(qint16 port, const QByteArray& message);

}  // namespace kv::KvSerialPort
