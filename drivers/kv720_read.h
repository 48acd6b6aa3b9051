#pragma once
// Decoding a KV720 read (RegVal) into a settings record. Problems are appended
// to the driver's warning text and do not stop the read.

#include "drivers/driver_descriptor.h"
#include "model/settings_set.h"

namespace kv {

void Kv720DecodeRead(SettingsSet& settings, DriverWork& work);

}  // namespace kv
