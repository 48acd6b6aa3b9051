// What the live panel shows for each module family, computed from the register
// records as the module reports them.
#include "tests/support/live_modules.h"
#include "ui/live/live_display.h"

#include <QtTest>

using namespace kv;
using namespace kv::test;

namespace {

void engUnit(const char* four) {
    RegVal.Eng_Unit1 = four[0];
    RegVal.Eng_Unit2 = four[1];
    RegVal.Eng_Unit3 = four[2];
    RegVal.Eng_Unit4 = four[3];
}

// A KV720 with a 0..10 mV input shown as 0..250 kPa, and output 1 calibrated
// on its 0..20 mA row to 4..20 mA, signal limits 3.8..21 mA (switched off).
void kv720() {
    Kv720WithOutput();
    RegVal.In_Rng1 = 3;
    RegVal.TypInput = 1;
    RegVal.Type_In_Unit = 0x11;  // mV, linear
    RegVal.Meas_Unit_Z = 0;
    RegVal.Meas_Unit_F = 10;
    RegVal.Eng_In_Z = 0;
    RegVal.Eng_In_F = 250;
    engUnit("kPa ");
    RegVal.Flag_A = 0;
    RegVal.in_ch = 3;
    RegVal.Sig_Lmt1_Z = 4800;   // 3.8 mA
    RegVal.Sig_Lmt1_F = 22000;  // 21 mA
    RegVal.Input_Reading = 5000;
}

// A first-version KV714 in the software position: input 4..20 mA, output
// 4..20 mA, both calibrated to the full row.
void kv714v1() {
    IdentifyLiveModule(Kv714v1Map);
    CalibrateRow(Input1, 4, 400, 2000);
    CalibrateRow(Output1, 4, 800, 4000);
    CalibrateRow(Output1, 9, 100, 4000);  // 0..10 V
    RegVal.Sw_In1 = 15;
    RegVal.Sw_Out1 = 15;
    RegVal.In_Rng1 = 4;
    RegVal.Usr_In1_Z = 400;
    RegVal.Usr_In1_F = 2000;
    RegVal.Out_Rng1 = 4;
    RegVal.Usr_Out1_Z = 800;
    RegVal.Usr_Out1_F = 4000;
    RegVal.Sig_Lmt_On = 0;
    RegVal.Input_Reading = 1200;  // half way
}

// A first-version KV716 in the software position; output 2 on 0..10 V. Another
// `map` keeps these records and tables but takes that family's addresses.
void kv716v1(int map = Kv716v1Map) {
    Kv716v1WithOutputs();
    CalibrateRow(Input1, 3, 410, 2050);  // 4..20 mA
    RegVal.Sw_In1 = 15;
    RegVal.Sw_Out1 = 15;
    RegVal.Sw_Out2 = 15;
    RegVal.In_Rng1 = 3;
    RegVal.Usr_In1_Z = 410;
    RegVal.Usr_In1_F = 2050;
    RegVal.Usr_Out1_Z = 820;
    RegVal.Usr_Out1_F = 4100;
    RegVal.Usr_Out2_Z = 100;
    RegVal.Usr_Out2_F = 4000;
    RegVal.IO_Dir = 0;
    RegVal.Sig_Lmt_On = 0;
    RegVal.Input_Reading = 1230;  // half way
    SetRegMap(RegAdd, map);
    ModuleMap = map;
}

// A KV760 on a frequency input shown as 0..1500 rpm, output 0..1 V.
void kv760() {
    IdentifyLiveModule(Kv760Map);
    CalibrateRow(Output1, 4, 300, 3300);
    RegVal.Type_In_Unit = 3 << 4;
    RegVal.Meas_Unit_Z = 0;
    RegVal.Meas_Unit_F = 5000;
    RegVal.Eng_In_Z = 0;
    RegVal.Eng_In_F = 1500;
    engUnit("rpm ");
    RegVal.In_Freq = 512;
    RegVal.Pulse_Valley = 0.25f;
    RegVal.Pulse_Peak = 4.5f;
    RegVal.Trig_Level_RT = 2.125f;
    RegVal.Flag_A = 0;
    RegVal.Out_Rng1 = 4;
    RegVal.Usr_Out1_Z = 300;
    RegVal.Usr_Out1_F = 3300;
    RegVal.Input_Reading = 5000;
}

// A KV718 AC/DC variant on its 0..10 V row, both switches in the software position.
void kv718() {
    IdentifyLiveModule(Kv718AMap);
    CalibrateRow(Output1, 9, 100, 4000);  // 0..10 V
    RegVal.Sw_In1 = 15;
    RegVal.Sw_Out1 = 15;
    RegVal.In_Rng1 = 10;
    RegVal.Eng_In_Z = 0;
    RegVal.Eng_In_F = 10;
    engUnit("V   ");
    RegVal.Flag_A = 0;
    RegVal.Out_Rng1 = 9;
    RegVal.Usr_Out1_Z = 100;
    RegVal.Usr_Out1_F = 4000;
    RegVal.Input_Reading = 2500;
}

// Any family with a valid configuration.
void validModule(int map) {
    switch (map) {
    case Kv720Map:
        return kv720();
    case Kv760Map:
        return kv760();
    case Kv718AMap:
        return kv718();
    default:
        return kv716v1(map);
    }
}

LiveView fresh() {
    LiveView view;
    ShowModuleControls(view, ModuleMap);
    return view;
}

void redraw(LiveView& view) {
    KV700Display(view, LiveSource::Program(), RegAdd.Input_Reading);
}

LiveView drawn() {
    LiveView view = fresh();
    redraw(view);
    return view;
}

}  // namespace

