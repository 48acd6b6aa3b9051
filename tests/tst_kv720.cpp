// The KV720 driver without a module: its computations, and its dispatcher fed
// acknowledgements by hand against an engine that only records the request.
#include "drivers/kv720_codes.h"
#include "drivers/kv720_driver.h"
#include "drivers/kv720_input.h"
#include "drivers/kv720_read.h"
#include "engine/request_engine.h"
#include "model/codec.h"
#include "model/linearisation.h"
#include "model/module_ranges.h"
#include "model/register_map.h"
#include "tests/support/diagnostic_capture.h"

#include <QtTest>

using namespace kv;

namespace {

SettingsSet milliVolts(float lo, float hi) {
    SettingsSet s;
    s.Inp1RngTyp = Kv720MilliVolt;
    s.Inp1Shape = "Linear";
    s.Inp1MeUnit = "mV";
    s.Typ1InUnit = Kv720TypeInUnit(0, 0);
    s.Inp1mU_Zro = lo;
    s.Inp1mU_Ful = hi;
    s.Inp1EngZro = 0;
    s.Inp1EngFul = 100;
    s.Inp1EngUnt = "%   ";
    s.AuxVmA = 1.0f;
    s.AuxIsI = 1;
    s.Out1RngTyp = 3;  // 0-20 mA
    s.Out1EngZro = 4;
    s.Out1EngFul = 20;
    s.Out1SigLmZ = 4;
    s.Out1SigLmF = 20;
    s.BussIdenti = 7;
    s.SetFileName("BENCH 4");
    return s;
}

// Factory values of a module: input gain G = 56800 counts over a range.
void factoryValues(RegMap& v) {
    v.Mod_Type = 4;  // KV720-20
    v.CIN_Z = 1200;
    v.CIN_F = 58000;
    v.SLOP_P = 20000;
    v.SLOP_N = 30000;
    v.COUT_Z = 3000;
    v.COUT_F = 59000;
    v.IS_ZS1 = 2000;  // 80000 counts per mA
    v.IS_FS1 = 62000;
    v.IS_ZS2 = 1000;  // 5000 counts per mA
    v.IS_FS2 = 47000;
    v.VS_ZS1 = 1000;  // 10000 counts per V
    v.VS_FS1 = 26000;
    v.VS_ZS2 = 3000;  // 5000 counts per V
    v.VS_FS2 = 63000;
}

bool straightLine(const Table1Data& t) {
    for (int i = 0; i <= Table1LastUsed; ++i)
        if (t[i] != i * 100)
            return false;
    return t[Table1LastUsed + 1] == TableChecksumOf(t.data(), Table1LastUsed);
}

}  // namespace

class TestKv720 : public QObject {
    Q_OBJECT
private slots:
    void init();

    void milliVoltChecks_data();
    void milliVoltChecks();
    void inputRangeRow_data();
    void inputRangeRow();
    void startOfRun_data();
    void startOfRun();
    void startOfRunTables();
    void auxChecks_data();
    void auxChecks();
    void auxBands_data();
    void auxBands();
    void inputCounts_data();
    void inputCounts();
    void shapeAndUnitCodes_data();
    void shapeAndUnitCodes();
    void inputTypeNames();

    void dispatcherKinds();
    void addressesOutsideTheOrder();
    void failureNamesTheAcknowledgedRegister();
    void inputRangeReadBackVerified();
    void outputRangeReadBackVerified();
    void inputCalibrationStep();
    void thermocoupleCalibrationStep();
    void fileNameParts();
    void fileNamePartsWhileReading();
    void tableTransfers();
    void decodingARead();
    void readWarningsHandedOver();

private:
    bool program(qint32 id, qint16 busId = 16);
    bool read(qint32 id, qint16 busId = 16);

    RequestEngine engine_;
    SettingsSet settings_;
    QString text_;
};

void TestKv720::init() {
    SetRegMap(RegAdd, NoModuleMap);
    SetRegMap(RegAdd, Kv720Map);
    ModuleMap = Kv720Map;
    BuildRangeTables(RegAdd, Kv720Map);
    factoryValues(RegVal);
    engine_.setState(StateRun);
    engine_.setReserved(true);
    settings_ = milliVolts(0, 20);
    *Kv720Driver().work = DriverWork();
}

bool TestKv720::program(qint32 id, qint16 busId) {
    text_.clear();
    QString requester = "MCT00042";
    engine_.setState(StateRun);  // as after the module's reply
    return GS720(engine_, 2, requester, settings_, id, busId, text_);
}

bool TestKv720::read(qint32 id, qint16 busId) {
    text_.clear();
    QString requester = "MCT00042";
    engine_.setState(StateRun);
    return GS720(engine_, 1, requester, settings_, id, busId, text_);
}

