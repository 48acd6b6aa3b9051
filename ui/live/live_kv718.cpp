#include "drivers/flag_options.h"
#include "drivers/kv718_input.h"
#include "model/register_values.h"
#include "ui/live/live_common.h"
#include "ui/live/live_display.h"

namespace kv {

using namespace live;

namespace {

constexpr qint32 SoftwareSwitch = 15;  // range chosen by the settings, not by the switch

struct Coupling {
    float factor;  // peak to rms for the AC couplings
    const char* prefix;
    const char* unit;
};

// Bits 0..1 of Flag_A.
constexpr Coupling couplings[] = {
    {1.0f, "Range: +/-", "V"},
    {1.0f, "Range: +/-", "mA"},
    {0.707f, "Range: ", "Vac"},
    {0.707f, "Range: ", "mAac"},
};

}  // namespace

void KV718vA_Display(LiveView& view, const LiveSource& source) {
    const RegMap& val = source.val;
    FlashInput(view, val.Input_Reading, InputReadingLimit(Kv718AMap));
    if (val.Sw_In1 != SoftwareSwitch || val.Sw_Out1 != SoftwareSwitch) {
        FailInput(view.input, QStringLiteral(" IN /OUT  Invalid !!"), Hex(val.Sw_In1) + CrLf);
        FailOutput(view.outputs[0], QStringLiteral("IN /OUT  Invalid !!"), Hex(val.Sw_Out1) + CrLf);
        return;
    }
    if (!InRange(val.In_Rng1, 0, RangeEntries - 1)) {
        view.input.error = QStringLiteral("Invalid Input 1 Range");
        view.input.value = Unknown;
        return;
    }
    view.input.response =
        Bit(val.Flag_A, FlagFastResponseBit) ? QStringLiteral("Fast") : QStringLiteral("Slow");
    const Coupling& coupling = couplings[val.Flag_A & KV718CouplingMask];
    const QString units = EngUnitText(val);
    view.input.summary = QLatin1String(coupling.prefix) +
                         Fixed(source.input1[val.In_Rng1].maximum * coupling.factor, "0.00") +
                         QLatin1String(coupling.unit) + CrLf + QStringLiteral(" Cal: ") +
                         Fixed(val.Eng_In_Z, "0.000") + QStringLiteral(" ... ") +
                         Fixed(val.Eng_In_F, "0.000") + QLatin1Char(' ') + units +
                         QLatin1Char(' ') +
                         (Bit(val.Flag_A, FlagShapedBit) ? QStringLiteral("Shaped") : QString());
    ShowInputValue(view.input, EngineeringInput(val), units);
    Output_KVv2(view, source, val.Out_Rng1, 0, Bit(val.Flag_A, FlagLimitsBit),
                Bit(val.Flag_A, FlagReverseBit), Bit(val.Flag_A, FlagRemoteBit));
}

}  // namespace kv