class TestLiveView : public QObject {
    Q_OBJECT
private slots:
    void panelsFollowTheFamily();
    void identityValues();

    void inputLimits_data();
    void inputLimits();
    void liveIndicatorPulsesBackAndForth();
    void inputErrorLastsUntilTheReadingIsGood();

    void kv720Inputs_data();
    void kv720Inputs();
    void kv720InvalidInputRange_data();
    void kv720InvalidInputRange();
    void kv720FlagsAndRemote();

    void outputProjection_data();
    void outputProjection();
    void invalidOutputRange_data();
    void invalidOutputRange();
    void outputCalibrationFailures();

    void kv760Inputs_data();
    void kv760Inputs();

    void kv718Coupling_data();
    void kv718Coupling();
    void kv718SwitchesAndRange();

    void kv714FirstVersionUserCounts();
    void kv714SwitchSelectedRows();
    void kv714SwitchCombinations_data();
    void kv714SwitchCombinations();
    void kv716TwoOutputs();
    void kv716OutputOnRemoteSwitch();
    void kv716DfCombinationRefused();
    void kv716SignalLimitFailureNamesOutput2();
    void kv714SecondVersionUsesEngineeringRange();
};

void TestLiveView::panelsFollowTheFamily() {
    LiveView view;
    ShowModuleControls(view, Kv716v2Map);
    QVERIFY(view.active);
    QCOMPARE(view.input.heading, QStringLiteral("Input  "));
    QCOMPARE(view.outputs[0].heading, QStringLiteral("Output 1  "));
    QCOMPARE(view.outputs[1].heading, QStringLiteral("Output 2  "));
    QVERIFY(view.outputs[1].visible);

    view.input.value = "1.00 V";
    view.outputs[0].error = "Low Range Limit";
    view.outputs[0].remote = true;
    view.identity.serial = "1234";
    ShowModuleControls(view, Kv720Map);
    QCOMPARE(view.outputs[0].heading, QStringLiteral("Output  "));
    QVERIFY(view.outputs[0].visible);
    QVERIFY(!view.outputs[1].visible);
    QVERIFY(view.input.value.isEmpty());
    QVERIFY(view.outputs[0].error.isEmpty());
    QVERIFY(!view.outputs[0].remote);
    QCOMPARE(view.identity.serial, QStringLiteral("1234"));  // read during identification

    for (int map : {int(NoModuleMap), int(UnknownModuleMap)}) {
        ShowModuleControls(view, map);
        QVERIFY(!view.active);
        QCOMPARE(view.identity.serial, QStringLiteral("-"));
        QCOMPARE(view.identity.temperature, QStringLiteral("-"));
    }
}

void TestLiveView::identityValues() {
    IdentifyLiveModule(Kv714v1Map);
    RegVal.Serial_No = 204518;
    RegVal.Revision = 258;
    RegVal.Buss_ID = 20;
    RegVal.Int_Temp = 31;
    LiveView view = fresh();
    for (qint32 address : {RegAdd.Serial_No, RegAdd.Revision, RegAdd.Buss_ID, RegAdd.Int_Temp})
        KV700Display(view, LiveSource::Program(), address);
    QCOMPARE(view.identity.serial, QStringLiteral("204518"));
    QCOMPARE(view.identity.revision, QStringLiteral(" 1.002"));
    QCOMPARE(view.identity.busId, QStringLiteral("20"));
    QCOMPARE(view.identity.temperature, QStringLiteral("31"));

    RegVal.Resp1 = 0;
    KV700Display(view, LiveSource::Program(), RegAdd.Resp1);
    QCOMPARE(view.input.response, QStringLiteral("Fast"));
    RegVal.Resp1 = 1;
    KV700Display(view, LiveSource::Program(), RegAdd.Resp1);
    QCOMPARE(view.input.response, QStringLiteral("Slow"));

    // A register the family lacks (-1) is never stored, so never matches.
    RegVal.Serial_No = 99;
    KV700Display(view, LiveSource::Program(), RegAdd.Remote2);
    QCOMPARE(view.identity.serial, QStringLiteral("204518"));
}