void TestKv720::milliVoltChecks_data() {
    QTest::addColumn<float>("lo");
    QTest::addColumn<float>("hi");
    QTest::addColumn<QString>("message");
    QTest::newRow("full 500 mV span") << 0.0f << 500.0f << "";
    QTest::newRow("span over 500") << 0.0f << 500.1f << "Maximum input range is 500mV";
    QTest::newRow("below -250") << -251.0f << 0.0f << "Minimum input is -250mV";
    QTest::newRow("at -250") << -250.0f << 0.0f << "";
    QTest::newRow("above 624") << 200.0f << 625.0f << "Maximum input is 624mV";
    QTest::newRow("span checked first") << 100.0f << 625.0f << "Maximum input range is 500mV";
    QTest::newRow("falling") << 10.0f << 5.0f << "Min must be < Max";
}

void TestKv720::milliVoltChecks() {
    QFETCH(float, lo);
    QFETCH(float, hi);
    QFETCH(QString, message);
    QString text;
    QCOMPARE(Kv720MilliVoltChecks(lo, hi, text), message.isEmpty());
    QCOMPARE(text, message);
}

void TestKv720::inputRangeRow_data() {
    // The KV720's input ranges: rows 1-8 are 2, 5, 10, 20, 50, 100, 200, 500 mV.
    QTest::addColumn<float>("lo");
    QTest::addColumn<float>("hi");
    QTest::addColumn<float>("offset");
    QTest::addColumn<int>("row");
    QTest::newRow("0-2 mV") << 0.0f << 2.0f << 0.0f << 1;
    QTest::newRow("10-30: offset 125% of 20 mV") << 10.0f << 30.0f << 0.0f << 4;
    QTest::newRow("150-200: offset within 200 mV") << 150.0f << 200.0f << 0.0f << 7;
    QTest::newRow("240-260: 500 mV takes 50% offset") << 240.0f << 260.0f << 0.0f << 7;
    QTest::newRow("-10..10: half below zero") << -10.0f << 10.0f << 0.0f << 4;
    QTest::newRow("-11..9: more than half below") << -11.0f << 9.0f << 0.0f << 5;
    QTest::newRow("pt100 offset moves the row") << -20.0f << 30.0f << 8.0f << 6;
    QTest::newRow("without it") << -20.0f << 30.0f << 0.0f << 5;
    QTest::newRow("300-350: no row") << 300.0f << 350.0f << 0.0f << 0;
    QTest::newRow("251-260: over every offset") << 251.0f << 260.0f << 0.0f << 0;
}

void TestKv720::inputRangeRow() {
    QFETCH(float, lo);
    QFETCH(float, hi);
    QFETCH(float, offset);
    QFETCH(int, row);
    qint32 chosen = -1;
    QString text;
    QCOMPARE(Kv720SelectInputRange(ProgramRangeTable(Input1), lo, hi, offset, chosen, text),
             row != 0);
    if (row != 0)
        QCOMPARE(chosen, row);
    else
        QCOMPARE(text, QString("Maximum input 624mV and maximum offset is 50% of range.9"));
}

