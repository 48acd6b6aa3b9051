#pragma once
// What the connection settings window lists for one probed COM port.

#include <QByteArray>
#include <QString>

#include <optional>

namespace kv {

constexpr int FirstProbedPort = 1;
constexpr int LastProbedPort = 30;

// One read of the module type (register 255, bus ID 16) on COM `port`.
// Reply: "Com<N> <model>"; an error starting with "%" (no such port): nothing;
// one starting with "/": "Com<N>" and the error; otherwise "Com<N>".
std::optional<QString> ProbeEntryText(qint16 port, bool replied, const QByteArray& reply,
                                      const QString& error);

// The device behind COM `port` (and where its link points), marked when the
// user may not open it.
QString ProbeDeviceNote(qint16 port, const QString& error);
bool ProbeDeniedAccess(const QString& error);
// What to do about a port the user may not open.
QString PermissionAdvice(qint16 port);

// Probes COM `port` with the given adapter type, outside the request engine.
std::optional<QString> ProbePort(qint16 port, qint16 connector, QString& error);

}  // namespace kv
