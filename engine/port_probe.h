#pragma once
// The port search of the connection settings (and of kv700-cli probe): one read
// of the module type on each COM port, outside the request engine.

#include <QByteArray>
#include <QString>

#include <optional>

namespace kv {

constexpr qint16 FirstProbedPort = 1;
constexpr qint16 LastProbedPort = 30;

// The list entry of one probed port: "Com<N> <model>" when the module replied;
// nothing for an error starting with "%" (no such port); "Com<N>" and the error
// for one starting with "/" (the port exists but cannot be used); else "Com<N>".
std::optional<QString> ProbeEntryText(qint16 port, bool replied, const QByteArray& reply,
                                      const QString& error);

// Probes COM `port` with the given adapter type; `error` is the exchange's text.
std::optional<QString> ProbePort(qint16 port, qint16 connector, QString& error);

}  // namespace kv
