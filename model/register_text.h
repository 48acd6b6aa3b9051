#pragma once
// Texts for the connected module's registers (RegAdd, RegVal, ModuleMap): the
// description of an address for the register viewer and the message log, and
// the current value of a register as the register viewer shows it.

#include <QString>

namespace kv {

// Description of an address and bus ID. A named register wins over a range
// register and over the limits of the register image at the same address.
QString GetRegDescription(int address, int id);

// The channel prefix and description of the range that a range register selects,
// or "Unknown Range at " and the address.
QString GetRangeDescription(int address);

enum ValueKind { IntegerValue = 1, FloatValue = 2 };

struct RegisterValueText {
    QString text;
    bool writable = false;
    int kind = IntegerValue;
};

// RegVal's value of the register at an address; "<address>??" for the limits,
// Input_B4_Table, Cal_Errors and addresses in no member.
RegisterValueText RegValueText(int address);

}  // namespace kv