void TestLiveView::inputLimits_data() {
    QTest::addColumn<int>("map");
    QTest::addColumn<int>("reading");
    QTest::addColumn<QString>("error");
    QTest::addColumn<Lamp>("low");
    QTest::addColumn<Lamp>("high");
    QTest::newRow("KV720 1") << int(Kv720Map) << 1 << "Input Low" << Lamp::Alarm << Lamp::Off;
    QTest::newRow("KV720 2") << int(Kv720Map) << 2 << "" << Lamp::Pulse << Lamp::Off;
    QTest::newRow("KV720 10500") << int(Kv720Map) << 10500 << "" << Lamp::Pulse << Lamp::Off;
    QTest::newRow("KV720 10501") << int(Kv720Map) << 10501 << "Input Hi" << Lamp::Off
                                 << Lamp::Alarm;
    QTest::newRow("KV714 v1 4090") << int(Kv714v1Map) << 4090 << "" << Lamp::Pulse << Lamp::Off;
    QTest::newRow("KV714 v1 4091")
        << int(Kv714v1Map) << 4091 << "Input Hi" << Lamp::Off << Lamp::Alarm;
    QTest::newRow("KV716 v1 4091")
        << int(Kv716v1Map) << 4091 << "Input Hi" << Lamp::Off << Lamp::Alarm;
    QTest::newRow("KV714 v2 10500") << int(Kv714v2Map) << 10500 << "" << Lamp::Pulse << Lamp::Off;
    QTest::newRow("KV760 10501") << int(Kv760Map) << 10501 << "Input Hi" << Lamp::Off
                                 << Lamp::Alarm;
    QTest::newRow("KV718 10500") << int(Kv718AMap) << 10500 << "" << Lamp::Pulse << Lamp::Off;
}

void TestLiveView::inputLimits() {
    QFETCH(int, map);
    QFETCH(int, reading);
    QFETCH(QString, error);
    QFETCH(Lamp, low);
    QFETCH(Lamp, high);
    validModule(map);  // so the limit alone decides
    RegVal.Input_Reading = reading;
    const LiveView view = drawn();
    QCOMPARE(view.input.error, error);
    QCOMPARE(view.input.low, low);
    QCOMPARE(view.input.high, high);
    QCOMPARE(view.input.value == QLatin1String("?? "), false);
}

void TestLiveView::liveIndicatorPulsesBackAndForth() {
    kv720();
    LiveView view = drawn();
    QList<int> colours{view.input.pulseColour};
    for (int i = 0; i < 9; ++i) {
        redraw(view);
        colours << view.input.pulseColour;
    }
    QCOMPARE(colours, (QList<int>{0, 1, 2, 3, 4, 3, 2, 1, 0, 1}));

    // An alarm does not advance the pulse.
    RegVal.Input_Reading = 0;
    redraw(view);
    RegVal.Input_Reading = 5000;
    redraw(view);
    QCOMPARE(view.input.pulseColour, 2);

    view.phase = 12;  // out of its cycle: starts again
    redraw(view);
    QCOMPARE(view.input.pulseColour, 0);
}

void TestLiveView::inputErrorLastsUntilTheReadingIsGood() {
    kv760();
    RegVal.Input_Reading = 10600;
    LiveView view = drawn();
    QCOMPARE(view.input.error, QStringLiteral("Input Hi"));
    // Other registers polled between readings leave the alarm text standing.
    KV700Display(view, LiveSource::Program(), RegAdd.Pulse_Valley);
    QCOMPARE(view.input.error, QStringLiteral("Input Hi"));
    RegVal.Input_Reading = 5000;
    redraw(view);
    QVERIFY(view.input.error.isEmpty());
}

