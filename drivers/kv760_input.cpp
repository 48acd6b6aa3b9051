#include "drivers/kv760_input.h"

#include "drivers/flag_options.h"
#include "model/codec.h"
#include "model/entry_number.h"

#include <cmath>

namespace kv {

namespace {

constexpr int SensorShift = 4;
constexpr qint32 SensorMask = 7;
constexpr int KiloHertzBit = 7;
constexpr int TableBit = 0;
constexpr float HertzPerKiloHertz = 1000.0f;

constexpr qint32 HighVoltageSensor = 7;
constexpr float HighVoltageDivider = 0.0068f;  // the HI input's attenuation
constexpr qint32 InductiveSensor = 5;
constexpr double CountsPerVolt = 9930;

// Trigger sensitivity bands and the count gain of each. A level up to
// SensitiveUpTo takes the most sensitive band, one below MiddleBelow the middle one.
struct TriggerBand {
    quint16 bits;
    double gain;
};
const TriggerBand sensitiveBand{0x3, 10};
const TriggerBand middleBand{0x1, 5};
const TriggerBand plainBand{0x0, 1};
constexpr float SensitiveUpTo = 0.2f;
constexpr float MiddleBelow = 0.4f;

// Excitation sources: value at the factory's zero-scale count and the span to full scale.
constexpr double CurrentZeroMa = 0.2;
constexpr double CurrentSpanMa = 19.8;
constexpr double VoltageZeroV = 0.15;
constexpr double VoltageSpanV = 14.85;

const FlagOption options[] = {
    {&SettingsSet::Inp1Respon, KV760FilterBit}, {&SettingsSet::RemoteCont, FlagRemoteBit},
    {&SettingsSet::DirecrReve, FlagReverseBit}, {&SettingsSet::UserLmtEna, FlagLimitsBit},
    {&SettingsSet::TrigMode, KV760TrigModeBit},
};

// Sensor types whose input has its load switched in (bit 2 of the flag word).
bool loaded(qint32 sensor, qint32 loading) {
    switch (sensor) {
    case 2:
    case 3:
    case 4:
    case HighVoltageSensor:
        return true;
    case InductiveSensor:
        return loading == 1;
    default:
        return false;
    }
}

float dividerOf(qint32 sensor) {
    return sensor == HighVoltageSensor ? HighVoltageDivider : 1.0f;
}

const TriggerBand& bandOf(float level) {
    if (level <= SensitiveUpTo)
        return sensitiveBand;
    if (level < MiddleBelow)
        return middleBand;
    return plainBand;
}

const TriggerBand& bandOfFlags(quint16 flags) {
    if ((flags & sensitiveBand.bits) == sensitiveBand.bits)
        return sensitiveBand;
    if (flags & middleBand.bits)
        return middleBand;
    return plainBand;
}

bool sourceCount(double value, double zeroValue, double span, qint32 zeroCount, qint32 fullCount,
                 qint32& count) {
    return RoundToLong(
        (value - zeroValue) / span * (double(fullCount) - zeroCount) + zeroCount + 0.5, count);
}

bool sourceValue(qint32 count, double zeroValue, double span, qint32 zeroCount, qint32 fullCount,
                 float& value) {
    if (fullCount == zeroCount)
        return false;
    const double exact =
        (double(count) - zeroCount) / (double(fullCount) - zeroCount) * span + zeroValue;
    value = float(std::nearbyint(exact * 100) / 100);
    return true;
}

}  // namespace

bool KV760StartValues(const SettingsSet& settings, const RegMap& factory, KV760Input& input,
                      QString& message) {
    quint16 typeInUnit = quint16((settings.Inp1RngTyp & SensorMask) << SensorShift);
    float scale = 1.0f;
    if (settings.Inp1MeUnit == QLatin1String("kHz")) {
        typeInUnit = SetBit(typeInUnit, KiloHertzBit);
        scale = HertzPerKiloHertz;
    } else if (settings.Inp1MeUnit != QLatin1String("Hz")) {
        message = QStringLiteral("Input Unit ? :") + settings.Inp1MeUnit;
        return false;
    }
    if (settings.Inp1Shape == QLatin1String("Table")) {
        typeInUnit = SetBit(typeInUnit, TableBit);
    } else if (settings.Inp1Shape != QLatin1String("Linear")) {
        message = QStringLiteral("Input Shape ? :") + settings.Inp1Shape;
        return false;
    }
    if (settings.Inp1RngTyp < KV760FirstSensor || settings.Inp1RngTyp > KV760LastSensor) {
        message = QStringLiteral("Input ? Sensor ? :") + QString::number(settings.Inp1RngTyp);
        return false;
    }
    // In single precision, as the level was entered: 0.2 V must take the sensitive band.
    const float level = dividerOf(settings.Inp1RngTyp) * settings.TrigLevel;
    const TriggerBand& band = bandOf(level);
    quint16 flags = band.bits;
    if (loaded(settings.Inp1RngTyp, settings.Typ1InRes))
        flags = SetBit(flags, KV760LoadingBit);
    flags = SetOptionBits(flags, settings, options);

    KV760Input result;
    result.typeInUnit = qint16(typeInUnit);
    result.flagA = qint16(flags);
    result.lowHz = settings.Inp1mU_Zro * scale;
    result.highHz = settings.Inp1mU_Ful * scale;
    const bool counted = RoundToLong(double(level) * CountsPerVolt * band.gain, result.trigLevel) &&
                         sourceCount(settings.AuxImA, CurrentZeroMa, CurrentSpanMa, factory.IS_ZS1,
                                     factory.IS_FS1, result.auxCurrent) &&
                         sourceCount(settings.AuxVmA, VoltageZeroV, VoltageSpanV, factory.VS_ZS1,
                                     factory.VS_FS1, result.auxVoltage);
    if (!counted) {
        message = QStringLiteral("Input ? Count out of range");
        return false;
    }
    input = result;
    return true;
}

void KV760ReadInput(const RegMap& values, SettingsSet& settings, QString& warning) {
    const quint16 typeInUnit = quint16(values.Type_In_Unit);
    const quint16 flags = quint16(values.Flag_A);
    settings.Inp1RngTyp = (typeInUnit >> SensorShift) & SensorMask;
    const bool kiloHertz = TestBit(typeInUnit, KiloHertzBit);
    const float scale = kiloHertz ? HertzPerKiloHertz : 1.0f;
    settings.Inp1MeUnit = kiloHertz ? QStringLiteral("kHz") : QStringLiteral("Hz");
    settings.Inp1mU_Zro = values.Meas_Unit_Z / scale;
    settings.Inp1mU_Ful = values.Meas_Unit_F / scale;
    settings.Inp1Shape =
        TestBit(typeInUnit, TableBit) ? QStringLiteral("Table") : QStringLiteral("Linear");

    ReadOptionBits(flags, options, settings);
    settings.Typ1InRes =
        settings.Inp1RngTyp == InductiveSensor && TestBit(flags, KV760LoadingBit) ? 1 : 0;
    const double level = values.Trig_Level / (CountsPerVolt * bandOfFlags(flags).gain) /
                         dividerOf(settings.Inp1RngTyp);
    settings.TrigLevel = float(std::nearbyint(level * 100) / 100);

    const bool current = sourceValue(values.Aux_C, CurrentZeroMa, CurrentSpanMa, values.IS_ZS1,
                                     values.IS_FS1, settings.AuxImA);
    const bool voltage = sourceValue(values.Aux_V, VoltageZeroV, VoltageSpanV, values.VS_ZS1,
                                     values.VS_FS1, settings.AuxVmA);
    if (!current || !voltage)
        warning += QStringLiteral("kv760AuxRead failed , ");
}

}  // namespace kv
