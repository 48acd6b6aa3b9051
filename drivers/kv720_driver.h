#pragma once
// modKV720: the driver of the KV720 universal input module.

#include "drivers/driver_descriptor.h"

namespace kv {

class RequestEngine;

const DriverDescriptor& Kv720Driver();

// The dispatcher: kind 1 reading step, 2 programming step, 3 warning hand-over.
bool GS720(RequestEngine& engine, qint16 kind, QString& requester, SettingsSet& settings, qint32 id,
           qint16 busId, QString& text);

}  // namespace kv
