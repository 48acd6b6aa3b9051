#include "drivers/kv7146_flags.h"

#include "drivers/flag_options.h"
#include "model/codec.h"

namespace kv {

namespace {

const FlagOption kv716Options[] = {
    {&SettingsSet::Inp1Respon, FlagFastResponseBit},
    {&SettingsSet::RemoteCont, 0, 0},
    {&SettingsSet::RemoteCont, 1, 1},
    {&SettingsSet::UserLmtEna, 2, 0},
    {&SettingsSet::UserLmtEna, 3, 1},
    {&SettingsSet::DirecrReve, 4, 0},
    {&SettingsSet::DirecrReve, 5, 1},
};

}  // namespace

quint16 KV7146v2FlagA(const SettingsSet& settings, int model) {
    const bool kv716 = model == KV716v2;
    quint16 flags = kv716 ? SetOptionBits(0, settings, kv716Options)
                          : SetOptionBits(0, settings, SingleOutputOptions);
    if (settings.Inp1Shape == QLatin1String("Table"))
        flags = SetBit(flags, kv716 ? KV716v2TableBit : FlagShapedBit);
    return flags;
}

void KV7146v2ReadFlagA(quint16 flags, int model, SettingsSet& settings) {
    const bool kv716 = model == KV716v2;
    if (kv716)
        ReadOptionBits(flags, kv716Options, settings);
    else
        ReadOptionBits(flags, SingleOutputOptions, settings);
    settings.Inp1Shape = TestBit(flags, kv716 ? KV716v2TableBit : FlagShapedBit)
                             ? QStringLiteral("Table")
                             : QStringLiteral("Linear");
}

}  // namespace kv
