#pragma once
// modKV7146v2: the driver of the second-version KV714 (one output; also the
// KV718 "-10"/"-20", which share its register map) and KV716 (two outputs).
// One dispatcher per model; both share the driver's working values and steps.

#include "drivers/driver_descriptor.h"

namespace kv {

class RequestEngine;

const DriverDescriptor& Kv714v2Driver();
const DriverDescriptor& Kv716v2Driver();

bool GS714v2(RequestEngine& engine, qint16 kind, QString& requester, SettingsSet& settings,
             qint32 id, qint16 busId, QString& text);
bool GS716v2(RequestEngine& engine, qint16 kind, QString& requester, SettingsSet& settings,
             qint32 id, qint16 busId, QString& text);

}  // namespace kv