void TestLiveView::kv720Inputs_data() {
    QTest::addColumn<int>("kind");
    QTest::addColumn<int>("typeInUnit");
    QTest::addColumn<QString>("value");
    QTest::addColumn<QString>("summary");
    // Reading 4375 of 0..250 in engineering units; measured range 0..10.
    QTest::newRow("mV") << 1 << 0x11 << "109.38 kPa "
                        << "mv : 0.00-10.00 mVLinear\r\nEng : 0.00-250.00 kPa ";
    QTest::newRow("mV table") << 1 << 0x12 << "109.38 kPa "
                              << "mv : 0.00-10.00 mVTable\r\nEng : 0.00-250.00 kPa ";
    QTest::newRow("thermocouple T degF") << 2 << 0x28 << "109.38 °F"
                                         << "TC : Type T\r\nCal : 0.00-10.00°F";
    QTest::newRow("RTD 3-wire pt1000 K") << 3 << 0x32 << "109.38 °K"
                                         << "RTDT 3W : pt1000.\r\nCal : 0.00-10.00°K";
    QTest::newRow("RTD 4-wire") << 4 << 0x11 << "109.38 °C"
                                << "RTDT 4W : pt100.\r\nCal : 0.00-10.00°C";
    QTest::newRow("RTD 2-wire") << 5 << 0x11 << "109.38 °C"
                                << "RTDT 2W : pt100.\r\nCal : 0.00-10.00°C";
    QTest::newRow("resistance kohm") << 6 << 0x21 << "109.38 kPa "
                                     << "RT 2W : 0.00-10.00 kohmLinear\r\nEng : 0.00-250.00 kPa ";
    QTest::newRow("potentiometer") << 7 << 0x11 << "109.38 kPa "
                                   << "POT : 0.00-10.00 %PotLinear\r\nEng : 0.00-250.00 kPa ";
    QTest::newRow("strain gauge") << 8 << 0x12 << "109.38 kPa "
                                  << "WT : 0.00-10.00 mVTable\r\nEng : 0.00-250.00 kPa ";
    QTest::newRow("shape code outside the list") << 2 << 0x1A << "109.38 °C"
                                                 << "TC : \r\nCal : 0.00-10.00°C";
    QTest::newRow("unknown kind") << 9 << 0x11 << "109.38 MU TYPE ?"
                                  << "?? : Shape TYPE ?\r\nCal : 0.00-10.00MU TYPE ?";
}

void TestLiveView::kv720Inputs() {
    QFETCH(int, kind);
    QFETCH(int, typeInUnit);
    QFETCH(QString, value);
    QFETCH(QString, summary);
    kv720();
    RegVal.TypInput = qint16(kind);
    RegVal.Type_In_Unit = qint16(typeInUnit);
    RegVal.Input_Reading = 4375;
    const LiveView view = drawn();
    QCOMPARE(view.input.value, value);
    QCOMPARE(view.input.summary, summary);
    QVERIFY(view.input.error.isEmpty());
}

void TestLiveView::kv720InvalidInputRange_data() {
    QTest::addColumn<int>("range");
    QTest::newRow("0") << 0;
    QTest::newRow("9") << 9;
}

void TestLiveView::kv720InvalidInputRange() {
    QFETCH(int, range);
    kv720();
    LiveView view = drawn();
    QCOMPARE(view.outputs[0].value, QStringLiteral("12.00 mA"));
    RegVal.In_Rng1 = range;
    redraw(view);
    QCOMPARE(view.input.error, QStringLiteral("Invalid Range"));
    QCOMPARE(view.input.value, QStringLiteral("?? "));
    QVERIFY(view.input.summary.isEmpty());
    QCOMPARE(view.outputs[0].error, QStringLiteral("Input Error !!"));
    QCOMPARE(view.outputs[0].value, QStringLiteral("?? "));
    QVERIFY(view.outputs[0].summary.isEmpty());
}

void TestLiveView::kv720FlagsAndRemote() {
    kv720();
    RegVal.Flag_A = 1 << 1;
    LiveView view = drawn();
    QCOMPARE(view.input.response, QStringLiteral("Slow"));
    QVERIFY(!view.outputs[0].remote);

    RegVal.Flag_A = 0;
    RegVal.in_ch = qint16(0x80 | 3);  // output under remote control
    RegVal.Remote1 = 2500;            // a quarter of the span
    redraw(view);
    QCOMPARE(view.input.response, QStringLiteral("Fast"));
    QVERIFY(view.outputs[0].remote);
    QCOMPARE(view.outputs[0].value, QStringLiteral("8.00 mA"));
    QCOMPARE(view.outputs[0].summary,
             QStringLiteral("0--20mA  Action: Direct\r\nRem:4.00--20.00mA"));
}

void TestLiveView::outputProjection_data() {
    QTest::addColumn<int>("flags");  // Flag_A: bit 2 limits, bit 3 reverse
    QTest::addColumn<int>("reading");
    QTest::addColumn<QString>("value");
    QTest::addColumn<QString>("error");
    QTest::addColumn<Lamp>("low");
    QTest::addColumn<Lamp>("high");
    const int limits = 1 << 2;
    const int reverse = 1 << 3;
    QTest::newRow("half way") << 0 << 5000 << "12.00 mA"
                              << "" << Lamp::Off << Lamp::Off;
    QTest::newRow("reverse at zero shows full scale") << reverse << 0 << "20.00 mA"
                                                      << "" << Lamp::Off << Lamp::Off;
    QTest::newRow("below range") << 0 << -500 << "3.20 mA"
                                 << "Low Range Limit" << Lamp::Alarm << Lamp::Off;
    QTest::newRow("above range") << 0 << 10400 << "20.64 mA"
                                 << "High Range Limit" << Lamp::Off << Lamp::Alarm;
    QTest::newRow("limits: held at the low limit")
        << limits << -500 << "3.80 mA"
        << "Low Signal Limit" << Lamp::Alarm << Lamp::Off;
    QTest::newRow("limits: beyond the range but inside the limit") << limits << 10400 << "20.64 mA"
                                                                   << "" << Lamp::Off << Lamp::Off;
    QTest::newRow("limits: held at the high limit")
        << limits << 10700 << "21.00 mA"
        << "High Signal Limit" << Lamp::Off << Lamp::Alarm;
    QTest::newRow("limits and reverse") << (limits | reverse) << 10500 << "3.80 mA"
                                        << "Low Signal Limit" << Lamp::Alarm << Lamp::Off;
}

