#include "drivers/kv718_input.h"

#include "drivers/flag_options.h"
#include "model/codec.h"
#include "model/entry_number.h"
#include "model/module_ranges.h"

#include <cmath>

namespace kv {

namespace {

constexpr double MinimumSpan = 0.2;
constexpr double SpanTolerance = 1e-9;  // 1.2 - 1.0 is a hair below 0.2 in binary
constexpr int SamplesPerTenMs = 10;

// Input couplings in the order of their code in bits 0..1 of the flag word.
struct Coupling {
    const char* unit;
    const char* rangeUnit;  // unit of the range rows it is measured with
    bool ac;                // peak values compared with the rows; bit 2 of the flag word
    quint16 flagBits;
    const char* maxBeyond;
    const char* minBeyond;
    const char* limit;
};
const Coupling couplings[] = {
    {"V", "V", false, 0x0, "MAX > +/- 200V", "Min > +/- 200V", "MAX +/- 200V"},
    {"mA", "mA", false, 0x1, "MAX > +/- 50mA", "Min > +/- 50mA", "MAX +/- 50mA"},
    {"Vac", "V", true, 0x6, "MAX > +/- 140Vac", "Min > +/- 140Vac", "MAX 140Vac"},
    {"mAac", "mA", true, 0x7, "MAX > +/- 35mAac", "Min > +/- 35mAac", "MAX 35mAac"},
};

const Coupling* couplingOf(const QString& unit) {
    for (const Coupling& coupling : couplings)
        if (unit == QLatin1String(coupling.unit))
            return &coupling;
    return nullptr;
}

// A DC row reaches from -max to max; an AC row covers its own span.
bool holds(const RangeDescriptor& row, const Coupling& coupling, double lo, double hi) {
    const double bottom = coupling.ac ? row.minimum : -double(row.maximum);
    return lo >= bottom && hi <= row.maximum;
}

int firstRowHolding(const RangeTable& table, const Coupling& coupling, double lo, double hi) {
    for (int i = 0; i < RangeEntries; ++i)
        if (table[i].unit == QLatin1String(coupling.rangeUnit) && holds(table[i], coupling, lo, hi))
            return i;
    return -1;
}

// Nearest integer after adding a half, as the module's counts are rounded.
bool toCount(double value, qint32& count) {
    return RoundToLong(value + 0.5, count);
}

}  // namespace

bool KV718InputRangeCheck(const QString& minText, const QString& maxText, const QString& unit,
                          qint32& rangeNumber, QString& message) {
    double lo = 0;
    double hi = 0;
    if (!ParseDecimal(minText, lo)) {
        message = QStringLiteral("Min not unmeric");
        return false;
    }
    if (!ParseDecimal(maxText, hi)) {
        message = QStringLiteral("Max not unmeric");
        return false;
    }
    if (hi - lo < MinimumSpan - SpanTolerance) {
        message = QStringLiteral("Max - Min < 0.2");
        return false;
    }
    if (hi == lo) {
        message = QStringLiteral("Cannot be the same");
        return false;
    }
    RangeTable table;
    if (!GetRangeTable(Kv718AMap, Input1, table)) {
        message = QStringLiteral("Failed to get range details");
        return false;
    }
    const Coupling* coupling = couplingOf(unit);
    if (!coupling) {
        message = QStringLiteral("Unknown Measure Unit: ") + unit;
        return false;
    }
    if (coupling->ac) {
        lo *= M_SQRT2;
        hi *= M_SQRT2;
    }
    const int row = firstRowHolding(table, *coupling, lo, hi);
    if (row < 0) {
        const bool maxOutOfReach = firstRowHolding(table, *coupling, hi, hi) < 0;
        message = QLatin1String(maxOutOfReach ? coupling->maxBeyond : coupling->minBeyond);
        return false;
    }
    rangeNumber = row;
    message = QLatin1String(coupling->limit);
    return true;
}

quint16 KV718FlagA(const SettingsSet& settings) {
    quint16 flags = SetOptionBits(0, settings, SingleOutputOptions);
    if (settings.Inp1Shape == QLatin1String("Table"))
        flags = SetBit(flags, FlagShapedBit);
    if (const Coupling* coupling = couplingOf(settings.Inp1MeUnit))
        flags |= coupling->flagBits;
    return flags;
}

void KV718ReadFlagA(quint16 flags, SettingsSet& settings) {
    ReadOptionBits(flags, SingleOutputOptions, settings);
    settings.Inp1Shape =
        TestBit(flags, FlagShapedBit) ? QStringLiteral("Table") : QStringLiteral("Linear");
    settings.Inp1MeUnit = QLatin1String(couplings[flags & KV718CouplingMask].unit);
}

bool KV718A_CaculateInCal(const SettingsSet& settings, const RangeTable& input, RegMap& values,
                          QString& message) {
    const QString prefix = QStringLiteral("KV718A_CaculateInCal: ");
    values.Flag_A = qint16(KV718FlagA(settings));
    if (!RoundToLong(double(settings.Inp1Samples) / SamplesPerTenMs + 1, values.ST_Samples)) {
        message = prefix + QStringLiteral("Sample time out of range");
        return false;
    }
    const Coupling* coupling = couplingOf(settings.Inp1MeUnit);
    if (!coupling)
        return true;
    if (settings.Inp1RngSet < 0 || settings.Inp1RngSet >= RangeEntries) {
        message = prefix + QStringLiteral("Invalid Input 1 Range");
        return false;
    }
    const RangeDescriptor& row = input[settings.Inp1RngSet];
    if (row.countMin == 0 || row.countMax == 0) {
        message = prefix + QStringLiteral("Update Calibration Values");
        return false;
    }
    const double cl = row.countMin;
    const double ch = row.countMax;
    const double el = row.minimum;
    const double eh = row.maximum;
    const double lo = settings.Inp1mU_Zro;
    const double hi = settings.Inp1mU_Ful;
    if ((coupling->ac && eh == el) || (!coupling->ac && eh == 0)) {
        message = prefix + QStringLiteral("Range has no span");
        return false;
    }
    qint32 miz = values.MIZ;
    qint32 zero = 0;
    qint32 full = 0;
    bool ok = false;
    if (coupling->ac) {
        const double perUnit = (ch - cl) / (eh - el);
        zero = row.countMin;
        ok = toCount((lo - el) * perUnit, miz) && toCount((hi - el) * perUnit, full);
    } else {
        // The row extended symmetrically: -max sits at 2 * CL - CH.
        const double bottom = 2 * cl - ch;
        const double perUnit = (ch - cl) / (2 * eh);
        ok = toCount(2 * (lo + eh) * perUnit + bottom, zero) &&
             toCount(2 * (hi + eh) * perUnit + bottom, full);
    }
    if (!ok) {
        message = prefix + QStringLiteral("Count out of range");
        return false;
    }
    values.MIZ = miz;
    values.Usr_In1_Z = zero;
    values.Usr_In1_F = full;
    return true;
}

qint32 KV718SamplesMs(qint32 samples) {
    return (samples - 1) * SamplesPerTenMs;
}

}  // namespace kv