void TestKv720::startOfRun_data() {
    QTest::addColumn<int>("type");
    QTest::addColumn<QString>("shape");
    QTest::addColumn<QString>("unit");
    QTest::addColumn<float>("zero");
    QTest::addColumn<float>("full");
    QTest::addColumn<int>("differ");
    QTest::addColumn<int>("loaded");
    QTest::addColumn<QString>("message");
    QTest::addColumn<double>("lo");
    QTest::addColumn<double>("hi");
    QTest::addColumn<double>("offset");
    QTest::addColumn<int>("channel");
    QTest::addColumn<int>("impedance");
    QTest::addColumn<double>("aux");
    QTest::addColumn<int>("current");

    // clang-format off
    QTest::newRow("mV") << 1 << "Linear" << "mV" << 0.f << 100.f << 0 << 0 << "" << 0.0 << 100.0 << 0.0 << 3 << 1 << 1.0 << 1;
    QTest::newRow("mV differential loaded") << 1 << "Linear" << "mV" << 0.f << 100.f << 1 << 1 << "" << 0.0 << 100.0 << 0.0 << 4 << 4 << 1.0 << 1;
    QTest::newRow("mV single-ended loaded") << 1 << "Linear" << "mV" << 0.f << 100.f << 0 << 1 << "" << 0.0 << 100.0 << 0.0 << 3 << 3 << 1.0 << 1;
    QTest::newRow("mV too wide") << 1 << "Linear" << "mV" << 0.f << 500.1f << 0 << 0 << "Maximum input range is 500mV" << 0.0 << 0.0 << 0.0 << 0 << 0 << 0.0 << 0;
    QTest::newRow("strain gauge loaded") << 8 << "Linear" << "mV" << -10.f << 10.f << 0 << 1 << "" << -10.0 << 10.0 << 0.0 << 4 << 4 << 1.0 << 1;
    QTest::newRow("thermocouple K") << 2 << "Type K" << "°C" << 0.f << 100.f << 0 << 0 << "" << 0.0 << 4.096 << 0.0 << 3 << 1 << 0.001 << 1;
    QTest::newRow("thermocouple loaded") << 2 << "Type K" << "°C" << 0.f << 100.f << 1 << 1 << "" << 0.0 << 4.096 << 0.0 << 3 << 3 << 0.001 << 1;
    QTest::newRow("pt100 3 wire") << 3 << "pt100." << "°C" << 0.f << 100.f << 0 << 0 << "" << 0.0 << 30.8044 << 8.0 << 3 << 1 << 0.8 << 1;
    QTest::newRow("pt1000 2 wire") << 5 << "pt1000." << "°C" << 0.f << 100.f << 0 << 0 << "" << 0.0 << 77.011 << 0.0 << 3 << 1 << 0.2 << 1;
    QTest::newRow("rtd ignores loading") << 4 << "pt100." << "°C" << 0.f << 100.f << 1 << 1 << "" << 0.0 << 30.8044 << 8.0 << 3 << 1 << 0.8 << 1;
    QTest::newRow("rtd shape without dot") << 3 << "PT100" << "°C" << 0.f << 100.f << 0 << 0 << "? Input Type" << 0.0 << 0.0 << 0.0 << 0 << 0 << 0.0 << 0;
    QTest::newRow("0-9 ohm") << 6 << "Linear" << "ohm" << 0.f << 9.f << 0 << 0 << "" << 0.0 << 10.0 << 0.0 << 3 << 1 << 10.0 / 9.0 << 1;
    QTest::newRow("0-2 kohm") << 6 << "Linear" << "kohm" << 0.f << 2.f << 0 << 0 << "" << 0.0 << 500.0 << 0.0 << 3 << 1 << 0.25 << 1;
    QTest::newRow("60 kohm") << 6 << "Linear" << "kohm" << 0.f << 60.f << 0 << 0 << "Resistance is too high (50 kmax)" << 0.0 << 0.0 << 0.0 << 0 << 0 << 0.0 << 0;
    QTest::newRow("half an ohm") << 6 << "Linear" << "ohm" << 0.f << 0.5f << 0 << 0 << "Resistance is too low (1R min)" << 0.0 << 0.0 << 0.0 << 0 << 0 << 0.0 << 0;
    QTest::newRow("ohm in mV") << 6 << "Linear" << "mV" << 0.f << 9.f << 0 << 0 << "? Measurement Units" << 0.0 << 0.0 << 0.0 << 0 << 0 << 0.0 << 0;
    QTest::newRow("potentiometer") << 7 << "Linear" << "%Pot" << 0.f << 100.f << 0 << 0 << "" << 0.0 << 500.0 << 0.0 << 3 << 1 << 0.5 << 0;
    QTest::newRow("potentiometer 20-60%") << 7 << "Linear" << "%Pot" << 20.f << 60.f << 0 << 0 << "" << 100.0 << 300.0 << 0.0 << 3 << 1 << 0.5 << 0;
    QTest::newRow("potentiometer empty") << 7 << "Linear" << "%Pot" << 50.f << 50.f << 0 << 0 << "Measurement input must be between 0 and 100%" << 0.0 << 0.0 << 0.0 << 0 << 0 << 0.0 << 0;
    QTest::newRow("potentiometer past 100") << 7 << "Linear" << "%Pot" << 0.f << 101.f << 0 << 0 << "Measurement input must be between 0 and 100%" << 0.0 << 0.0 << 0.0 << 0 << 0 << 0.0 << 0;
    QTest::newRow("type 9") << 9 << "Linear" << "mV" << 0.f << 10.f << 0 << 0 << "ms.Inp1RngTyp ?" << 0.0 << 0.0 << 0.0 << 0 << 0 << 0.0 << 0;
    // clang-format on
}