void TestLiveView::outputProjection() {
    QFETCH(int, flags);
    QFETCH(int, reading);
    QFETCH(QString, value);
    QFETCH(QString, error);
    QFETCH(Lamp, low);
    QFETCH(Lamp, high);
    kv720();
    RegVal.Flag_A = qint16(flags);
    RegVal.Input_Reading = reading;
    const LiveView view = drawn();
    const OutputView& out = view.outputs[0];
    QCOMPARE(out.value, value);
    QCOMPARE(out.error, error);
    QCOMPARE(out.low, low);
    QCOMPARE(out.high, high);
    const bool limitsOn = flags & (1 << 2);
    QCOMPARE(out.summary, QStringLiteral("0--20mA  Action: ") +
                              (flags & (1 << 3) ? "Reverse" : "Direct") + "\r\nCal: 4.00--20.00mA" +
                              (limitsOn ? " Limit: 3.80--21.00mA" : ""));
}

void TestLiveView::invalidOutputRange_data() {
    QTest::addColumn<int>("range");
    QTest::addColumn<QString>("summary");
    QTest::newRow("0") << 0 << " = ?? 0";
    QTest::newRow("15") << 15 << " = ?? F";
    QTest::newRow("not read") << -1 << " = ?? FFFFFFFF";
}

void TestLiveView::invalidOutputRange() {
    QFETCH(int, range);
    QFETCH(QString, summary);
    kv720();
    RegVal.Out_Rng1 = range;
    const LiveView view = drawn();
    QCOMPARE(view.outputs[0].error, QStringLiteral("Invalid Output Range !!"));
    QCOMPARE(view.outputs[0].summary, summary);
    QCOMPARE(view.outputs[0].value, QStringLiteral("?? "));
    QCOMPARE(view.input.value, QStringLiteral("125.00 kPa "));  // the input is still shown
}

void TestLiveView::outputCalibrationFailures() {
    kv720();
    RegVal.COUT_Z = 0;  // the module's output calibration not read
    LiveView view = drawn();
    QCOMPARE(view.outputs[0].error, QStringLiteral("Out 1 Invalid Cal Values"));
    QCOMPARE(view.outputs[0].summary, QStringLiteral("3"));
    QCOMPARE(view.outputs[0].value, QStringLiteral("?? "));

    kv720();
    RegVal.Flag_A = 1 << 2;
    RegVal.Sig_Lmt1_F = 0;
    redraw(view);
    QCOMPARE(view.outputs[0].error, QStringLiteral("SL 1 Invalid User Cal"));
    QCOMPARE(view.outputs[0].summary, QStringLiteral("3 Limit"));
    QCOMPARE(view.outputs[0].value, QStringLiteral("?? "));
}

void TestLiveView::kv760Inputs_data() {
    QTest::addColumn<int>("typeInUnit");
    QTest::addColumn<float>("frequency");
    QTest::addColumn<int>("flags");
    QTest::addColumn<QString>("summary");
    QTest::addColumn<QString>("response");
    QTest::newRow("type 3, Hz, linear")
        << (3 << 4) << 512.0f << 0
        << "T7: 0.00-5000.00 Hz /Linear - 512.00 Hz\r\nC:0-1500 rpm   V:0.250 P:4.500 T:2.125"
        << "Filt OFF";
    QTest::newRow("type 1, kHz, table, filter on")
        << ((1 << 4) | 0x80 | 1) << 2412.5f << (1 << 3)
        << "T7: 0.00-5.00 kHz/Table - 2.41 kHz\r\nC:0-1500 rpm   V:0.250 P:4.500 T:2.125"
        << "Filt ON";
    // Type 7 scales the pulse levels and shows one decimal.
    QTest::newRow("type 7") << (7 << 4) << 999.0f << 0
                            << "T8: 0.00-5000.00 Hz /Linear - 999.00 Hz\r\nC:0-1500 rpm   "
                               "V:36.8 P:661.8 T:312.5"
                            << "Filt OFF";
}

