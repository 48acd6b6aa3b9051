#include "drivers/kv720_input.h"

#include "drivers/kv720_codes.h"
#include "model/codec.h"
#include "model/linearisation.h"

#include <cmath>

namespace kv {

namespace {

// Limits of the input amplifier, mV.
constexpr float MaxSpan = 500.0f;
constexpr float MinInput = -250.0f;
constexpr float MaxInput = 624.0f;
constexpr int FirstInputRange = 1;
constexpr int LastInputRange = 8;
constexpr double SmallRangeLimit = 200.0;  // ranges up to this take an offset of 125 %
constexpr double SmallRangeOffset = 1.25;
constexpr double LargeRangeOffset = 0.5;
constexpr double NegativeOffset = 0.5;

// Sensors at the amplifier.
constexpr float ThermocoupleExcitation = 0.001f;  // mA
constexpr float Pt100Excitation = 0.8f;           // mA
constexpr float Pt1000Excitation = 0.2f;          // mA
constexpr float Pt100Offset = 10.0f;              // ohms below 100 still measured: 10 * 0.8 = 8 mV
constexpr float PotExcitation = 0.5f;             // V
constexpr double PotFullScale = 500.0;            // mV across the whole track
constexpr double MaxResistance = 50000.0;
constexpr double MinResistance = 1.0;

// Excitation limits.
constexpr float MaxCurrent = 10.8f;  // mA
constexpr float MinCurrent = 0.01f;
constexpr float MaxVoltage = 16.0f;  // V
constexpr float MinVoltage = 0.1f;

// Input calibration counts.
constexpr double CountScale = 3500.0;
constexpr double ZeroOffsetCount = 200.0;
constexpr double PositiveOffsetCount = 25.0;
constexpr double PositiveLimitCount = 175.0;

constexpr float CurrentBandLimit = 0.8f;  // mA; above it the high current band
constexpr float VoltageBandLimit = 3.2f;  // V; from it the high voltage band

// One excitation band: value = (count - zero) / (full - zero) * span + start.
struct AuxBand {
    bool current;
    bool high;
    double start;
    double span;
    RegField zero;
    RegField full;
};

const AuxBand auxBands[] = {
    {true, false, 0.05, 0.75, KV_REG(IS_ZS1), KV_REG(IS_FS1)},
    {true, true, 0.8, 9.2, KV_REG(IS_ZS2), KV_REG(IS_FS2)},
    {false, false, 0.5, 2.5, KV_REG(VS_ZS1), KV_REG(VS_FS1)},
    {false, true, 3.0, 12.0, KV_REG(VS_ZS2), KV_REG(VS_FS2)},
};

const AuxBand& bandOf(bool current, bool high) {
    for (const AuxBand& band : auxBands)
        if (band.current == current && band.high == high)
            return band;
    return auxBands[0];
}

bool fail(QString& text, const QString& message) {
    text = message;
    return false;
}

bool isLinear(const SettingsSet& settings) {
    return settings.Inp1Shape == QLatin1String("Linear");
}

void straightTable1(SettingsSet& settings) {
    for (int i = 0; i <= Table1LastUsed; ++i)
        settings.Table1[i] = i * (Table1FullScale / Table1LastUsed);
    TableChecksum(settings.Table1.data(), Table1LastUsed);
}

bool sensorInput(SettingsSet& settings, double& low, double& high, QString& text) {
    settings.Inp1EngZro = settings.Inp1mU_Zro;
    settings.Inp1EngFul = settings.Inp1mU_Ful;
    return BuildSensorTable(settings.Table1, low, high, settings.Inp1EngZro, settings.Inp1EngFul,
                            settings.Inp1Shape, settings.Inp1EngUnt, text);
}

bool rtdInput(SettingsSet& settings, DriverWork& work, QString& text) {
    double low = 0.0;
    double high = 0.0;
    if (!sensorInput(settings, low, high, text))
        return false;
    const QString shape = settings.Inp1Shape.toUpper();
    double nominal = 0.0;
    if (shape == QLatin1String("PT1000.")) {
        settings.AuxVmA = Pt1000Excitation;
        nominal = 1000.0;
    } else if (shape == QLatin1String("PT100.")) {
        settings.AuxVmA = Pt100Excitation;
        nominal = 100.0;
        work.DrvInOffset = Pt100Offset * Pt100Excitation;
    } else {
        return fail(text, QStringLiteral("? Input Type"));
    }
    settings.AuxIsI = 1;
    work.DrvInLo = float((low - nominal) * double(settings.AuxVmA));
    work.DrvInHi = float((high - nominal) * double(settings.AuxVmA));
    return true;
}

bool resistanceInput(SettingsSet& settings, DriverWork& work, QString& text) {
    settings.AuxIsI = 1;
    double scale = 1.0;
    if (settings.Inp1MeUnit == QLatin1String("kohm"))
        scale = 1000.0;
    else if (settings.Inp1MeUnit != QLatin1String("ohm"))
        return fail(text, QStringLiteral("? Measurement Units"));
    const double low = double(settings.Inp1mU_Zro) * scale;
    const double high = double(settings.Inp1mU_Ful) * scale;
    if (high < MinResistance)
        return fail(text, QStringLiteral("Resistance is too low (1R min)"));
    if (high > MaxResistance)
        return fail(text, QStringLiteral("Resistance is too high (50 kmax)"));
    // The excitation puts K mV across the top of the range.
    const double k = high < 10.0 ? 10.0 : high < 100.0 ? 50.0 : 500.0;
    const double current = k / high;
    settings.AuxVmA = float(current);
    work.DrvInLo = float(low * current);
    work.DrvInHi = float(high * current);
    return true;
}

bool potentiometerInput(SettingsSet& settings, DriverWork& work, QString& text) {
    settings.AuxVmA = PotExcitation;
    settings.AuxIsI = 0;
    if (settings.Inp1MeUnit != QLatin1String("%Pot"))
        return fail(text, QStringLiteral("? Measurement Units"));
    if (!(settings.Inp1mU_Zro >= 0.0f && settings.Inp1mU_Zro < settings.Inp1mU_Ful &&
          settings.Inp1mU_Ful <= 100.0f))
        return fail(text, QStringLiteral("Measurement input must be between 0 and 100%"));
    work.DrvInLo = float(double(settings.Inp1mU_Zro) / 100.0 * PotFullScale);
    work.DrvInHi = float(double(settings.Inp1mU_Ful) / 100.0 * PotFullScale);
    return true;
}

bool inputRange(SettingsSet& settings, DriverWork& work, QString& text) {
    switch (settings.Inp1RngTyp) {
    case Kv720MilliVolt:
    case Kv720StrainGauge:
        work.DrvInLo = settings.Inp1mU_Zro;
        work.DrvInHi = settings.Inp1mU_Ful;
        return Kv720MilliVoltChecks(work.DrvInLo, work.DrvInHi, text);
    case Kv720Thermocouple: {
        settings.AuxVmA = ThermocoupleExcitation;
        settings.AuxIsI = 1;
        double low = 0.0;
        double high = 0.0;
        if (!sensorInput(settings, low, high, text))
            return false;
        work.DrvInLo = float(low);
        work.DrvInHi = float(high);
        return true;
    }
    case Kv720Rtd3Wire:
    case Kv720Rtd4Wire:
    case Kv720Rtd2Wire:
        return rtdInput(settings, work, text);
    case Kv720Resistance:
        return resistanceInput(settings, work, text);
    case Kv720Potentiometer:
        return potentiometerInput(settings, work, text);
    default:
        return fail(text, QStringLiteral("ms.Inp1RngTyp ?"));
    }
}

// Input channel: 3 single-ended, 4 differential; impedance: 1 normal, or the
// channel value when the loading option is on.
void inputChannel(const SettingsSet& settings, DriverWork& work) {
    const qint32 type = settings.Inp1RngTyp;
    const bool differential =
        type == Kv720StrainGauge || (type == Kv720MilliVolt && settings.Typ1Differ != 0);
    work.DrvInCh = differential ? 4 : 3;
    const bool loadingOffered =
        type == Kv720MilliVolt || type == Kv720Thermocouple || type == Kv720StrainGauge;
    work.DrvInRes = loadingOffered && settings.Typ1InRes != 0 ? work.DrvInCh : 1;
}

}  // namespace

bool Kv720MilliVoltChecks(float inLo, float inHi, QString& text) {
    if (inHi - inLo > MaxSpan)
        return fail(text, QStringLiteral("Maximum input range is 500mV"));
    if (inLo < MinInput)
        return fail(text, QStringLiteral("Minimum input is -250mV"));
    if (inHi > MaxInput)
        return fail(text, QStringLiteral("Maximum input is 624mV"));
    if (inHi < inLo)
        return fail(text, QStringLiteral("Min must be < Max"));
    return true;
}

bool Kv720AuxChecks(const SettingsSet& settings, QString& text) {
    const float aux = settings.AuxVmA;
    if (settings.AuxIsI == 1) {
        if (aux > MaxCurrent)
            return fail(text, QStringLiteral("Auxilary 10.8mA maximum"));
        if (settings.Inp1RngTyp != Kv720Thermocouple && aux < MinCurrent)
            return fail(text, QStringLiteral("Auxilary 0.01mA (10uA) minimum"));
        return true;
    }
    if (aux > MaxVoltage)
        return fail(text, QStringLiteral("Auxilary 16V maximum"));
    if (aux < MinVoltage)
        return fail(text, QStringLiteral("Auxilary 0.1V minimum"));
    return true;
}

bool Kv720StartInput(SettingsSet& settings, DriverWork& work, QString& text) {
    work.DrvInOffset = 0.0f;
    if (!inputRange(settings, work, text))
        return false;
    const qint32 type = settings.Inp1RngTyp;
    const bool ownTable = type == Kv720MilliVolt || type == Kv720Resistance ||
                          type == Kv720Potentiometer || type == Kv720StrainGauge;
    if (ownTable && isLinear(settings))
        straightTable1(settings);
    if (!Kv720AuxChecks(settings, text))
        return false;
    inputChannel(settings, work);
    return true;
}

bool Kv720SelectInputRange(const RangeTable& input1, float inLo, float inHi, float offset,
                           qint32& row, QString& text) {
    const double width = double(inHi) - double(inLo) + double(offset);
    const double bottom = double(inLo) + double(offset);
    int i = FirstInputRange;
    for (; i <= LastInputRange; ++i) {
        const double full = input1[i].maximum;
        if (width > full)
            continue;
        const bool fits =
            bottom > 0.0
                ? bottom <= (full <= SmallRangeLimit ? SmallRangeOffset : LargeRangeOffset) * full
                : bottom >= -NegativeOffset * full;
        if (fits) {
            row = i;
            return true;
        }
    }
    return fail(text, QStringLiteral("Maximum input 624mV and maximum offset is 50% of range.") +
                          QString::number(i));
}

bool Kv720InputCalibration(double rangeFull, const RegMap& factory, double inLo, double inHi,
                           Kv720InputCounts& counts, QString& text) {
    const double gain = double(factory.CIN_F) - double(factory.CIN_Z);
    const double positive = factory.SLOP_P;
    const double negative = factory.SLOP_N;
    if (rangeFull <= 0.0 || gain == 0.0 || positive == 0.0 || negative == 0.0)
        return fail(text, QStringLiteral("Invalid Input Cal Values"));
    if (inLo <= 0.0) {
        const double c = -inLo / rangeFull * gain;
        counts.offsetBit = true;
        counts.zero = c / negative * CountScale + ZeroOffsetCount;
    } else {
        const double c = inLo / rangeFull * gain;
        const double limit = PositiveLimitCount / CountScale * negative;
        if (c <= limit) {
            counts.offsetBit = true;
            counts.zero = ZeroOffsetCount - c / negative * CountScale;
        } else {
            counts.offsetBit = false;
            const double k = rangeFull / gain * limit;
            counts.zero =
                ((inLo - k) / rangeFull * gain) / positive * CountScale + PositiveOffsetCount;
        }
    }
    counts.full = (inHi - inLo) / rangeFull * gain + factory.CIN_Z;
    return true;
}

double Kv720AuxCount(const SettingsSet& settings, const RegMap& factory, quint16& flags) {
    const bool current = settings.AuxIsI == 1;
    const bool high =
        current ? settings.AuxVmA > CurrentBandLimit : settings.AuxVmA >= VoltageBandLimit;
    flags = current ? ClearBit(flags, Kv720VoltageBit) : SetBit(flags, Kv720VoltageBit);
    flags = high ? SetBit(flags, Kv720HighBandBit) : ClearBit(flags, Kv720HighBandBit);
    const AuxBand& band = bandOf(current, high);
    const double zero = band.zero.value(factory);
    const double full = band.full.value(factory);
    return (double(settings.AuxVmA) - band.start) / band.span * (full - zero) + zero;
}

bool Kv720AuxFromCount(qint32 count, quint16 flags, const RegMap& factory, float& value,
                       qint32& isCurrent) {
    const bool current = !TestBit(flags, Kv720VoltageBit);
    isCurrent = current ? 1 : 0;
    const AuxBand& band = bandOf(current, TestBit(flags, Kv720HighBandBit));
    const double zero = band.zero.value(factory);
    const double full = band.full.value(factory);
    if (full == zero)
        return false;
    const double exact = (double(count) - zero) / (full - zero) * band.span + band.start;
    // Entered to the thousandth; the count's resolution is finer.
    value = float(std::round(exact * 1000.0) / 1000.0);
    return true;
}

}  // namespace kv
