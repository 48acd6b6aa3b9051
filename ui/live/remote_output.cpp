#include "ui/live/remote_output.h"

#include "model/entry_number.h"
#include "model/entry_user_cal.h"
#include "ui/live/live_common.h"

namespace kv {

using namespace live;

namespace {

constexpr float RemoteFullScale = 10000.0f;  // 100.00 % of the output span

QString channelText(int channel) {
    return QStringLiteral("Remote CH") + QString::number(channel);
}

bool refuse(RemoteRequest& request, const QString& text) {
    request.refusal = text;
    return false;
}

bool roundCount(RemoteRequest& request, double count) {
    if (!RoundToLong(count, request.count))
        return refuse(request, QStringLiteral("Remote Overflow"));
    return true;
}

// First-version modules take an output count of the range row.
bool rowCount(RemoteRequest& request, const LiveSource& source, int channel, float value) {
    const qint32 range = channel == 0 ? source.val.Out_Rng1 : source.val.Out_Rng2;
    if (!InRange(range, 0, RangeEntries - 1))
        return refuse(request, QStringLiteral("Remote Invalid Output Range !!"));
    const RangeDescriptor& row = source.outputTable(channel)[range];
    if (value < row.minimum)
        return refuse(request,
                      channelText(channel) + QStringLiteral(" <") + GeneralText(row.minimum));
    if (value > row.maximum)
        return refuse(request,
                      channelText(channel) + QStringLiteral(" >") + GeneralText(row.maximum));
    const double fraction =
        (double(value) - row.minimum) / (double(row.maximum) - double(row.minimum));
    return roundCount(request, fraction * (double(row.countMax) - row.countMin) + row.countMin);
}

// Second-generation modules take 0.01 % of the calibrated output span.
bool spanCount(RemoteRequest& request, const LiveSource& source, float value) {
    const qint32 range = source.val.Out_Rng1;
    if (!InRange(range, 1, 14)) {
        request.outputUnusable = true;
        request.outputSummary = QStringLiteral(" = ?? ") + Hex(range);
        return refuse(request, QStringLiteral("Remote Invalid Output Range !!"));
    }
    const RangeDescriptor row = CalibratedOutputRow(source, 0, range);
    float zero = 0;
    float full = 0;
    QString message;
    if (!GetUserCal(row, source.val.Usr_Out1_Z, source.val.Usr_Out1_F, zero, full, message,
                    QStringLiteral("Out 1"))) {
        request.outputUnusable = true;
        request.outputSummary = Hex(range);
        return refuse(request, QStringLiteral("Remote ") + message);
    }
    if (value < zero)
        return refuse(request, QStringLiteral("Remote <") + GeneralText(zero));
    if (value > full)
        return refuse(request, QStringLiteral("Remote  >") + GeneralText(full));
    return roundCount(request, (double(value) - zero) / (double(full) - zero) * RemoteFullScale);
}

}  // namespace

RemoteRequest RemoteOutputRequest(const LiveSource& source, int channel, const QString& text) {
    RemoteRequest request;
    float value = 0;
    if (!ParseDecimal(text, value)) {
        refuse(request, channelText(channel) + QStringLiteral(" not Numeric !!"));
        return request;
    }
    bool converted = false;
    switch (source.map) {
    case Kv714v1Map:
    case Kv716v1Map:
        converted = rowCount(request, source, channel, value);
        break;
    case Kv720Map:
    case Kv760Map:
        converted = spanCount(request, source, value);
        break;
    default:
        refuse(request, QStringLiteral("Remote ? type"));
        break;
    }
    if (converted) {
        request.accepted = true;
        request.address = channel == 0 ? source.add.Remote1 : source.add.Remote2;
    }
    return request;
}

void ShowRemoteRefusal(LiveView& view, const RemoteRequest& request) {
    if (!request.outputUnusable)
        return;
    view.outputs[0].summary = request.outputSummary;
    view.outputs[0].value = Unknown;
}

}  // namespace kv
