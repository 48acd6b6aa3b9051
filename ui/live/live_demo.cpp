// Shows the live panel filled as a connected module would fill it: a KV720
// with a millivolt input, a two-output KV716 or no module. With --shot the
// panel is saved as a picture instead of shown.
//   live_demo [--family 720|716|760|0] [--remote] [--reading N] [--entry TEXT]
//             [--theme 0|1] [--size WxH] [--shot file.png]

#include "engine/module_connection.h"
#include "model/module_ranges.h"
#include "model/register_map.h"
#include "ui/live/live_panel.h"

#include <QApplication>
#include <QCommandLineParser>
#include <QLineEdit>
#include <QTimer>

using namespace kv;

namespace {

void calibrate(RangeTable& table, int row, qint32 low, qint32 high) {
    table[row].countMin = low;
    table[row].countMax = high;
}

void identify(int map) {
    ModuleMap = map;
    SetRegMap(RegVal, NoModuleMap);
    SetRegMap(RegAdd, map);
    BuildRangeTables(RegAdd, map);
    RegVal.Serial_No = 204518;
    RegVal.Revision = 258;
    RegVal.Buss_ID = 16;
    RegVal.Int_Temp = 31;
    RegVal.Eng_Unit1 = 'k';
    RegVal.Eng_Unit2 = 'P';
    RegVal.Eng_Unit3 = 'a';
    RegVal.Eng_Unit4 = ' ';
}

void kv720(bool remote) {
    identify(3);
    RegVal.In_Rng1 = 3;
    RegVal.TypInput = 1;         // mV transmitter
    RegVal.Type_In_Unit = 0x11;  // mV, linear
    RegVal.Meas_Unit_Z = 0;
    RegVal.Meas_Unit_F = 10;
    RegVal.Eng_In_Z = 0;
    RegVal.Eng_In_F = 250;
    RegVal.Flag_A = 1 << 2;  // signal limits on
    RegVal.in_ch = remote ? 0x83 : 3;
    RegVal.Out_Rng1 = 3;  // 0..20 mA
    RegVal.COUT_Z = 1000;
    RegVal.COUT_F = 21000;
    RegVal.Usr_Out1_Z = 5000;   // 4 mA
    RegVal.Usr_Out1_F = 21000;  // 20 mA
    RegVal.Sig_Lmt1_Z = 4800;   // 3.8 mA
    RegVal.Sig_Lmt1_F = 22000;  // 21 mA
    RegVal.Remote1 = 2500;
    RegVal.Input_Reading = 4375;
}

void kv716() {
    identify(2);
    calibrate(ProgramRangeTable(Input1), 3, 410, 2050);
    calibrate(ProgramRangeTable(Output1), 3, 820, 4100);
    calibrate(ProgramRangeTable(Output2), 8, 100, 4000);
    RegVal.Sw_In1 = 15;
    RegVal.Sw_Out1 = 15;
    RegVal.Sw_Out2 = 15;
    RegVal.In_Rng1 = 3;
    RegVal.Usr_In1_Z = 410;
    RegVal.Usr_In1_F = 2050;
    RegVal.Out_Rng1 = 3;
    RegVal.Usr_Out1_Z = 820;
    RegVal.Usr_Out1_F = 4100;
    RegVal.Out_Rng2 = 8;
    RegVal.Usr_Out2_Z = 100;
    RegVal.Usr_Out2_F = 4000;
    RegVal.IO_Dir = 1;  // output 2 reversed
    RegVal.Sig_Lmt_On = 0;
    RegVal.Resp1 = 1;
    RegVal.Input_Reading = 1800;
}

void kv760() {
    identify(6);
    calibrate(ProgramRangeTable(Output1), 4, 300, 3300);
    RegVal.Type_In_Unit = (3 << 4) | (1 << 7);  // input type 3, kHz
    RegVal.Meas_Unit_Z = 0;
    RegVal.Meas_Unit_F = 5000;
    RegVal.Eng_In_Z = 0;
    RegVal.Eng_In_F = 1500;
    RegVal.Eng_Unit1 = 'r';
    RegVal.Eng_Unit2 = 'p';
    RegVal.Eng_Unit3 = 'm';
    RegVal.In_Freq = 2412.5f;
    RegVal.Pulse_Valley = 0.12f;
    RegVal.Pulse_Peak = 4.8f;
    RegVal.Trig_Level_RT = 2.4f;
    RegVal.Flag_A = 1 << 3;
    RegVal.Out_Rng1 = 4;  // 0..1 V
    RegVal.Usr_Out1_Z = 300;
    RegVal.Usr_Out1_F = 3300;
    RegVal.Input_Reading = 4825;
}

}  // namespace

int main(int argc, char* argv[]) {
    QApplication app(argc, argv);
    QCommandLineParser parser;
    parser.addHelpOption();
    const QCommandLineOption family({"f", "family"}, "720, 716, 760 or 0", "family", "720");
    const QCommandLineOption remote("remote", "KV720 output under remote control");
    const QCommandLineOption reading("reading", "Input_Reading, 0.01 % of span", "count");
    const QCommandLineOption entry("entry", "text typed into the remote box (not connected)",
                                   "text");
    const QCommandLineOption theme("theme", "colour theme 0 or 1", "theme", "0");
    const QCommandLineOption size("size", "window size WxH", "size", "900x260");
    const QCommandLineOption shot("shot", "save a picture of the panel and quit", "file");
    parser.addOptions({family, remote, reading, entry, theme, size, shot});
    parser.process(app);

    const QString name = parser.value(family);
    if (name == QLatin1String("720"))
        kv720(parser.isSet(remote));
    else if (name == QLatin1String("716"))
        kv716();
    else if (name == QLatin1String("760"))
        kv760();
    else
        identify(NoModuleMap);

    if (parser.isSet(reading))
        RegVal.Input_Reading = parser.value(reading).toInt();

    ModuleConnection connection;
    LivePanel panel(connection);
    panel.setWindowTitle(QStringLiteral("Live panel"));
    panel.SetColour(PaletteFor(parser.value(theme).toInt()));
    panel.ShowModuleControls(ModuleMap);
    for (qint32 address : {RegAdd.Serial_No, RegAdd.Revision, RegAdd.Buss_ID, RegAdd.Int_Temp,
                           RegAdd.Resp1, RegAdd.Input_Reading})
        panel.KV700Display(address);
    if (parser.isSet(entry))
        panel.txtRemoteSet(0)->setText(parser.value(entry));
    const QStringList dimensions = parser.value(size).split(QLatin1Char('x'));
    if (dimensions.size() == 2)
        panel.resize(dimensions[0].toInt(), dimensions[1].toInt());
    panel.show();

    if (parser.isSet(shot)) {
        QTimer::singleShot(200, &panel, [&] {
            panel.grab().save(parser.value(shot));
            app.quit();
        });
        return app.exec();
    }
    // A slowly moving input, so the pulse and the projection can be watched.
    QTimer moving;
    QObject::connect(&moving, &QTimer::timeout, &panel, [&] {
        RegVal.Input_Reading = (RegVal.Input_Reading + 97) % 10800;
        panel.KV700Display(RegAdd.Input_Reading);
    });
    moving.start(100);
    return app.exec();
}
