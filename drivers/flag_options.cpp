#include "drivers/flag_options.h"

#include "model/codec.h"

namespace kv {

const FlagOption SingleOutputOptions[4] = {
    {&SettingsSet::Inp1Respon, FlagFastResponseBit},
    {&SettingsSet::UserLmtEna, FlagLimitsBit},
    {&SettingsSet::DirecrReve, FlagReverseBit},
    {&SettingsSet::RemoteCont, FlagRemoteBit},
};

quint16 SetOptionBits(quint16 flags, const SettingsSet& settings, const FlagOption* rows,
                      std::size_t count) {
    for (std::size_t i = 0; i < count; ++i) {
        const FlagOption& row = rows[i];
        const qint32 value = settings.*row.field;
        const bool on = row.fieldBit == WholeField ? value == 1 : (value >> row.fieldBit) & 1;
        if (on)
            flags = SetBit(flags, row.flagBit);
    }
    return flags;
}

void ReadOptionBits(quint16 flags, const FlagOption* rows, std::size_t count,
                    SettingsSet& settings) {
    for (std::size_t i = 0; i < count; ++i)
        if (rows[i].fieldBit != WholeField)
            settings.*rows[i].field = 0;
    for (std::size_t i = 0; i < count; ++i) {
        const FlagOption& row = rows[i];
        const bool on = TestBit(flags, row.flagBit);
        if (row.fieldBit == WholeField)
            settings.*row.field = on ? 1 : 0;
        else if (on)
            settings.*row.field |= 1 << row.fieldBit;
    }
}

}  // namespace kv
