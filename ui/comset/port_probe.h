#pragma once
// What the connection settings window shows beside a probed COM port.

#include "engine/port_probe.h"

#include <QString>

namespace kv {

// The device behind COM `port` (and where its link points), marked when the
// user may not open it.
QString ProbeDeviceNote(qint16 port, const QString& error);
bool ProbeDeniedAccess(const QString& error);
// What to do about a port the user may not open.
QString PermissionAdvice(qint16 port);

}  // namespace kv
