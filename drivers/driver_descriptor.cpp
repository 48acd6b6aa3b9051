#include "drivers/driver_descriptor.h"

#include <QtMath>

namespace kv {

int RegisterRef::address(const RegMap& addresses) const {
    if (long_)
        return addresses.*long_;
    if (int_)
        return addresses.*int_;
    if (single_)
        return qRound(addresses.*single_);
    return -1;
}

double RegisterRef::value(const RegMap& values) const {
    if (long_)
        return values.*long_;
    if (int_)
        return values.*int_;
    if (single_)
        return double(values.*single_);
    return 0.0;
}

}  // namespace kv
