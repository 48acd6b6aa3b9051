#include "model/module_ranges.h"

namespace kv {

namespace {

constexpr int mapBit(int map) {
    return 1 << map;
}
constexpr int Maps147 = mapBit(1) | mapBit(4) | mapBit(7);
constexpr int Maps25 = mapBit(2) | mapBit(5);
constexpr int Map3 = mapBit(3);
constexpr int Map6 = mapBit(6);

bool rangesInPairs(int map) {
    return map != 3;
}

struct RangeRow {
    int maps;
    int channel;
    int reg;  // the even register of a pair
    int range;
    float minimum;
    float maximum;
    const char* unit;
};

// Ranges offered by the module families, as the modules number their range registers.
// clang-format off
const RangeRow rangeRows[] = {
    {Maps147, Input1,  16,  1, 0, 1,   "mA"},
    {Maps147, Input1,  18,  2, 0, 10,  "mA"},
    {Maps147, Input1,  20,  3, 0, 20,  "mA"},
    {Maps147, Input1,  22,  4, 4, 20,  "mA"},
    {Maps147, Input1,  24,  5, 0, 50,  "mA"},
    {Maps147, Input1,  26,  6, 0, 1,   "V"},  // map 7's span starts here
    {Maps147, Input1,  28,  7, 0, 2,   "V"},
    {Maps147, Input1,  30,  8, 0, 5,   "V"},
    {Maps147, Input1,  32,  9, 1, 5,   "V"},
    {Maps147, Input1,  34, 10, 0, 10,  "V"},
    {Maps147, Input1,  36, 11, 2, 10,  "V"},
    {Maps147, Input1,  38, 12, 0, 20,  "V"},
    {Maps147, Input1,  40, 13, 0, 50,  "V"},
    {Maps147, Input1,  42, 14, 0, 100, "V"},
    {Maps147, Input1,  44, 15, 0, 200, "V"},
    {Maps147, Output1, 46,  1, 0, 1,   "mA"},
    {Maps147, Output1, 48,  2, 0, 10,  "mA"},
    {Maps147, Output1, 50,  3, 0, 20,  "mA"},
    {Maps147, Output1, 52,  4, 4, 20,  "mA"},
    {Maps147, Output1, 54,  5, 0, 1,   "V"},
    {Maps147, Output1, 56,  6, 0, 2,   "V"},
    {Maps147, Output1, 58,  7, 0, 5,   "V"},
    {Maps147, Output1, 60,  8, 1, 5,   "V"},
    {Maps147, Output1, 62,  9, 0, 10,  "V"},
    {Maps147, Output1, 64, 10, 2, 10,  "V"},
    {Maps147, Output1, 66, 11, 0, 20,  "V"},

    {Maps25,  Input1,  16,  1, 0, 10,  "mA"},
    {Maps25,  Input1,  18,  2, 0, 20,  "mA"},
    {Maps25,  Input1,  20,  3, 4, 20,  "mA"},  // range 4 is this one, loop powered
    {Maps25,  Input1,  22,  5, 0, 1,   "V"},
    {Maps25,  Input1,  24,  6, 0, 2,   "V"},
    {Maps25,  Input1,  26,  7, 0, 5,   "V"},
    {Maps25,  Input1,  28,  8, 1, 5,   "V"},
    {Maps25,  Input1,  30,  9, 0, 10,  "V"},
    {Maps25,  Input1,  32, 10, 2, 10,  "V"},
    {Maps25,  Input1,  34, 11, 0, 20,  "V"},
    {Maps25,  Output1, 36,  1, 0, 10,  "mA"},
    {Maps25,  Output1, 38,  2, 0, 20,  "mA"},
    {Maps25,  Output1, 40,  3, 4, 20,  "mA"},
    {Maps25,  Output1, 42,  4, 0, 1,   "V"},
    {Maps25,  Output1, 44,  5, 0, 2,   "V"},
    {Maps25,  Output1, 46,  6, 0, 5,   "V"},
    {Maps25,  Output1, 48,  7, 1, 5,   "V"},
    {Maps25,  Output1, 50,  8, 0, 10,  "V"},
    {Maps25,  Output1, 52,  9, 2, 10,  "V"},
    {Maps25,  Output1, 54, 10, 0, 20,  "V"},
    {Maps25,  Output2, 56,  1, 0, 10,  "mA"},
    {Maps25,  Output2, 58,  2, 0, 20,  "mA"},
    {Maps25,  Output2, 60,  3, 4, 20,  "mA"},
    {Maps25,  Output2, 62,  4, 0, 1,   "V"},
    {Maps25,  Output2, 64,  5, 0, 2,   "V"},
    {Maps25,  Output2, 66,  6, 0, 5,   "V"},
    {Maps25,  Output2, 68,  7, 1, 5,   "V"},
    {Maps25,  Output2, 70,  8, 0, 10,  "V"},
    {Maps25,  Output2, 72,  9, 2, 10,  "V"},
    {Maps25,  Output2, 74, 10, 0, 20,  "V"},

    {Map3,    Input1,  72,  1, 0, 2,   "mV"},
    {Map3,    Input1,  73,  2, 0, 5,   "mV"},
    {Map3,    Input1,  74,  3, 0, 10,  "mV"},
    {Map3,    Input1,  75,  4, 0, 20,  "mV"},
    {Map3,    Input1,  76,  5, 0, 50,  "mV"},
    {Map3,    Input1,  77,  6, 0, 100, "mV"},
    {Map3,    Input1,  78,  7, 0, 200, "mV"},
    {Map3,    Input1,  79,  8, 0, 500, "mV"},
    {Map3,    Output1, 80,  1, 0, 1,   "mA"},
    {Map3,    Output1, 81,  2, 0, 10,  "mA"},
    {Map3,    Output1, 82,  3, 0, 20,  "mA"},
    {Map3,    Output1, 83,  4, 0, 1,   "V"},
    {Map3,    Output1, 84,  5, 0, 2,   "V"},
    {Map3,    Output1, 85,  6, 0, 5,   "V"},
    {Map3,    Output1, 86,  7, 0, 10,  "V"},
    {Map3,    Output1, 87,  8, 0, 20,  "V"},

    {Map6,    Output1, 20,  1, 0, 1,   "mA"},
    {Map6,    Output1, 22,  2, 0, 10,  "mA"},
    {Map6,    Output1, 24,  3, 0, 20,  "mA"},
    {Map6,    Output1, 26,  4, 0, 1,   "V"},
    {Map6,    Output1, 28,  5, 0, 2,   "V"},
    {Map6,    Output1, 30,  6, 0, 5,   "V"},
    {Map6,    Output1, 32,  7, 0, 10,  "V"},
    {Map6,    Output1, 34,  8, 0, 20,  "V"},
};
// clang-format on

constexpr int LoopPoweredSource = 3;  // maps 2 and 5: the 4-20 mA input range ...
constexpr int LoopPoweredRange = 4;   // ... offered a second time, loop powered
constexpr int CalModeEntry = 0;
constexpr int RemoteControlEntry = 13;
constexpr int CustomEntry = RangeEntries - 1;
constexpr int LastScannedRegister = 100;
constexpr int FirstScannedRegister = 16;
constexpr int LastOutputRange = 11;

QString rangeText(const RangeDescriptor& descriptor) {
    return QString::number(double(descriptor.minimum)) + QLatin1String("--") +
           QString::number(double(descriptor.maximum)) + descriptor.unit;
}

void describeEntries(RangeTable& table, int first, int last) {
    for (int entry = first; entry <= last; ++entry)
        table[entry].description = rangeText(table[entry]);
}

void addLoopPowered(RangeTable& input1, const RangeDescriptor& source) {
    input1[LoopPoweredRange] = source;
    input1[LoopPoweredRange].unit += QLatin1String(" LP");
    input1[LoopPoweredRange].description += QLatin1String(" LP");
}

bool hasLoopPoweredRange(int map) {
    return map == 2 || map == 5;
}

void fillFromRegisters(RangeTable& table, int channel, int map, int firstReg, int lastReg) {
    for (int reg = firstReg; reg <= lastReg; ++reg) {
        const RangeRegister info = GetRangeInfo(reg, map);
        if (info.channel == channel && !info.oddHalf)
            table[info.range] = info.descriptor;
    }
}

}  // namespace

RangeRegister GetRangeInfo(int reg, int map) {
    RangeRegister info;
    if (map < 1 || map > MapCount)
        return info;
    for (const RangeRow& row : rangeRows) {
        if (!(row.maps & mapBit(map)))
            continue;
        const bool odd = rangesInPairs(map) && reg == row.reg + 1;
        if (reg != row.reg && !odd)
            continue;
        info.channel = row.channel;
        info.range = row.range;
        info.oddHalf = odd;
        info.descriptor.minimum = row.minimum;
        info.descriptor.maximum = row.maximum;
        info.descriptor.unit = QLatin1String(row.unit);
        info.descriptor.description = rangeText(info.descriptor);
        return info;
    }
    return info;
}

QString ChannelPrefix(int channel) {
    switch (channel) {
    case Input1:
        return QStringLiteral("Input 1: ");
    case Output1:
        return QStringLiteral("Output 1: ");
    case Input2:
        return QStringLiteral("Input 2: ");
    case Output2:
        return QStringLiteral("Output 2: ");
    }
    return {};
}

void BuildRangeTables(const RegMap& addresses, int map) {
    for (int channel = Input1; channel <= Output2; ++channel) {
        RangeTable& table = ProgramRangeTable(channel);
        table.fill(RangeDescriptor());
        fillFromRegisters(table, channel, map, addresses.Rng_First, addresses.Rng_Last);
    }
    for (int channel : {Input1, Input2}) {
        RangeTable& table = ProgramRangeTable(channel);
        describeEntries(table, 1, CustomEntry - 1);
        table[CalModeEntry].unit = table[CalModeEntry].description = QStringLiteral("Cal Mode");
        table[CustomEntry].unit = table[CustomEntry].description = QStringLiteral("Custom");
    }
    if (hasLoopPoweredRange(map)) {
        RangeTable& input1 = ProgramRangeTable(Input1);
        addLoopPowered(input1, input1[LoopPoweredSource]);
    }
    for (int channel : {Output1, Output2}) {
        RangeTable& table = ProgramRangeTable(channel);
        describeEntries(table, 1, LastOutputRange);
        table[CalModeEntry].description = QStringLiteral("Cal Mode");
        table[RemoteControlEntry].description = QStringLiteral("Remote Control");
        table[CustomEntry].description = QStringLiteral("Custom");
    }
}

bool GetRangeTable(int map, int channel, RangeTable& table) {
    table.fill(RangeDescriptor());
    fillFromRegisters(table, channel, map, FirstScannedRegister, LastScannedRegister);
    describeEntries(table, 1, CustomEntry - 1);
    // The loop-powered copy is taken from this table, not the program-wide one, so
    // a list built for a file with another module (or none) connected stays right.
    if (channel == Input1 && hasLoopPoweredRange(map))
        addLoopPowered(table, table[LoopPoweredSource]);
    return true;
}

}  // namespace kv
