#include "drivers/driver_list.h"

#include "drivers/kv720_driver.h"

#include <cstring>

namespace kv {

namespace {
const DriverDescriptor* const drivers[] = {
    &Kv720Driver(),
};
}  // namespace

DriverList AllDrivers() {
    return {drivers, int(std::size(drivers))};
}

const DriverDescriptor* DriverForMap(int map) {
    for (const DriverDescriptor* driver : AllDrivers())
        if (driver->family == map)
            return driver;
    return nullptr;
}

const DriverDescriptor* WindowDriverForMap(const DriverDescriptor& window, int map) {
    return WindowDriverForMap(AllDrivers(), window, map);
}

const DriverDescriptor* WindowDriverForMap(const DriverList& drivers,
                                           const DriverDescriptor& window, int map) {
    int sameWindow = 0;
    for (const DriverDescriptor* driver : drivers) {
        if (std::strcmp(driver->run.window, window.run.window) != 0)
            continue;
        ++sameWindow;
        if (driver->family == map)
            return driver;
    }
    return sameWindow <= 1 ? &window : nullptr;
}

}  // namespace kv
