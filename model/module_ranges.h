#pragma once
// The range registers of each map and the four program-wide range tables built
// from them. A range register stands for one range of one channel; in every map
// but the KV720's the ranges occupy register pairs whose odd half carries the
// count at maximum and no descriptor of its own.

#include "model/range_table.h"
#include "model/register_map.h"

namespace kv {

struct RangeRegister {
    int channel = 0;             // RangeChannel, 0 when the register is no range register
    int range = 0;               // index into the channel's range table
    bool oddHalf = false;        // second register of a pair
    RangeDescriptor descriptor;  // minimum, maximum, unit and description "min--maxunit"
};

RangeRegister GetRangeInfo(int reg, int map);

// "Input 1: ", "Output 1: ", "Input 2: ", "Output 2: "; empty for any other channel.
QString ChannelPrefix(int channel);

// Rebuilds the program-wide tables (ProgramRangeTable) for a map from the range
// registers between addresses.Rng_First and addresses.Rng_Last. Counts start at 0.
void BuildRangeTables(const RegMap& addresses, int map);

// One channel's table of a map, for range lists and entry checks: every range
// register of the map, entries 0 and 16 "No Function". Always true.
bool GetRangeTable(int map, int channel, RangeTable& table);

}  // namespace kv
