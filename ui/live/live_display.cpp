#include "ui/live/live_display.h"

#include "model/entry_format.h"
#include "ui/live/live_common.h"

namespace kv {

using namespace live;

namespace {

constexpr Rgb pulseColours[PulseColours] = {
    {5, 102, 141}, {2, 128, 144}, {0, 168, 150}, {2, 195, 154}, {6, 214, 160},
};
constexpr int PulsePhases = 8;

struct PanelLayout {
    int map;
    int outputs;  // 1 or 2
};
constexpr PanelLayout layouts[] = {
    {Kv714v1Map, 1}, {Kv716v1Map, 2}, {Kv720Map, 1},  {Kv714v2Map, 1},
    {Kv716v2Map, 2}, {Kv760Map, 1},   {Kv718AMap, 1},
};

}  // namespace

LiveSource LiveSource::Program() {
    return {RegAdd,
            RegVal,
            ModuleMap,
            ProgramRangeTable(Input1),
            ProgramRangeTable(Output1),
            ProgramRangeTable(Output2)};
}

Rgb PulseColour(int index) {
    return pulseColours[index >= 0 && index < PulseColours ? index : 0];
}

qint32 InputReadingLimit(int map) {
    return map == Kv714v1Map || map == Kv716v1Map ? 4090 : 10500;
}

void ShowModuleControls(LiveView& view, int map) {
    view.map = map;
    view.input = InputView{};
    view.input.heading = QStringLiteral("Input  ");
    for (OutputView& output : view.outputs)
        output = OutputView{};
    int outputs = 0;
    for (const PanelLayout& layout : layouts)
        if (layout.map == map)
            outputs = layout.outputs;
    view.active = outputs > 0;
    if (outputs == 2) {
        view.outputs[0].heading = QStringLiteral("Output 1  ");
        view.outputs[1].heading = QStringLiteral("Output 2  ");
    } else {
        view.outputs[0].heading = QStringLiteral("Output  ");
        view.outputs[1].heading = QStringLiteral("Output 2  ");
    }
    view.outputs[0].visible = true;
    view.outputs[1].visible = outputs == 2;
    if (!view.active) {
        const QString none = QStringLiteral("-");
        view.identity = {none, none, none, none};
    }
}

void ShowRemote(LiveView& view, int channel, bool show) {
    OutputView& output = view.outputs[channel];
    output.remote = show;
    output.low = Lamp::Off;
    output.high = Lamp::Off;
}

void FlashInput(LiveView& view, qint32 reading, qint32 limit) {
    InputView& input = view.input;
    if (reading < 2) {
        input.error = QStringLiteral("Input Low");
        input.low = Lamp::Alarm;
        input.high = Lamp::Off;
        return;
    }
    if (reading > limit) {
        input.low = Lamp::Off;
        input.high = Lamp::Alarm;
        input.error = QStringLiteral("Input Hi");
        return;
    }
    input.high = Lamp::Off;
    input.low = Lamp::Pulse;
    if (view.phase < 0 || view.phase >= PulsePhases)
        view.phase = 0;
    const int phase = view.phase;
    input.pulseColour = phase < PulseColours ? phase : PulsePhases - phase;
    ++view.phase;
}

void KV700Display(LiveView& view, const LiveSource& source, qint32 address) {
    const RegMap& add = source.add;
    const RegMap& val = source.val;
    if (address < 0)  // a register the family does not have
        return;
    if (address == add.Serial_No) {
        view.identity.serial = QString::number(val.Serial_No);
    } else if (address == add.Revision) {
        view.identity.revision = QLatin1Char(' ') + RevisionText(QString::number(val.Revision));
    } else if (address == add.Buss_ID) {
        view.identity.busId = QString::number(val.Buss_ID);
    } else if (address == add.Int_Temp) {
        view.identity.temperature = QString::number(val.Int_Temp);
    } else if (address == add.Resp1) {
        view.input.response = val.Resp1 < 1 ? QStringLiteral("Fast") : QStringLiteral("Slow");
    } else if (address == add.Input_Reading && source.map > 0) {
        // The error text belongs to the reading: it is rebuilt with each
        // redraw and stays while its cause lasts.
        view.input.error.clear();
        switch (source.map) {
        case Kv720Map:
            KV720Display(view, source);
            break;
        case Kv760Map:
            KV760v1Display(view, source);
            break;
        case Kv718AMap:
            KV718vA_Display(view, source);
            break;
        case Kv714v1Map:
        case Kv716v1Map:
        case Kv714v2Map:
        case Kv716v2Map:
            KV714KV716Display(view, source);
            break;
        default:
            break;
        }
    }
}

}  // namespace kv
