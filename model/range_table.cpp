#include "model/range_table.h"

namespace kv {

RangeTable& ProgramRangeTable(int channel) {
    static std::array<RangeTable, 4> tables;
    return tables[channel >= Input1 && channel <= Output2 ? channel - 1 : 0];
}

}  // namespace kv
