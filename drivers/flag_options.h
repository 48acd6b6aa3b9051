#pragma once
// Choices of the settings record that a module keeps as bits of a 16-bit flag
// word. A row names the field, the flag bit it sets and, for the models whose
// field holds one choice per output, the bit of the field that row stands for.

#include "model/settings_set.h"

#include <QtGlobal>
#include <cstddef>

namespace kv {

constexpr int WholeField = -1;  // the flag bit is set when the field is 1

struct FlagOption {
    qint32 SettingsSet::*field;
    int flagBit;
    int fieldBit = WholeField;
};

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
