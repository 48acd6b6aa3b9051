#include "ui/live/live_common.h"

#include "model/codec.h"
#include "model/entry_format.h"

#include <cmath>

namespace kv::live {

QString Fixed(double value, const char* pattern) {
    return FormatNumber(value, QLatin1String(pattern));
}

QString Hex(qint32 value) {
    return QString::number(quint32(value), 16).toUpper();
}

bool Bit(qint16 flags, int bit) {
    return TestBit(quint16(flags), bit);
}

bool InRange(qint32 value, qint32 low, qint32 high) {
    return value >= low && value <= high;
}

float EngineeringInput(const RegMap& val) {
    return (val.Eng_In_F - val.Eng_In_Z) * float(val.Input_Reading) / 10000.0f + val.Eng_In_Z;
}

void FailInput(InputView& input, const QString& error, const QString& summary) {
    input.error = error;
    input.summary = summary;
    input.value = Unknown;
}

void FailOutput(OutputView& output, const QString& error, const QString& summary) {
    output.error = error;
    output.summary = summary;
    output.value = Unknown;
}

void FailInputRange(LiveView& view) {
    FailInput(view.input, QStringLiteral("Invalid Range"));
    FailOutput(view.outputs[0], QStringLiteral("Input Error !!"), {});
}

void ShowInputValue(InputView& input, float value, const QString& units) {
    const QString fault = ArithmeticFault(value);
    if (!fault.isEmpty()) {
        input.error = fault;
        input.value = Unknown;
        return;
    }
    input.value = Fixed(value, "0.00") + QLatin1Char(' ') + units;
}

void ShowProjection(OutputView& output, float projected, const OutputScale& scale) {
    const auto show = [&](float value) {
        output.value = Fixed(value, "0.00") + QLatin1Char(' ') + scale.units;
    };
    const auto light = [&](Lamp low, Lamp high, const QString& error) {
        output.low = low;
        output.high = high;
        output.error = error;
    };
    const QString fault = ArithmeticFault(projected);
    if (!fault.isEmpty()) {
        light(Lamp::Off, Lamp::Off, fault);
        output.value = Unknown;
        return;
    }
    if (scale.limitsOn) {
        if (projected < scale.lowLimit) {
            show(scale.lowLimit);
            light(Lamp::Alarm, Lamp::Off, QStringLiteral("Low Signal Limit"));
        } else if (projected > scale.highLimit) {
            show(scale.highLimit);
            light(Lamp::Off, Lamp::Alarm, QStringLiteral("High Signal Limit"));
        } else {
            show(projected);
            light(Lamp::Off, Lamp::Off, {});
        }
        return;
    }
    show(projected);
    if (projected < scale.zero)
        light(Lamp::Alarm, Lamp::Off, QStringLiteral("Low Range Limit"));
    else if (projected > scale.full)
        light(Lamp::Off, Lamp::Alarm, QStringLiteral("High Range Limit"));
    else
        light(Lamp::Off, Lamp::Off, {});
}

RangeDescriptor CalibratedOutputRow(const LiveSource& source, int channel, qint32 range) {
    RangeDescriptor row = source.outputTable(channel)[range];
    if (source.map == Kv720Map && channel == 0) {
        row.countMin = source.val.COUT_Z;
        row.countMax = source.val.COUT_F;
    }
    return row;
}

QString ArithmeticFault(double value) {
    return std::isfinite(value) ? QString() : QStringLiteral("Overflow");
}

}  // namespace kv::live