void TestKv720::startOfRun() {
    QFETCH(int, type);
    QFETCH(QString, shape);
    QFETCH(QString, unit);
    QFETCH(float, zero);
    QFETCH(float, full);
    QFETCH(int, differ);
    QFETCH(int, loaded);
    QFETCH(QString, message);
    QFETCH(double, lo);
    QFETCH(double, hi);
    QFETCH(double, offset);
    QFETCH(double, aux);
    SettingsSet s = milliVolts(zero, full);
    s.Inp1RngTyp = type;
    s.Inp1Shape = shape;
    s.Inp1MeUnit = unit;
    s.Inp1EngUnt = unit.leftJustified(4);
    s.Typ1Differ = differ;
    s.Typ1InRes = loaded;
    DriverWork work;
    QString text;
    QCOMPARE(Kv720StartInput(s, work, text), message.isEmpty());
    QCOMPARE(text, message);
    if (!message.isEmpty())
        return;
    QVERIFY2(qAbs(work.DrvInLo - lo) < 1e-3, qPrintable(QString::number(work.DrvInLo)));
    QVERIFY2(qAbs(work.DrvInHi - hi) < 1e-3, qPrintable(QString::number(work.DrvInHi)));
    QCOMPARE(double(work.DrvInOffset), offset);
    QTEST(int(work.DrvInCh), "channel");
    QTEST(int(work.DrvInRes), "impedance");
    QVERIFY2(qAbs(s.AuxVmA - aux) < 1e-6, qPrintable(QString::number(s.AuxVmA)));
    QTEST(int(s.AuxIsI), "current");
}

void TestKv720::startOfRunTables() {
    // A user table goes as it is; a sensor brings its own and measures in
    // engineering units.
    DriverWork work;
    QString text;
    SettingsSet user = milliVolts(0, 20);
    user.Inp1Shape = "Table";
    user.Table1.fill(7);
    QVERIFY(Kv720StartInput(user, work, text));
    QCOMPARE(user.Table1[50], 7);

    SettingsSet sensor = milliVolts(0, 200);
    sensor.Inp1RngTyp = Kv720Thermocouple;
    sensor.Inp1Shape = "Type K";
    sensor.Inp1EngUnt = "°C  ";
    QVERIFY2(Kv720StartInput(sensor, work, text), qPrintable(text));
    QCOMPARE(sensor.Inp1EngZro, 0.0f);
    QCOMPARE(sensor.Inp1EngFul, 200.0f);
    QCOMPARE(sensor.Table1[0], 0);
    QCOMPARE(sensor.Table1[100], 10000);
    QVERIFY(!straightLine(sensor.Table1));
}

void TestKv720::auxChecks_data() {
    QTest::addColumn<int>("type");
    QTest::addColumn<int>("current");
    QTest::addColumn<float>("aux");
    QTest::addColumn<QString>("message");
    QTest::newRow("10.8 mA") << 1 << 1 << 10.8f << "";
    QTest::newRow("over 10.8 mA") << 1 << 1 << 10.81f << "Auxilary 10.8mA maximum";
    QTest::newRow("0.01 mA") << 1 << 1 << 0.01f << "";
    QTest::newRow("under 0.01 mA") << 1 << 1 << 0.0099f << "Auxilary 0.01mA (10uA) minimum";
    QTest::newRow("thermocouple 1 uA") << 2 << 1 << 0.001f << "";
    QTest::newRow("16 V") << 1 << 0 << 16.0f << "";
    QTest::newRow("over 16 V") << 1 << 0 << 16.01f << "Auxilary 16V maximum";
    QTest::newRow("0.1 V") << 7 << 0 << 0.1f << "";
    QTest::newRow("under 0.1 V") << 7 << 0 << 0.099f << "Auxilary 0.1V minimum";
}

void TestKv720::auxChecks() {
    QFETCH(int, type);
    QFETCH(int, current);
    QFETCH(float, aux);
    QFETCH(QString, message);
    SettingsSet s;
    s.Inp1RngTyp = type;
    s.AuxIsI = current;
    s.AuxVmA = aux;
    QString text;
    QCOMPARE(Kv720AuxChecks(s, text), message.isEmpty());
    QCOMPARE(text, message);
}

void TestKv720::auxBands_data() {
    QTest::addColumn<int>("current");
    QTest::addColumn<float>("aux");
    QTest::addColumn<bool>("voltageBit");
    QTest::addColumn<bool>("highBit");
    QTest::addColumn<double>("count");
    QTest::newRow("0.05 mA") << 1 << 0.05f << false << false << 2000.0;
    QTest::newRow("0.8 mA low band") << 1 << 0.8f << false << false << 62000.0;
    QTest::newRow("0.81 mA high band") << 1 << 0.81f << false << true << 1050.0;
    QTest::newRow("10 mA") << 1 << 10.0f << false << true << 47000.0;
    QTest::newRow("3.19 V low band") << 0 << 3.19f << true << false << 27900.0;
    QTest::newRow("3.2 V high band") << 0 << 3.2f << true << true << 4000.0;
}

