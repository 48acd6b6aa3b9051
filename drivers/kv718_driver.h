#pragma once
// modKV718vA: the driver of the KV718-xA AC/DC voltage and current input
// module. Its input range check (KV718InputRangeCheck) is in kv718_input.h.

#include "drivers/driver_descriptor.h"

namespace kv {

class RequestEngine;

const DriverDescriptor& Kv718Driver();

bool GS718vA(RequestEngine& engine, qint16 kind, QString& requester, SettingsSet& settings,
             qint32 id, qint16 busId, QString& text);

}  // namespace kv