void TestLiveView::kv760Inputs() {
    QFETCH(int, typeInUnit);
    QFETCH(float, frequency);
    QFETCH(int, flags);
    QFETCH(QString, summary);
    QFETCH(QString, response);
    kv760();
    RegVal.Type_In_Unit = qint16(typeInUnit);
    RegVal.In_Freq = frequency;
    RegVal.Flag_A = qint16(flags);
    const LiveView view = drawn();
    QCOMPARE(view.input.summary, summary);
    QCOMPARE(view.input.value, QStringLiteral("750.00 rpm "));
    QCOMPARE(view.input.response, response);
    QCOMPARE(view.outputs[0].value, QStringLiteral("0.50 V"));
}

void TestLiveView::kv718Coupling_data() {
    QTest::addColumn<int>("coupling");
    QTest::addColumn<QString>("range");
    QTest::newRow("DC volts") << 0 << "Range: +/-10.00V";
    QTest::newRow("DC milliamps") << 1 << "Range: +/-10.00mA";
    QTest::newRow("AC volts") << 2 << "Range: 7.07Vac";
    QTest::newRow("AC milliamps") << 3 << "Range: 7.07mAac";
}

void TestLiveView::kv718Coupling() {
    QFETCH(int, coupling);
    QFETCH(QString, range);
    kv718();
    RegVal.Flag_A = qint16(coupling | (1 << 3) | (1 << 7));  // shaped, fast
    const LiveView view = drawn();
    QCOMPARE(view.input.summary, range + "\r\n Cal: 0.000 ... 10.000 V    Shaped");
    QCOMPARE(view.input.value, QStringLiteral("2.50 V   "));
    QCOMPARE(view.input.response, QStringLiteral("Fast"));
    QCOMPARE(view.outputs[0].value, QStringLiteral("2.50 V"));
}

void TestLiveView::kv718SwitchesAndRange() {
    kv718();
    LiveView view = drawn();
    QCOMPARE(view.input.response, QStringLiteral("Slow"));
    QCOMPARE(view.input.summary,
             QStringLiteral("Range: +/-10.00V\r\n Cal: 0.000 ... 10.000 V    "));

    RegVal.Sw_In1 = 14;
    view = drawn();
    QCOMPARE(view.input.error, QStringLiteral(" IN /OUT  Invalid !!"));
    QCOMPARE(view.input.summary, QStringLiteral("E\r\n"));
    QCOMPARE(view.input.value, QStringLiteral("?? "));
    QCOMPARE(view.outputs[0].error, QStringLiteral("IN /OUT  Invalid !!"));
    QCOMPARE(view.outputs[0].summary, QStringLiteral("F\r\n"));
    QCOMPARE(view.outputs[0].value, QStringLiteral("?? "));

    kv718();
    RegVal.Sw_Out1 = 13;
    view = drawn();
    QCOMPARE(view.outputs[0].summary, QStringLiteral("D\r\n"));

    kv718();
    RegVal.In_Rng1 = 17;
    view = drawn();
    QCOMPARE(view.input.error, QStringLiteral("Invalid Input 1 Range"));
    QCOMPARE(view.input.value, QStringLiteral("?? "));
    QVERIFY(view.outputs[0].value.isEmpty());  // no output drawn
}

void TestLiveView::kv714FirstVersionUserCounts() {
    kv714v1();
    RegVal.Flag_A = -1;  // the first version has no flag register
    LiveView view = fresh();
    view.input.response = "Slow";  // from Resp1
    redraw(view);
    QCOMPARE(view.input.value, QStringLiteral("12.00 mA"));
    QCOMPARE(view.input.summary, QStringLiteral("F=Range: 4--20mA\r\n Cal: 4.000--20.000 mA"));
    QCOMPARE(view.input.response, QStringLiteral("Slow"));
    QCOMPARE(view.outputs[0].value, QStringLiteral("12.00 mA"));
    QCOMPARE(view.outputs[0].summary,
             QStringLiteral("F=Range: 4--20mA  Action: Direct\r\n Cal: 4.00--20.00mA"));
    QVERIFY(!view.outputs[0].remote);

    // A user calibration on part of the row: counts 800..1600 are 8..16 mA.
    RegVal.Usr_In1_Z = 800;
    RegVal.Usr_In1_F = 1600;
    RegVal.Input_Reading = 1000;  // a quarter of the user span
    redraw(view);
    QCOMPARE(view.input.value, QStringLiteral("10.00 mA"));
    QCOMPARE(view.outputs[0].value, QStringLiteral("8.00 mA"));

    RegVal.Usr_In1_F = 800;  // no span
    redraw(view);
    QCOMPARE(view.input.error, QStringLiteral("Division by zero"));
    QCOMPARE(view.input.value, QStringLiteral("?? "));
    QCOMPARE(view.outputs[0].error, QStringLiteral("Input Error !!"));
    QCOMPARE(view.outputs[0].value, QStringLiteral("?? "));
}