void TestKv720::auxBands() {
    QFETCH(int, current);
    QFETCH(float, aux);
    QFETCH(bool, voltageBit);
    QFETCH(bool, highBit);
    QFETCH(double, count);
    SettingsSet s;
    s.AuxIsI = current;
    s.AuxVmA = aux;
    quint16 flags = current ? 0x0010 : 0x0020;  // stale bits from the module
    const double computed = Kv720AuxCount(s, RegVal, flags);
    QVERIFY2(qAbs(computed - count) < 0.01, qPrintable(QString::number(computed)));
    QCOMPARE(TestBit(flags, 4), voltageBit);
    QCOMPARE(TestBit(flags, 5), highBit);

    float back = 0;
    qint32 isCurrent = -1;
    QVERIFY(Kv720AuxFromCount(qRound(computed), flags, RegVal, back, isCurrent));
    QCOMPARE(back, aux);
    QCOMPARE(isCurrent, current);

    RegVal.IS_FS1 = RegVal.IS_ZS1;
    RegVal.IS_FS2 = RegVal.IS_ZS2;
    RegVal.VS_FS1 = RegVal.VS_ZS1;
    RegVal.VS_FS2 = RegVal.VS_ZS2;
    QVERIFY(!Kv720AuxFromCount(qRound(computed), flags, RegVal, back, isCurrent));
}

void TestKv720::inputCounts_data() {
    // G = 56800 counts over the 20 mV range, positive slope 20000, negative 30000.
    QTest::addColumn<double>("lo");
    QTest::addColumn<double>("hi");
    QTest::addColumn<double>("zero");
    QTest::addColumn<double>("full");
    QTest::addColumn<bool>("offsetBit");
    QTest::newRow("from zero") << 0.0 << 20.0 << 200.0 << 58000.0 << true;
    QTest::newRow("below zero") << -5.0 << 15.0 << 1856.6667 << 58000.0 << true;
    QTest::newRow("small positive offset") << 0.1 << 20.0 << 166.8667 << 57716.0 << true;
    QTest::newRow("large positive offset") << 1.0 << 20.0 << 259.5 << 55160.0 << false;
}

void TestKv720::inputCounts() {
    QFETCH(double, lo);
    QFETCH(double, hi);
    QFETCH(double, zero);
    QFETCH(double, full);
    QFETCH(bool, offsetBit);
    Kv720InputCounts counts;
    QString text;
    QVERIFY(Kv720InputCalibration(20.0, RegVal, lo, hi, counts, text));
    QVERIFY2(qAbs(counts.zero - zero) < 1e-3, qPrintable(QString::number(counts.zero, 'f', 4)));
    QVERIFY2(qAbs(counts.full - full) < 1e-3, qPrintable(QString::number(counts.full, 'f', 4)));
    QCOMPARE(counts.offsetBit, offsetBit);

    RegVal.SLOP_N = 0;  // a module without its factory calibration
    QVERIFY(!Kv720InputCalibration(20.0, RegVal, lo, hi, counts, text));
    QCOMPARE(text, QString("Invalid Input Cal Values"));
}

void TestKv720::shapeAndUnitCodes_data() {
    QTest::addColumn<int>("type");
    QTest::addColumn<int>("typeInUnit");
    QTest::addColumn<QString>("unit");
    QTest::addColumn<QString>("shape");
    // clang-format off
    QTest::newRow("type K in °C") << 2 << 0x14 << "°C" << "Type K";
    QTest::newRow("type T in °K") << 2 << 0x38 << "°K" << "Type T";
    QTest::newRow("pt1000 in °F") << 4 << 0x22 << "°F" << "pt1000.";
    QTest::newRow("kohm table") << 6 << 0x22 << "kohm" << "Table";
    QTest::newRow("pot") << 7 << 0x11 << "%Pot" << "Linear";
    QTest::newRow("code not offered") << 1 << 0x23 << "" << "";
    QTest::newRow("type outside 1-8") << 0 << 0x11 << "MU TYPE ?" << "Shape TYPE ?";
    // clang-format on
}

void TestKv720::shapeAndUnitCodes() {
    QFETCH(int, type);
    QFETCH(int, typeInUnit);
    QTEST(Kv720UnitText(type, Kv720UnitCode(typeInUnit)), "unit");
    QTEST(Kv720ShapeText(type, Kv720ShapeCode(typeInUnit)), "shape");
    QCOMPARE(Kv720TypeInUnit(Kv720UnitCode(typeInUnit), Kv720ShapeCode(typeInUnit)), typeInUnit);
}

