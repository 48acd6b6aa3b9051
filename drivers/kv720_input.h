#pragma once
// The KV720's computations for a programming run: the input range at the
// amplifier and the excitation from the settings, the checks on them, the
// input range row, the input calibration counts from the factory values, and
// the excitation count (and back, for a read).

#include "drivers/driver_descriptor.h"
#include "model/range_table.h"
#include "model/register_map.h"
#include "model/settings_set.h"

#include <QString>

namespace kv {

// Start of a programming run: DrvInLo, DrvInHi, DrvInOffset, DrvInCh, DrvInRes,
// the excitation, and table 1 for the input type. May change the settings'
// excitation, engineering range and table 1 as the input type demands.
bool Kv720StartInput(SettingsSet& settings, DriverWork& work, QString& text);

bool Kv720MilliVoltChecks(float inLo, float inHi, QString& text);
bool Kv720AuxChecks(const SettingsSet& settings, QString& text);

// The first of rows 1..8 of the input 1 range table that takes the input.
bool Kv720SelectInputRange(const RangeTable& input1, float inLo, float inHi, float offset,
                           qint32& row, QString& text);

struct Kv720InputCounts {
    double zero = 0.0;
    double full = 0.0;
    bool offsetBit = false;  // bit 0 of the control flags
};
// Zero and full counts of the input from the range's full scale (mV), the
// factory values and the input range at the amplifier.
bool Kv720InputCalibration(double rangeFull, const RegMap& factory, double inLo, double inHi,
                           Kv720InputCounts& counts, QString& text);

// Excitation count for the settings' excitation, with bits 4 and 5 of the flags.
double Kv720AuxCount(const SettingsSet& settings, const RegMap& factory, quint16& flags);
// The excitation back from a count and the flags; false when the factory
// values of the band are equal.
bool Kv720AuxFromCount(qint32 count, quint16 flags, const RegMap& factory, float& value,
                       qint32& isCurrent);

}  // namespace kv