void TestLiveView::kv714SwitchSelectedRows() {
    kv714v1();
    RegVal.Sw_In1 = 4;   // 4..20 mA by switch
    RegVal.Sw_Out1 = 9;  // 0..10 V by switch
    RegVal.Sig_Lmt_On = 1;
    RegVal.IO_Dir = 3;  // switch ranges are never reversed or limited
    const LiveView view = drawn();
    QCOMPARE(view.input.summary, QStringLiteral("\r\n4 = 4--20mA"));
    QCOMPARE(view.input.value, QStringLiteral("12.00 mA"));
    QCOMPARE(view.outputs[0].summary, QStringLiteral("\r\n9 = 0--10V"));
    QCOMPARE(view.outputs[0].value, QStringLiteral("5.00 V"));
    QVERIFY(view.outputs[0].error.isEmpty());
}

void TestLiveView::kv714SwitchCombinations_data() {
    QTest::addColumn<int>("map");
    QTest::addColumn<int>("in");
    QTest::addColumn<int>("out1");
    QTest::addColumn<int>("out2");
    QTest::addColumn<bool>("valid");
    QTest::newRow("one output: software") << int(Kv714v1Map) << 15 << 15 << -1 << true;
    QTest::newRow("one output: software, remote") << int(Kv714v1Map) << 15 << 13 << -1 << true;
    QTest::newRow("one output: software in, switch out")
        << int(Kv714v1Map) << 15 << 4 << -1 << false;
    QTest::newRow("one output: switch in, output 11") << int(Kv714v2Map) << 14 << 11 << -1 << true;
    QTest::newRow("one output: switch in, output 12") << int(Kv714v2Map) << 14 << 12 << -1 << false;
    QTest::newRow("one output: input 0") << int(Kv714v1Map) << 0 << 3 << -1 << false;
    QTest::newRow("two outputs: switches 11/10/10") << int(Kv716v1Map) << 11 << 10 << 10 << true;
    QTest::newRow("two outputs: input 12") << int(Kv716v1Map) << 12 << 3 << 3 << false;
    QTest::newRow("two outputs: output 2 at 11") << int(Kv716v2Map) << 5 << 3 << 11 << false;
    QTest::newRow("two outputs: software, one switch out")
        << int(Kv716v1Map) << 15 << 15 << 3 << false;
    QTest::newRow("two outputs: software, remote both")
        << int(Kv716v1Map) << 15 << 13 << 13 << true;
}

void TestLiveView::kv714SwitchCombinations() {
    QFETCH(int, map);
    QFETCH(int, in);
    QFETCH(int, out1);
    QFETCH(int, out2);
    QFETCH(bool, valid);
    kv716v1(map);
    RegVal.Sw_In1 = in;
    RegVal.Sw_Out1 = out1;
    RegVal.Sw_Out2 = out2;
    const LiveView view = drawn();
    QCOMPARE(view.input.error == QLatin1String(" IN /OUT  Invalid !!"), !valid);
    QCOMPARE(view.outputs[0].error == QLatin1String("IN /OUT  Invalid !!"), !valid);
    if (!valid) {
        QCOMPARE(view.input.summary, QString::number(in, 16).toUpper() + "\r\n");
        QCOMPARE(view.outputs[0].summary, QString::number(out1, 16).toUpper() + "\r\n");
        QCOMPARE(view.input.value, QStringLiteral("?? "));
        QCOMPARE(view.outputs[0].value, QStringLiteral("?? "));
    }
}

void TestLiveView::kv716TwoOutputs() {
    kv716v1();
    RegVal.IO_Dir = 1;  // output 2 reversed
    LiveView view = drawn();
    QCOMPARE(view.input.value, QStringLiteral("12.00 mA"));
    QCOMPARE(view.outputs[0].value, QStringLiteral("12.00 mA"));
    QCOMPARE(view.outputs[0].summary,
             QStringLiteral("F=Range: 4--20mA  Action: Direct\r\n Cal: 4.00--20.00mA"));
    QCOMPARE(view.outputs[1].value, QStringLiteral("5.00 V"));
    QCOMPARE(view.outputs[1].summary,
             QStringLiteral("F=Range: 0--10V  Action: Reverse\r\n Cal: 0.00--10.00V"));

    RegVal.IO_Dir = 2;            // output 1 reversed
    RegVal.Input_Reading = 1640;  // three quarters
    redraw(view);
    QCOMPARE(view.outputs[0].value, QStringLiteral("8.00 mA"));
    QCOMPARE(view.outputs[1].value, QStringLiteral("7.50 V"));

    // Signal limits on: output 2 held at its upper limit of 6 V.
    RegVal.IO_Dir = 0;
    RegVal.Sig_Lmt_On = 1;
    RegVal.Sig_Lmt1_Z = 820;
    RegVal.Sig_Lmt1_F = 4100;
    RegVal.Sig_Lmt2_Z = 100;
    RegVal.Sig_Lmt2_F = 2440;  // 6 V
    redraw(view);
    QCOMPARE(view.outputs[1].value, QStringLiteral("6.00 V"));
    QCOMPARE(view.outputs[1].error, QStringLiteral("High Signal Limit"));
    QCOMPARE(view.outputs[1].high, Lamp::Alarm);
    QCOMPARE(view.outputs[1].summary, QStringLiteral("F=Range: 0--10V  Action: Direct\r\n Cal: "
                                                     "0.00--10.00V Limit: 0.00--6.00V"));
    QVERIFY(view.outputs[0].error.isEmpty());
}