void TestKv720::inputTypeNames() {
    QCOMPARE(Kv720InputTypeText(Kv720MilliVolt), QString("mV Transmitter"));
    QCOMPARE(Kv720InputTypeText(Kv720Rtd2Wire), QString("RTDT 2W Transmitter"));
    QCOMPARE(Kv720InputTypeText(Kv720StrainGauge), QString("Strain Gauge Transmitter"));
    QCOMPARE(Kv720InputTypeText(9), QString());
}

void TestKv720::dispatcherKinds() {
    DiagnosticCapture capture;
    QString requester = "MCT00077";
    QString text;
    QVERIFY(!GS720(engine_, 4, requester, settings_, RegAdd.Mod_Type, 16, text));
    QCOMPARE(text, QString("GS720 ? Call Back Function"));
    QCOMPARE(engine_.state(), qint32(StateRun));  // nothing queued
    QCOMPARE(capture.lines.size(), size_t(1));
    QCOMPARE(capture.lines[0].tag, QString("GS720"));
    QCOMPARE(capture.lines[0].kind, QString("?"));
    QCOMPARE(Kv720Driver().work->DrvRequester, requester);

    text = "unchanged";
    QVERIFY(!GS720(engine_, 3, requester, settings_, 0, 16, text));
    QCOMPARE(text, QString("unchanged"));
    Kv720Driver().work->DrvWarning = "Invalid Output 1 Range, ";
    QVERIFY(!GS720(engine_, 3, requester, settings_, 0, 16, text));
    QCOMPARE(text, QString("Invalid Output 1 Range, "));
}

void TestKv720::addressesOutsideTheOrder() {
    DiagnosticCapture capture;
    QVERIFY(!program(1));
    QVERIFY2(text_.endsWith(": cbSet 1 FAIL Start process on calling form"), qPrintable(text_));
    QVERIFY(!engine_.reserved());
    QVERIFY(!program(RegAdd.Sig_Lmt1_F));
    QCOMPARE(text_, QString("PROGRAM FAIL Signal Limit 1 Hi: cbSet RegAdd.Sig_Lmt1_F End "
                            "process on calling form"));
    QVERIFY(!program(RegAdd.Int_Ref));
    QCOMPARE(text_, QString("PROGRAM FAIL Internal reference: ? Set Address69"));
    QCOMPARE(capture.lines.back().tag, QString("modKV720.cbSet"));
    QCOMPARE(capture.lines.back().text, QString("? Set Address69"));

    QVERIFY(!read(1));
    QCOMPARE(text_, QString("cbGetSet 1 FAIL Start process on calling form"));
    QVERIFY(!read(RegAdd.Int_Ref));
    QCOMPARE(text_, QString("cbGet ? address:69"));
    QCOMPARE(capture.lines.back().tag, QString("modKV720.cbGet"));
    QVERIFY(read(0));
    QCOMPARE(engine_.state(), qint32(StateRun));  // nothing queued
}

void TestKv720::failureNamesTheAcknowledgedRegister() {
    // The engine refuses the request the step queues.
    engine_.setState(StateClosed);
    QString requester = "MCT00042";
    QVERIFY(!GS720(engine_, 2, requester, settings_, RegAdd.Mod_Type, 16, text_));
    QCOMPARE(text_, QString("PROGRAM FAIL Module Type: Must be in run mode"));
}

void TestKv720::inputRangeReadBackVerified() {
    settings_.RemoteCont = 1;
    QVERIFY(program(RegAdd.Mod_Type));
    QVERIFY(program(RegAdd.Buss_ID));
    QCOMPARE(settings_.Inp1RngSet, 4);  // 0-20 mV
    RegVal.In_Rng1 = 3;                 // the module kept another range
    QVERIFY(!program(RegAdd.In_Rng1));
    QCOMPARE(text_, QString("PROGRAM FAIL MR Input 1 Range: "));
    RegVal.In_Rng1 = 4;
    QVERIFY(program(RegAdd.In_Rng1));
    QCOMPARE(engine_.awaitedAddress(), qint32(RegAdd.in_ch));
    QCOMPARE(Kv720Driver().work->DrvInCh, qint16(0x83));  // single-ended, remote
}

