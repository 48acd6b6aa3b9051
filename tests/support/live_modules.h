#pragma once
// Register records of live-panel families as a test sets them up before a redraw
// or a remote request.

#include "model/module_ranges.h"
#include "model/register_map.h"
#include "ui/live/live_view.h"

namespace kv::test {

// A module of `map` identified: its addresses, its range tables (counts still
// to be set by the test), and every value not yet read.
inline void IdentifyLiveModule(int map) {
    SetRegMap(RegAdd, NoModuleMap);  // also resets RegVal
    SetRegMap(RegAdd, map);
    ModuleMap = map;
    BuildRangeTables(RegAdd, map);
}

inline void CalibrateRow(int channel, int row, qint32 low, qint32 high) {
    ProgramRangeTable(channel)[row].countMin = low;
    ProgramRangeTable(channel)[row].countMax = high;
}

// A KV720 whose output is calibrated 4.00..20.00 mA on its 0..20 mA row.
inline void Kv720WithOutput() {
    IdentifyLiveModule(Kv720Map);
    RegVal.Out_Rng1 = 3;
    RegVal.COUT_Z = 1000;
    RegVal.COUT_F = 21000;
    RegVal.Usr_Out1_Z = 5000;   // 4 mA
    RegVal.Usr_Out1_F = 21000;  // 20 mA
}

// A first-version KV716: output 1 on its 4..20 mA row, output 2 on 0..10 V.
inline void Kv716v1WithOutputs() {
    IdentifyLiveModule(Kv716v1Map);
    CalibrateRow(Output1, 3, 820, 4100);
    CalibrateRow(Output2, 8, 100, 4000);
    RegVal.Out_Rng1 = 3;
    RegVal.Out_Rng2 = 8;
}

}  // namespace kv::test