void TestLiveView::kv716OutputOnRemoteSwitch() {
    kv716v1();
    RegVal.Sw_Out1 = 13;
    RegVal.Sw_Out2 = 13;
    RegVal.Remote1 = 2050;  // half of the 820..4100 count scale after its low count
    RegVal.Remote2 = 100;
    const LiveView view = drawn();
    QVERIFY(view.outputs[0].remote);
    QVERIFY(view.outputs[1].remote);
    QCOMPARE(view.outputs[0].value, QStringLiteral("10.000mA"));
    QCOMPARE(view.outputs[1].value, QStringLiteral("0.000V"));
    QCOMPARE(view.input.value, QStringLiteral("12.00 mA"));
}

void TestLiveView::kv716DfCombinationRefused() {
    kv716v1();
    RegVal.Sw_Out1 = 13;
    const LiveView view = drawn();
    QCOMPARE(view.outputs[0].error, QStringLiteral("D/F combination"));
    QCOMPARE(view.outputs[1].error, QStringLiteral("   not allowed !!"));
    QCOMPARE(view.outputs[0].value, QStringLiteral("?? "));
    QCOMPARE(view.outputs[1].value, QStringLiteral("?? "));
    QCOMPARE(view.input.value, QStringLiteral("12.00 mA"));
}

void TestLiveView::kv716SignalLimitFailureNamesOutput2() {
    kv716v1();
    RegVal.Sig_Lmt_On = 1;
    RegVal.Sig_Lmt1_Z = 820;
    RegVal.Sig_Lmt1_F = 4100;
    RegVal.Sig_Lmt2_Z = 0;
    RegVal.Sig_Lmt2_F = 4000;
    LiveView view = drawn();
    QCOMPARE(view.outputs[1].error, QStringLiteral("SL  Invalid User Cal"));
    QCOMPARE(view.outputs[1].summary, QStringLiteral("F S Limit"));
    QCOMPARE(view.outputs[1].value, QStringLiteral("?? "));

    RegVal.Sig_Lmt2_Z = 100;
    RegVal.Usr_Out1_F = 0;
    redraw(view);
    QCOMPARE(view.outputs[0].error, QStringLiteral("Out 1 Invalid User Cal"));
    QCOMPARE(view.outputs[0].summary, QStringLiteral("F Cus"));

    RegVal.Usr_Out1_F = 4100;
    RegVal.Sig_Lmt1_Z = 0;
    redraw(view);
    QCOMPARE(view.outputs[0].error, QStringLiteral("SL 1 Invalid User Cal"));
    QCOMPARE(view.outputs[0].summary, QStringLiteral("F Limit"));

    RegVal.Sig_Lmt1_Z = 820;
    RegVal.Out_Rng2 = 17;
    redraw(view);
    QCOMPARE(view.outputs[1].error, QStringLiteral("Out 2 Invalid Range !!"));
    QCOMPARE(view.outputs[1].value, QStringLiteral("?? "));
}

void TestLiveView::kv714SecondVersionUsesEngineeringRange() {
    kv714v1();
    SetRegMap(RegAdd, Kv714v2Map);
    ModuleMap = Kv714v2Map;
    RegVal.Eng_In_Z = 0;
    RegVal.Eng_In_F = 600;
    engUnit("mbar");
    RegVal.Input_Reading = 2500;
    RegVal.Flag_A = qint16((1 << 3) | (1 << 7));  // shaped (bit 3 on this model), fast
    const LiveView view = drawn();
    QCOMPARE(view.input.value, QStringLiteral("150.00 mbar"));
    QCOMPARE(view.input.summary,
             QStringLiteral("F=Range: 4--20mA\r\n Cal: 0.000--600.000 mbarShaped"));
    QCOMPARE(view.input.response, QStringLiteral("Fast"));
    QCOMPARE(view.outputs[0].value, QStringLiteral("8.00 mA"));
}

QTEST_APPLESS_MAIN(TestLiveView)
#include "tst_liveview.moc"