void TestKv720::outputRangeReadBackVerified() {
    RegVal.Out_Rng1 = 2;
    QVERIFY(!program(RegAdd.Out_Rng1));
    QCOMPARE(text_, QString("PROGRAM FAIL User Output 1 Range: Verify Output Range"));
    RegVal.Out_Rng1 = 3;
    QVERIFY(program(RegAdd.Out_Rng1));
    QCOMPARE(engine_.awaitedAddress(), qint32(RegAdd.COUT_Z));
    QVERIFY(program(RegAdd.COUT_F));
    // 4-20 of 0-20 mA between the factory counts 3000 and 59000
    QCOMPARE(Kv720Driver().work->DrvOutZ, 14200);
    QCOMPARE(Kv720Driver().work->DrvOutF, 59000);
    settings_.Out1SigLmZ = 30;  // beyond the range
    QVERIFY(!program(RegAdd.Usr_Out1_F));
    QVERIFY2(text_.startsWith("PROGRAM FAIL User Output 1 Full Scale: UsrCalRangeSet: "),
             qPrintable(text_));
    RegVal.Out_Rng1 = 17;
    QVERIFY(!program(RegAdd.COUT_F));
    QCOMPARE(text_, QString("PROGRAM FAIL COUT_F CalOUT FS: Invalid Output 1 Range"));
}

void TestKv720::inputCalibrationStep() {
    settings_.UserLmtEna = 1;
    settings_.Inp1Respon = 1;
    RegVal.Flag_A = qint16(0x01C2);  // bit 8 of the module's own; stale burn-out and response bits
    QVERIFY(program(RegAdd.Mod_Type));
    QVERIFY(program(RegAdd.Buss_ID));
    QVERIFY2(program(RegAdd.SLOP_N), qPrintable(text_));
    QCOMPARE(engine_.awaitedAddress(), qint32(RegAdd.Usr_In1_Z));
    // bits 0 offset, 1 response, 2 limits, 5 high current band (1 mA); burn-out cleared; bit 8 kept
    QCOMPARE(RegVal.Flag_A, qint16(0x0127));
    QCOMPARE(RegVal.Orig_FlagA, qint32(0x0127));
    QCOMPARE(RegVal.Aux_C, 2000);  // (1 - 0.8) / 9.2 * 46000 + 1000

    settings_.AuxVmA = 11;
    QVERIFY(!program(RegAdd.SLOP_N));
    QCOMPARE(text_, QString("PROGRAM FAIL SLOP_N Negative Offset Slop: Auxilary 10.8mA maximum"));
}

void TestKv720::thermocoupleCalibrationStep() {
    settings_ = milliVolts(0, 100);
    settings_.Inp1RngTyp = Kv720Thermocouple;
    settings_.Inp1Shape = "Type K";
    settings_.Inp1EngUnt = "°C  ";
    settings_.Inp1BurnOut = 2;
    RegVal.CIN_F = 6880;  // G = 5680 counts over a range
    QVERIFY2(program(RegAdd.Mod_Type), qPrintable(text_));
    QVERIFY(program(RegAdd.Buss_ID));
    QCOMPARE(settings_.Inp1RngSet, 2);  // 4.1 mV fits the 5 mV range
    QVERIFY2(program(RegAdd.SLOP_N), qPrintable(text_));
    QCOMPARE(RegVal.Flag_A & 0xC0, 0xC0);  // burn-out down scale
    // Table C: the emf at 0..50 °C in tenths of a count of the 5 mV range.
    QCOMPARE(settings_.TableC[0], 0);
    QVERIFY2(qAbs(settings_.TableC[50] - 2.023 / 5.0 * 5680 * 10) < 5,
             qPrintable(QString::number(settings_.TableC[50])));
    QCOMPARE(settings_.TableC[51], TableChecksumOf(settings_.TableC.data(), TableCLastUsed));

    RegVal.CIN_F = 58000;  // ten times the gain no longer fits the table's 16 bits
    QVERIFY(!program(RegAdd.SLOP_N));
    QCOMPARE(text_, QString("PROGRAM FAIL SLOP_N Negative Offset Slop: FAIL TableC output MUST "
                            "be below 65536"));
}

void TestKv720::fileNameParts() {
    // A part acknowledged with another bus ID than the one sent ends the run.
    QVERIFY(program(RegAdd.TypInput));
    QCOMPARE(engine_.awaitedAddress(), qint32(RegAdd.File_Name));
    QVERIFY(!program(RegAdd.File_Name, 36));
    QCOMPARE(text_, QString("PROGRAM FAIL File Name -36:  Return ID36 Invalid"));
    QVERIFY(program(RegAdd.TypInput));
    QVERIFY(!program(RegAdd.File_Name, 20));  // part 16 was sent, not 20
    QVERIFY(text_.endsWith(" Return ID20 Invalid"));
}

void TestKv720::fileNamePartsWhileReading() {
    // While reading, a wrong part is a warning handed over at the end.
    QVERIFY(read(RegAdd.Buss_ID));
    QCOMPARE(engine_.awaitedAddress(), qint32(RegAdd.File_Name));
    QVERIFY(!read(RegAdd.File_Name, 36));
    QCOMPARE(text_, QString("Invalid Return ID:36"));
    QCOMPARE(Kv720Driver().work->DrvWarning, QString("Invalid Return ID:36, "));
}

