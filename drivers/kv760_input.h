#pragma once
// The KV760 frequency and pulse input: what a programming run works out from
// the settings record before its first write, and how a read gives it back.

#include "model/register_map.h"
#include "model/settings_set.h"

#include <QString>

namespace kv {

// Sensor types of the input, Inp1RngTyp 1..7.
constexpr qint32 KV760FirstSensor = 1;
constexpr qint32 KV760LastSensor = 7;

// Flag_A bits of the KV760 besides the output bits of drivers/flag_options.h;
// bits 0 and 1 hold the trigger band.
enum KV760FlagBit {
    KV760LoadingBit = 2,   // the input's load is switched in
    KV760FilterBit = 3,    // input filter on
    KV760TrigModeBit = 7,  // trigger mode
};

struct KV760Input {
    qint16 typeInUnit = 0;  // sensor type in bits 4..6, kHz bit 7, table bit 0
    qint16 flagA = 0;
    qint32 trigLevel = 0;  // trigger count of the chosen sensitivity band
    float lowHz = 0;
    float highHz = 0;
    qint32 auxCurrent = 0;  // excitation counts against the factory's source calibration
    qint32 auxVoltage = 0;
};

// factory holds the excitation calibration IS_ZS1, IS_FS1, VS_ZS1, VS_FS1.
bool KV760StartValues(const SettingsSet& settings, const RegMap& factory, KV760Input& input,
                      QString& message);

// The input fields of the record from the registers read back: sensor type,
// unit and range, shape, choices, trigger level and excitation. Problems are
// appended to warning.
void KV760ReadInput(const RegMap& values, SettingsSet& settings, QString& warning);

}  // namespace kv
