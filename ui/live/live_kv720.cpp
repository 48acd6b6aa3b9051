#include "drivers/kv720_codes.h"
#include "model/register_values.h"
#include "ui/live/live_common.h"
#include "ui/live/live_display.h"

namespace kv {

using namespace live;

namespace {

struct KindPrefix {
    int kind;
    bool engineering;  // measured range and engineering range shown; value in engineering units
    const char* prefix;
};

// By TypInput. The temperature sensors show the measuring unit.
constexpr KindPrefix prefixes[] = {
    {Kv720MilliVolt, true, "mv : "},      {Kv720Thermocouple, false, "TC : "},
    {Kv720Rtd3Wire, false, "RTDT 3W : "}, {Kv720Rtd4Wire, false, "RTDT 4W : "},
    {Kv720Rtd2Wire, false, "RTDT 2W : "}, {Kv720Resistance, true, "RT 2W : "},
    {Kv720Potentiometer, true, "POT : "}, {Kv720StrainGauge, true, "WT : "},
};

}  // namespace

void KV720Display(LiveView& view, const LiveSource& source) {
    const RegMap& val = source.val;
    FlashInput(view, val.Input_Reading, InputReadingLimit(Kv720Map));
    if (!InRange(val.In_Rng1, 1, 8)) {
        FailInputRange(view);
        return;
    }
    const float value = EngineeringInput(val);
    const QString sensor = Kv720ShapeText(val.TypInput, Kv720ShapeCode(val.Type_In_Unit));
    const QString unit = Kv720UnitText(val.TypInput, Kv720UnitCode(val.Type_In_Unit));
    KindPrefix kind{0, false, "?? : "};
    for (const KindPrefix& row : prefixes)
        if (row.kind == val.TypInput)
            kind = row;
    const QString measured =
        Fixed(val.Meas_Unit_Z, "0.00") + QLatin1Char('-') + Fixed(val.Meas_Unit_F, "0.00");
    QString units;
    if (kind.engineering) {
        units = EngUnitText(val);
        view.input.summary = QLatin1String(kind.prefix) + measured + QLatin1Char(' ') + unit +
                             sensor + CrLf + QStringLiteral("Eng : ") +
                             Fixed(val.Eng_In_Z, "0.00") + QLatin1Char('-') +
                             Fixed(val.Eng_In_F, "0.00") + QLatin1Char(' ') + units;
    } else {
        units = unit;
        view.input.summary =
            QLatin1String(kind.prefix) + sensor + CrLf + QStringLiteral("Cal : ") + measured + unit;
    }
    ShowInputValue(view.input, value, units);
    view.input.response =
        Bit(val.Flag_A, Kv720ResponseBit) ? QStringLiteral("Slow") : QStringLiteral("Fast");
    Output_KVv2(view, source, val.Out_Rng1, 0, Bit(val.Flag_A, Kv720LimitsBit),
                Bit(val.Flag_A, Kv720ReverseBit), Bit(val.in_ch, Kv720RemoteBit));
}

}  // namespace kv
