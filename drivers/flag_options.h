#pragma once
// Choices of the settings record that a module keeps as bits of a 16-bit flag
// word. A row names the field, the flag bit it sets and, for the models whose
// field holds one choice per output, the bit of the field that row stands for.

#include "model/settings_set.h"

#include <QtGlobal>
#include <cstddef>

namespace kv {

constexpr int WholeField = -1;  // the flag bit is set when the field is 1

// Flag_A bits of the single-output models: the KV714 second version and the
// KV718 use all of them; the KV760 shares the three output bits.
enum OutputFlagBit {
    FlagShapedBit = 3,        // input shaped by table 1
    FlagRemoteBit = 4,        // output under remote control
    FlagReverseBit = 5,       // reverse action
    FlagLimitsBit = 6,        // signal limits on
    FlagFastResponseBit = 7,  // fast response
};

struct FlagOption {
    qint32 SettingsSet::*field;
    int flagBit;
    int fieldBit = WholeField;
};

// The choices of the KV714 second version and the KV718, one bit each.
extern const FlagOption SingleOutputOptions[4];

quint16 SetOptionBits(quint16 flags, const SettingsSet& settings, const FlagOption* rows,
                      std::size_t count);
// Rebuilds the named fields from a flag word; a per-output field starts at 0.
void ReadOptionBits(quint16 flags, const FlagOption* rows, std::size_t count,
                    SettingsSet& settings);

template <std::size_t N>
quint16 SetOptionBits(quint16 flags, const SettingsSet& settings, const FlagOption (&rows)[N]) {
    return SetOptionBits(flags, settings, rows, N);
}
template <std::size_t N>
void ReadOptionBits(quint16 flags, const FlagOption (&rows)[N], SettingsSet& settings) {
    ReadOptionBits(flags, rows, N, settings);
}

}  // namespace kv
