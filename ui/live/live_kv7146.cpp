#include "drivers/flag_options.h"
#include "drivers/kv7146_flags.h"
#include "model/entry_user_cal.h"
#include "model/register_values.h"
#include "ui/live/live_common.h"
#include "ui/live/live_display.h"

namespace kv {

using namespace live;

namespace {

constexpr qint32 SoftwareSwitch = 15;  // "F": ranges and calibration from the settings
constexpr qint32 RemoteSwitch = 13;    // "D": output driven from its remote register

bool twoOutputs(int map) {
    return map == Kv716v1Map || map == Kv716v2Map;
}
bool firstVersion(int map) {
    return map == Kv714v1Map || map == Kv716v1Map;
}
bool softwareOutput(qint32 switchValue) {
    return switchValue == RemoteSwitch || switchValue == SoftwareSwitch;
}
qint32 outputSwitch(const RegMap& val, int channel) {
    return channel == 0 ? val.Sw_Out1 : val.Sw_Out2;
}
QString outputLabel(int channel) {
    return QStringLiteral("Out %1").arg(channel + 1);
}

bool switchesValid(const LiveSource& source) {
    const RegMap& val = source.val;
    if (!twoOutputs(source.map)) {
        if (!InRange(val.Sw_In1, 1, SoftwareSwitch))
            return false;
        return val.Sw_In1 == SoftwareSwitch ? softwareOutput(val.Sw_Out1)
                                            : InRange(val.Sw_Out1, 1, 11);
    }
    if (val.Sw_In1 == SoftwareSwitch)
        return softwareOutput(val.Sw_Out1) && softwareOutput(val.Sw_Out2);
    return InRange(val.Sw_In1, 1, 11) && InRange(val.Sw_Out1, 1, 10) && InRange(val.Sw_Out2, 1, 10);
}

// The first-version modules have no control flag register; their response
// comes from Resp1 and they have no input shaping.
bool hasFlagA(const LiveSource& source) {
    return source.add.Flag_A >= 0;
}

// An output on the remote switch shows the value its remote register drives,
// on the count scale of the output's user range row.
void remoteDrivenOutput(OutputView& output, const LiveSource& source, int channel) {
    const RegMap& val = source.val;
    const qint32 range = channel == 0 ? val.Out_Rng1 : val.Out_Rng2;
    if (!InRange(range, 0, RangeEntries - 1)) {
        FailOutput(output, outputLabel(channel) + QStringLiteral(" Invalid Range !!"),
                   QStringLiteral(" = ?? ") + Hex(range));
        return;
    }
    const RangeDescriptor& row = source.outputTable(channel)[range];
    const QString summary = QStringLiteral("D=Range: ") + row.description;
    if (row.countMax == row.countMin) {
        FailOutput(output, QStringLiteral("Division by zero"), summary);
        return;
    }
    const qint32 remote = channel == 0 ? val.Remote1 : val.Remote2;
    const float fraction = float(remote - row.countMin) / float(row.countMax - row.countMin);
    const float value = row.minimum + (row.maximum - row.minimum) * fraction;
    const QString fault = ArithmeticFault(value);
    if (!fault.isEmpty()) {
        FailOutput(output, fault, summary);
        return;
    }
    output.summary = summary;
    output.error.clear();
    output.value = Fixed(value, "0.000") + row.unit;
}

}  // namespace

void KV714KV716Display(LiveView& view, const LiveSource& source) {
    const RegMap& val = source.val;
    FlashInput(view, val.Input_Reading, InputReadingLimit(source.map));
    const int outputs = twoOutputs(source.map) ? 2 : 1;
    if (!switchesValid(source)) {
        FailInput(view.input, QStringLiteral(" IN /OUT  Invalid !!"), Hex(val.Sw_In1) + CrLf);
        for (int channel = 0; channel < outputs; ++channel)
            FailOutput(view.outputs[channel], QStringLiteral("IN /OUT  Invalid !!"),
                       Hex(outputSwitch(val, channel)) + CrLf);
        return;
    }
    const std::optional<float> fraction = KV714KV716_Input_and_A(view, source);
    const bool softwareInput = val.Sw_In1 == SoftwareSwitch;
    if (outputs == 2 && softwareInput && val.Sw_Out1 == RemoteSwitch &&
        val.Sw_Out2 == SoftwareSwitch) {
        ShowRemote(view, 0, false);
        ShowRemote(view, 1, false);
        FailOutput(view.outputs[0], QStringLiteral("D/F combination"), {});
        FailOutput(view.outputs[1], QStringLiteral("   not allowed !!"), {});
        return;
    }
    for (int channel = 0; channel < outputs; ++channel) {
        const qint32 switchValue = outputSwitch(val, channel);
        const bool remote = softwareInput && switchValue == RemoteSwitch;
        ShowRemote(view, channel, remote);
        if (remote)
            remoteDrivenOutput(view.outputs[channel], source, channel);
        else
            KV714KV716_Output(view, source, switchValue, channel, fraction);
    }
}

std::optional<float> KV714KV716_Input_and_A(LiveView& view, const LiveSource& source) {
    const RegMap& val = source.val;
    InputView& input = view.input;
    if (hasFlagA(source))
        input.response =
            Bit(val.Flag_A, FlagFastResponseBit) ? QStringLiteral("Fast") : QStringLiteral("Slow");
    const bool software = val.Sw_In1 == SoftwareSwitch && softwareOutput(val.Sw_Out1);
    const qint32 rowNumber = software ? val.In_Rng1 : val.Sw_In1;
    if (!InRange(rowNumber, 0, RangeEntries - 1)) {
        input.error = QStringLiteral("Invalid Input 1 Range");
        input.value = Unknown;
        return std::nullopt;
    }
    const RangeDescriptor& row = source.input1[rowNumber];
    const QString position = Hex(val.Sw_In1);
    const QString rangeLine = position + QStringLiteral("=Range: ") + row.description;
    float zero = 0;
    float full = 0;
    QString units;
    std::optional<float> fraction;
    QString calFailure;
    if (firstVersion(source.map)) {
        units = row.unit;
        if (!GetUserCal(row, val.Usr_In1_Z, val.Usr_In1_F, zero, full, calFailure,
                        QStringLiteral("In 1")))
            zero = full = 0;
        if (val.Usr_In1_F != val.Usr_In1_Z)
            fraction =
                float(val.Input_Reading - val.Usr_In1_Z) / float(val.Usr_In1_F - val.Usr_In1_Z);
    } else {
        units = EngUnitText(val);
        zero = val.Eng_In_Z;
        full = val.Eng_In_F;
        fraction = float(val.Input_Reading) / 10000.0f;
    }
    const int shapingBit = source.map == Kv714v2Map ? int(FlagShapedBit) : KV716v2TableBit;
    const bool shaped = hasFlagA(source) && Bit(val.Flag_A, shapingBit);
    if (!software)
        input.summary = CrLf + position + QStringLiteral(" = ") + row.description;
    else if (!calFailure.isEmpty())
        input.summary = rangeLine;
    else
        input.summary = rangeLine + CrLf + QStringLiteral(" Cal: ") + Fixed(zero, "0.000") +
                        QStringLiteral("--") + Fixed(full, "0.000") + QLatin1Char(' ') + units +
                        (shaped ? QStringLiteral("Shaped") : QString());
    if (!fraction) {
        input.error = QStringLiteral("Division by zero");
        input.value = Unknown;
        return std::nullopt;
    }
    if (!calFailure.isEmpty()) {
        input.error = calFailure;
        input.value = Unknown;
        return fraction;
    }
    ShowInputValue(input, (full - zero) * *fraction + zero, units);
    if (!ArithmeticFault(*fraction).isEmpty())
        return std::nullopt;
    return fraction;
}

void KV714KV716_Output(LiveView& view, const LiveSource& source, qint32 switchValue, int channel,
                       std::optional<float> fraction) {
    const RegMap& val = source.val;
    OutputView& output = view.outputs[channel];
    const QString label = outputLabel(channel);
    if (!InRange(switchValue, 0, SoftwareSwitch)) {
        FailOutput(output, label + QStringLiteral(" Invalid Range !!"),
                   QStringLiteral(" = ?? ") + Hex(switchValue));
        return;
    }
    const RangeTable& table = source.outputTable(channel);
    OutputScale scale;
    bool reverse = false;
    if (switchValue == SoftwareSwitch) {
        const bool second = channel == 1;
        const qint32 range = second ? val.Out_Rng2 : val.Out_Rng1;
        if (!InRange(range, 0, RangeEntries - 1)) {
            FailOutput(output, label + QStringLiteral(" Invalid Range !!"),
                       QStringLiteral(" = ?? ") + Hex(range));
            return;
        }
        const RangeDescriptor& row = table[range];
        scale.units = row.unit;
        QString message;
        if (!GetUserCal(row, second ? val.Usr_Out2_Z : val.Usr_Out1_Z,
                        second ? val.Usr_Out2_F : val.Usr_Out1_F, scale.zero, scale.full, message,
                        label)) {
            FailOutput(output, message, Hex(switchValue) + QStringLiteral(" Cus"));
            return;
        }
        reverse =
            second ? (val.IO_Dir == 1 || val.IO_Dir == 3) : (val.IO_Dir == 2 || val.IO_Dir == 3);
        scale.limitsOn = val.Sig_Lmt_On > 0;
        QString summary =
            QStringLiteral("F=Range: ") + row.description +
            (reverse ? QStringLiteral("  Action: Reverse") : QStringLiteral("  Action: Direct")) +
            CrLf + QStringLiteral(" Cal: ") + Fixed(scale.zero, "0.00") + QStringLiteral("--") +
            Fixed(scale.full, "0.00") + row.unit;
        if (scale.limitsOn) {
            if (!GetUserCal(row, second ? val.Sig_Lmt2_Z : val.Sig_Lmt1_Z,
                            second ? val.Sig_Lmt2_F : val.Sig_Lmt1_F, scale.lowLimit,
                            scale.highLimit, message,
                            second ? QStringLiteral("SL ") : QStringLiteral("SL 1"))) {
                FailOutput(output, message,
                           Hex(switchValue) +
                               (second ? QStringLiteral(" S Limit") : QStringLiteral(" Limit")));
                return;
            }
            summary += QStringLiteral(" Limit: ") + Fixed(scale.lowLimit, "0.00") +
                       QStringLiteral("--") + Fixed(scale.highLimit, "0.00") + row.unit;
        }
        output.summary = summary;
    } else {
        const RangeDescriptor& row = table[switchValue];
        scale.zero = row.minimum;
        scale.full = row.maximum;
        scale.units = row.unit;
        output.summary = CrLf + Hex(switchValue) + QStringLiteral(" = ") + row.description;
    }
    if (!fraction) {
        output.error = QStringLiteral("Input Error !!");
        output.value = Unknown;
        output.low = output.high = Lamp::Off;
        return;
    }
    float projected = (scale.full - scale.zero) * *fraction + scale.zero;
    if (reverse)
        projected = scale.full - projected + scale.zero;
    ShowProjection(output, projected, scale);
}

}  // namespace kv
