#include "model/entry_user_cal.h"
#include "ui/live/live_common.h"
#include "ui/live/live_display.h"

namespace kv {

using namespace live;

void Output_KVv2(LiveView& view, const LiveSource& source, qint32 range, int channel, bool limitsOn,
                 bool reverse, bool remote) {
    ShowRemote(view, channel, remote);
    OutputView& output = view.outputs[channel];
    if (!InRange(range, 1, 14)) {
        FailOutput(output, QStringLiteral("Invalid Output Range !!"),
                   QStringLiteral(" = ?? ") + Hex(range));
        return;
    }
    const RegMap& val = source.val;
    const bool second = channel == 1;
    const RangeDescriptor row = CalibratedOutputRow(source, channel, range);
    OutputScale scale;
    scale.units = row.unit;
    scale.limitsOn = limitsOn;
    QString message;
    if (!GetUserCal(row, second ? val.Usr_Out2_Z : val.Usr_Out1_Z,
                    second ? val.Usr_Out2_F : val.Usr_Out1_F, scale.zero, scale.full, message,
                    second ? QStringLiteral("Out 2") : QStringLiteral("Out 1"))) {
        FailOutput(output, message, Hex(range));
        return;
    }
    QString summary =
        row.description +
        (reverse ? QStringLiteral("  Action: Reverse") : QStringLiteral("  Action: Direct")) +
        CrLf + (remote ? QStringLiteral("Rem:") : QStringLiteral("Cal: ")) +
        Fixed(scale.zero, "0.00") + QStringLiteral("--") + Fixed(scale.full, "0.00") + row.unit;
    if (limitsOn) {
        if (!GetUserCal(row, second ? val.Sig_Lmt2_Z : val.Sig_Lmt1_Z,
                        second ? val.Sig_Lmt2_F : val.Sig_Lmt1_F, scale.lowLimit, scale.highLimit,
                        message, QStringLiteral("SL 1"))) {
            FailOutput(output, message, Hex(range) + QStringLiteral(" Limit"));
            return;
        }
        summary += QStringLiteral(" Limit: ") + Fixed(scale.lowLimit, "0.00") +
                   QStringLiteral("--") + Fixed(scale.highLimit, "0.00") + row.unit;
    }
    output.summary = summary;
    const qint32 driving = remote ? (second ? val.Remote2 : val.Remote1) : val.Input_Reading;
    float projected = (scale.full - scale.zero) * float(driving) / 10000.0f + scale.zero;
    if (reverse)
        projected = scale.full - projected + scale.zero;
    ShowProjection(output, projected, scale);
}

}  // namespace kv
