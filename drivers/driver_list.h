#pragma once
// The one list of model drivers that the settings windows and the command-line
// tool consult. A new driver adds its descriptor to the array in driver_list.cpp.

#include "drivers/driver_descriptor.h"

namespace kv {

struct DriverList {
    const DriverDescriptor* const* first;
    int count;
    const DriverDescriptor* const* begin() const { return first; }
    const DriverDescriptor* const* end() const { return first + count; }
};

DriverList AllDrivers();

// The driver of a register map (ModuleMap), or nullptr when no driver serves it.
const DriverDescriptor* DriverForMap(int map);

// The driver that a run of `window`'s driver forwards to for the map: the
// window's driver of that family; for a window with one driver, that driver
// whatever the map (its model check then names the wrong module); nullptr
// when a window with several drivers has none for the map.
const DriverDescriptor* WindowDriverForMap(const DriverDescriptor& window, int map);
// The same choice among `drivers`.
const DriverDescriptor* WindowDriverForMap(const DriverList& drivers,
                                           const DriverDescriptor& window, int map);

}  // namespace kv
