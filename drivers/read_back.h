#pragma once
// What a read of the KV760, KV714/KV716 and KV718-xA gives back the same way.

#include "model/register_map.h"
#include "model/settings_set.h"

namespace kv {

// The module's type code, serial number, bus ID and revision.
void ReadModuleIdentity(const RegMap& values, SettingsSet& settings);
// Table 1 when its checksum holds; a failed checksum has already been reported
// as a warning of the read, and the record keeps its own table.
void ReadTable1(const RegMap& values, SettingsSet& settings);

}  // namespace kv
