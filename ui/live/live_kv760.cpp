#include "drivers/flag_options.h"
#include "drivers/kv760_input.h"
#include "model/entry_number.h"
#include "model/register_values.h"
#include "ui/live/live_common.h"
#include "ui/live/live_display.h"

namespace kv {

using namespace live;

namespace {

struct InputType {
    int first;
    int last;
    const char* prefix;
    float divisor;  // scales the pulse levels for display
    const char* pulsePattern;
};

// Input type: bits 4..6 of Type_In_Unit.
constexpr InputType inputTypes[] = {
    {1, 6, "T7: ", 1.0f, "0.000"},
    {7, 7, "T8: ", 0.0068f, "0.0"},
};

QString frequencyText(float hertz) {
    return hertz <= 999 ? Fixed(hertz, "0.00") + QStringLiteral(" Hz")
                        : Fixed(hertz / 1000, "0.00") + QStringLiteral(" kHz");
}

}  // namespace

void KV760v1Display(LiveView& view, const LiveSource& source) {
    const RegMap& val = source.val;
    FlashInput(view, val.Input_Reading, InputReadingLimit(Kv760Map));
    const int type = (val.Type_In_Unit / 16) & 7;
    const InputType* input = nullptr;
    for (const InputType& row : inputTypes)
        if (type >= row.first && type <= row.last)
            input = &row;
    if (!input) {
        FailInputRange(view);
        return;
    }
    const QString units = EngUnitText(val);
    QString summary = QLatin1String(input->prefix);
    if (Bit(val.Type_In_Unit, 7))
        summary += Fixed(val.Meas_Unit_Z / 1000, "0.00") + QLatin1Char('-') +
                   Fixed(val.Meas_Unit_F / 1000, "0.00") + QStringLiteral(" kHz");
    else
        summary += Fixed(val.Meas_Unit_Z, "0.00") + QLatin1Char('-') +
                   Fixed(val.Meas_Unit_F, "0.00") + QStringLiteral(" Hz ");
    ShowInputValue(view.input, EngineeringInput(val), units);
    summary +=
        (Bit(val.Type_In_Unit, 0) ? QStringLiteral("/Table - ") : QStringLiteral("/Linear - ")) +
        frequencyText(val.In_Freq) + CrLf;
    const auto pulse = [&](float level) {
        return Fixed(level / input->divisor, input->pulsePattern);
    };
    summary += QStringLiteral("C:") + GeneralText(val.Eng_In_Z) + QLatin1Char('-') +
               GeneralText(val.Eng_In_F) + QLatin1Char(' ') + units + QStringLiteral("  V:") +
               pulse(val.Pulse_Valley) + QStringLiteral(" P:") + pulse(val.Pulse_Peak) +
               QStringLiteral(" T:") + pulse(val.Trig_Level_RT);
    view.input.summary = summary;
    view.input.response =
        Bit(val.Flag_A, KV760FilterBit) ? QStringLiteral("Filt ON") : QStringLiteral("Filt OFF");
    Output_KVv2(view, source, val.Out_Rng1, 0, Bit(val.Flag_A, FlagLimitsBit),
                Bit(val.Flag_A, FlagReverseBit), Bit(val.Flag_A, FlagRemoteBit));
}

}  // namespace kv
