#pragma once
// modKV760v1: the driver of the KV760 frequency and pulse input module.

#include "drivers/driver_descriptor.h"

namespace kv {

class RequestEngine;

const DriverDescriptor& Kv760Driver();

// The dispatcher: kind 1 reading step, 2 programming step, 3 warning hand-over.
bool GS760(RequestEngine& engine, qint16 kind, QString& requester, SettingsSet& settings, qint32 id,
           qint16 busId, QString& text);

}  // namespace kv
