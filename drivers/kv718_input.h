#pragma once
// The KV718-xA input: the check that chooses the input range for a measured
// range, the flag word, and the input calibration worked out at the start of a
// programming run. DC inputs are bipolar: a range row 0..max is used as -max..max.

#include "model/range_table.h"
#include "model/register_map.h"
#include "model/settings_set.h"

#include <QString>

namespace kv {

// Checks a measured range typed for the input, in one of the units "V", "mA",
// "Vac", "mAac", and chooses the first input 1 range that holds it. On success
// rangeNumber is that range and message the unit's limit ("MAX +/- 200V"); on
// failure message says why.
bool KV718InputRangeCheck(const QString& minText, const QString& maxText, const QString& unit,
                          qint32& rangeNumber, QString& message);

// The register map of the KV718-xA.

// Bits 0..1 of the flag word: the input coupling, 0 DC volts, 1 DC milliamperes,
// 2 AC volts, 3 AC milliamperes.
constexpr quint16 KV718CouplingMask = 0x3;

// The flag word of a record: the choices, the shape and the input coupling.
quint16 KV718FlagA(const SettingsSet& settings);
// The record fields a flag word gives back: choices, shape and unit.
void KV718ReadFlagA(quint16 flags, SettingsSet& settings);

// Rebuilds Flag_A and computes ST_Samples, MIZ (AC only), Usr_In1_Z and
// Usr_In1_F into values from the record and the input 1 range table.
bool KV718A_CaculateInCal(const SettingsSet& settings, const RangeTable& input, RegMap& values,
                          QString& message);

// The sampling time a ST_Samples count stands for, in milliseconds.
qint32 KV718SamplesMs(qint32 samples);

}  // namespace kv
