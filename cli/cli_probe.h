#pragma once
// The port probe of the connection settings: one module-type read on each of
// COM1 to COM30, listed the way the settings window lists them.

#include <QByteArray>
#include <QString>

namespace kv::cli {

constexpr qint16 FirstProbedPort = 1;
constexpr qint16 LastProbedPort = 30;

// The list entry of one probed port, or "" for a port that does not exist.
// `reply` is the 12-character reply when `answered`, `error` the exchange's text.
QString ProbeEntry(qint16 port, bool answered, const QByteArray& reply, const QString& error);

// Probes every port with the given adapter type; one entry per line.
QString ProbePorts(qint16 connector);

}  // namespace kv::cli
