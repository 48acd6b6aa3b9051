#pragma once
// The flag word of the second-version KV714 and KV716: response time, shape and
// the output choices. The KV716 keeps a choice per output (bit 0 of the record
// field for output 1, bit 1 for output 2); the KV714 one choice each.

#include "model/register_map.h"
#include "model/settings_set.h"

namespace kv {

// Model numbers the KV714/KV716 drivers serve; also the family CheckModType confirms.
enum KV7146Model {
    KV714v1 = Kv714v1Map,
    KV716v1 = Kv716v1Map,
    KV714v2 = Kv714v2Map,
    KV716v2 = Kv716v2Map,
};

// The KV716's table bit; the KV714 keeps its table in FlagShapedBit.
constexpr int KV716v2TableBit = 6;

quint16 KV7146v2FlagA(const SettingsSet& settings, int model);
// Response, shape and output choices back from a flag word.
void KV7146v2ReadFlagA(quint16 flags, int model, SettingsSet& settings);

}  // namespace kv