void TestKv720::tableTransfers() {
    DiagnosticCapture capture;
    QVERIFY(program(RegAdd.Gain_Factor));
    QCOMPARE(engine_.awaitedAddress(), qint32(RegAdd.Table1));
    QVERIFY(program(RegAdd.Table1, 16));
    QVERIFY(!program(RegAdd.Table1, 20));
    QCOMPARE(text_, QString("PROGRAM FAIL Table 1 -5: ? table Send_ID:18 Return_ID:20"));
    QVERIFY(capture.lines.size() >= 2);
    QCOMPARE(capture.lines[capture.lines.size() - 2].tag, QString("WriteTable"));
}

void TestKv720::decodingARead() {
    RegVal.TypInput = Kv720Thermocouple;
    RegVal.Type_In_Unit = 0x24;  // °F, type K
    RegVal.in_ch = 0x83;         // single-ended, remote
    RegVal.in_res = 3;           // loaded
    RegVal.Flag_A = 0x004E;      // response, limits, reverse, burn-out up scale
    RegVal.Orig_FlagA = 0x004E;
    RegVal.Gain_Factor = 10000;
    RegVal.Usr_In1_Z = 200;
    RegVal.Orig_OS_PWM = 200;
    RegVal.Aux_C = -1920;  // 0.001 mA in the low current band
    RegVal.Eng_Unit1 = 0xB0;
    RegVal.Eng_Unit2 = 'F';
    RegVal.Eng_Unit3 = ' ';
    RegVal.Eng_Unit4 = 10;
    RegVal.Out_Rng1 = 3;
    RegVal.Usr_Out1_Z = 14200;
    RegVal.Usr_Out1_F = 59000;
    RegVal.Sig_Lmt1_Z = 3000;
    RegVal.Sig_Lmt1_F = 59000;
    for (int i = 0; i < Table1Points; ++i)
        RegVal.Table1_Pts[i] = i * 90;
    TableChecksum(RegVal.Table1_Pts.data(), Table1LastUsed);
    DriverWork work;
    SettingsSet s;
    Kv720DecodeRead(s, work);
    QCOMPARE(work.DrvWarning, QString());
    QCOMPARE(s.Inp1MeUnit, QString("°F"));
    QCOMPARE(s.Inp1Shape, QString("Type K"));
    QCOMPARE(s.Typ1Differ, 0);
    QCOMPARE(s.RemoteCont, 1);
    QCOMPARE(s.Typ1InRes, 1);
    QCOMPARE(s.Inp1Respon, 1);
    QCOMPARE(s.UserLmtEna, 1);
    QCOMPARE(s.DirecrReve, 1);
    QCOMPARE(s.Inp1BurnOut, 1);
    QCOMPARE(s.MinorTrim, 0);
    QCOMPARE(s.AuxIsI, 1);
    QCOMPARE(s.AuxVmA, 0.001f);
    QCOMPARE(s.Inp1EngUnt, QString("°F ?"));
    QCOMPARE(s.Out1EngZro, 4.0f);
    QCOMPARE(s.Out1EngFul, 20.0f);
    QCOMPARE(s.Out1SigLmZ, 0.0f);
    QCOMPARE(s.Out1EngUnt, QString("mA"));
    QCOMPARE(s.Table1[100], 9000);

    RegVal.Usr_In1_Z = 210;  // trimmed since it was programmed
    RegVal.Table1_Pts[5] += 1;
    s.Table1.fill(0);
    Kv720DecodeRead(s, work);
    QCOMPARE(s.MinorTrim, 1);
    QCOMPARE(s.Table1[100], 0);  // a table with a wrong checksum is not taken
}

void TestKv720::readWarningsHandedOver() {
    RegVal.Out_Rng1 = 17;
    RegVal.IS_FS1 = RegVal.IS_ZS1;
    RegVal.Flag_A = 0;
    settings_.Out1EngZro = 4;
    QVERIFY(read(RegAdd.Mod_Type));  // clears the warning of an earlier run
    QVERIFY(read(RegAdd.Input_B4_Table));
    QCOMPARE(engine_.awaitedAddress(), qint32(RegAdd.Int_Temp));
    QCOMPARE(settings_.Out1EngZro, 0.0f);
    QString requester = "MCT00042";
    QString text = "none";
    QVERIFY(!GS720(engine_, 3, requester, settings_, 0, 16, text));
    QCOMPARE(text, QString("Invalid Output 1 Range, kv720AuxRead failed , "));
}

QTEST_GUILESS_MAIN(TestKv720)
#include "tst_kv720.moc"
