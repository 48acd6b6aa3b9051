#include "drivers/kv718_driver.h"
#include "drivers/kv718_input.h"
#include "model/codec.h"
#include "tests/support/diagnostic_capture.h"
#include "tests/support/driver_bench.h"

#include <QtTest>

using namespace kv;

namespace {

RangeDescriptor row(float minimum, float maximum, qint32 countMin, qint32 countMax,
                    const QString& unit) {
    RangeDescriptor d;
    d.minimum = minimum;
    d.maximum = maximum;
    d.countMin = countMin;
    d.countMax = countMax;
    d.unit = unit;
    return d;
}

// Input 1 of a KV718-xA as its identification leaves it: the bipolar converter
// puts every range minimum at mid-scale.
RangeTable inputTable() {
    RangeTable table;
    table[3] = row(0, 20, 32768, 60000, QStringLiteral("mA"));
    table[10] = row(0, 10, 32768, 60000, QStringLiteral("V"));
    table[11] = row(2, 10, 32768, 60000, QStringLiteral("V"));
    table[15] = row(0, 200, 32768, 60000, QStringLiteral("V"));
    return table;
}

SettingsSet record(const QString& unit, qint32 range, float lo, float hi) {
    SettingsSet s;
    s.Inp1MeUnit = unit;
    s.Inp1RngSet = range;
    s.Inp1mU_Zro = lo;
    s.Inp1mU_Ful = hi;
    s.Inp1Shape = QStringLiteral("Linear");
    s.Inp1Samples = 50;
    return s;
}

constexpr int Kv718Type = 10;

// A record as the KV718-xA window hands it over, its input range chosen by the check.
SettingsSet kv718Record(const QString& unit, float lo, float hi) {
    SettingsSet s;
    s.ModTypeSet = Kv718Type;
    s.BussIdenti = 33;
    s.SetFileName(QStringLiteral("MOTOR VOLTS"));
    s.Inp1MeUnit = unit;
    s.Inp1mU_Zro = lo;
    s.Inp1mU_Ful = hi;
    QString message;
    if (!KV718InputRangeCheck(QString::number(lo), QString::number(hi), unit, s.Inp1RngSet,
                              message))
        qWarning() << message;
    s.Inp1EngZro = -100;
    s.Inp1EngFul = 100;
    s.Inp1EngUnt = QStringLiteral("%   ");
    s.Inp1Samples = 100;
    s.Inp1Shape = QStringLiteral("Linear");
    s.Out1RngTyp = 4;  // 4-20 mA
    s.Out1EngZro = 4;
    s.Out1EngFul = 20;
    s.Out1SigLmZ = 3.8f;
    s.Out1SigLmF = 20.5f;
    s.Inp1Respon = 1;
    s.DirecrReve = 1;
    drvbench::curveTable(s);
    return s;
}

std::vector<drvbench::Frame> kv718Programming() {
    drvbench::Expect e(Kv718AMap);
    e.read("Mod_Type")
        .fileName()
        .writes({"Eng_Unit1", "Eng_Unit2", "Eng_Unit3", "Eng_Unit4", "Eng_In_Z", "Eng_In_F",
                 "Meas_Unit_Z", "Meas_Unit_F", "In_Rng1", "Usr_In1_Z", "Usr_In1_F", "Out_Rng1",
                 "Usr_Out1_Z", "Usr_Out1_F", "Sig_Lmt1_Z", "Sig_Lmt1_F", "ST_Samples", "MIZ",
                 "Flag_A"})
        .table1()
        .read("Input_B4_Table")
        .write("Buss_ID")
        .moduleConfirmed();
    return e.frames();
}

std::vector<drvbench::Frame> kv718Reading() {
    drvbench::Expect e(Kv718AMap);
    e.read("Mod_Type")
        .read("Buss_ID")
        .fileName(true)
        .reads({"TypInput",   "Meas_Unit_Z", "Meas_Unit_F", "Eng_In_F",   "Eng_In_Z",
                "Flag_A",     "Out_Rng1",    "Usr_Out1_Z",  "Usr_Out1_F", "Sig_Lmt1_Z",
                "Sig_Lmt1_F", "ST_Samples",  "MIZ",         "Eng_Unit1",  "Eng_Unit2",
                "Eng_Unit3",  "Eng_Unit4",   "Usr_In1_Z",   "Usr_In1_F",  "In_Rng1"})
        .table1(true)
        .reads({"Input_B4_Table", "Int_Temp"})
        .moduleConfirmed();
    return e.frames();
}

}  // namespace

class TestDrv718 : public QObject {
    Q_OBJECT
private slots:
    void rangeCheck_data();
    void rangeCheck();
    void flagWord_data();
    void flagWord();
    void inputCalibration_data();
    void inputCalibration();
    void inputCalibrationKeepsDcOffset();
    void inputCalibrationFailures_data();
    void inputCalibrationFailures();

    void programmingRunFollowsTheOrder();
    void programThenReadGivesTheRecord_data();
    void programThenReadGivesTheRecord();
    void readWithoutAnOutputRangeWarns();
    void wrongModelStopsAtTheFirstStep();
    void inputCalibrationFailureStopsBeforeAnyWrite_data();
    void inputCalibrationFailureStopsBeforeAnyWrite();
};

void TestDrv718::rangeCheck_data() {
    QTest::addColumn<QString>("lo");
    QTest::addColumn<QString>("hi");
    QTest::addColumn<QString>("unit");
    QTest::addColumn<bool>("ok");
    QTest::addColumn<int>("range");
    QTest::addColumn<QString>("message");

    // clang-format off
    QTest::newRow("min not numeric") << "abc" << "1" << "V" << false << -1 << "Min not unmeric";
    QTest::newRow("decimal comma") << "0,5" << "1" << "V" << false << -1 << "Min not unmeric";
    QTest::newRow("max not numeric") << "0" << "" << "V" << false << -1 << "Max not unmeric";
    QTest::newRow("span 0.1") << "0" << "0.1" << "V" << false << -1 << "Max - Min < 0.2";
    QTest::newRow("equal ends") << "5" << "5" << "V" << false << -1 << "Max - Min < 0.2";
    QTest::newRow("reversed") << "10" << "0" << "V" << false << -1 << "Max - Min < 0.2";
    QTest::newRow("span 0.2") << "0" << "0.2" << "V" << true << 6 << "MAX +/- 200V";
    QTest::newRow("span 0.2 off zero") << "1.0" << "1.2" << "V" << true << 7 << "MAX +/- 200V";
    QTest::newRow("unknown unit") << "0" << "10" << "Ohm" << false << -1 << "Unknown Measure Unit: Ohm";
    QTest::newRow("unit is case sensitive") << "0" << "10" << "vac" << false << -1 << "Unknown Measure Unit: vac";
    QTest::newRow("bipolar V") << "-10" << "10" << "V" << true << 10 << "MAX +/- 200V";
    QTest::newRow("negative V only") << "-4" << "-1" << "V" << true << 8 << "MAX +/- 200V";
    QTest::newRow("full V") << "-200" << "200" << "V" << true << 15 << "MAX +/- 200V";
    QTest::newRow("V max beyond") << "0" << "201" << "V" << false << -1 << "MAX > +/- 200V";
    QTest::newRow("V min beyond") << "-201" << "0" << "V" << false << -1 << "Min > +/- 200V";
    QTest::newRow("4-20 mA takes 0-20") << "4" << "20" << "mA" << true << 3 << "MAX +/- 50mA";
    QTest::newRow("mA max beyond") << "0" << "60" << "mA" << false << -1 << "MAX > +/- 50mA";
    QTest::newRow("mA min beyond") << "-51" << "0" << "mA" << false << -1 << "Min > +/- 50mA";
    // 100 Vac is 141.4 V peak: beyond 0-100 V.
    QTest::newRow("100 Vac") << "0" << "100" << "Vac" << true << 15 << "MAX 140Vac";
    QTest::newRow("70 Vac") << "0" << "70" << "Vac" << true << 14 << "MAX 140Vac";
    QTest::newRow("71 Vac") << "0" << "71" << "Vac" << true << 15 << "MAX 140Vac";
    QTest::newRow("Vac max beyond") << "0" << "142" << "Vac" << false << -1 << "MAX > +/- 140Vac";
    QTest::newRow("Vac below zero") << "-1" << "1" << "Vac" << false << -1 << "Min > +/- 140Vac";
    QTest::newRow("35 mAac") << "0" << "35" << "mAac" << true << 5 << "MAX 35mAac";
    QTest::newRow("14 mAac") << "0" << "14" << "mAac" << true << 3 << "MAX 35mAac";
    QTest::newRow("mAac max beyond") << "0" << "36" << "mAac" << false << -1 << "MAX > +/- 35mAac";
    // clang-format on
}

void TestDrv718::rangeCheck() {
    QFETCH(QString, lo);
    QFETCH(QString, hi);
    QFETCH(QString, unit);
    QFETCH(bool, ok);
    QFETCH(int, range);
    QFETCH(QString, message);
    qint32 chosen = -1;
    QString text;
    QCOMPARE(KV718InputRangeCheck(lo, hi, unit, chosen, text), ok);
    QCOMPARE(text, message);
    QCOMPARE(chosen, range);
}

void TestDrv718::flagWord_data() {
    QTest::addColumn<QString>("unit");
    QTest::addColumn<QString>("shape");
    QTest::addColumn<int>("respon");
    QTest::addColumn<int>("limits");
    QTest::addColumn<int>("reverse");
    QTest::addColumn<int>("remote");
    QTest::addColumn<int>("flags");

    // clang-format off
    QTest::newRow("plain V") << "V" << "Linear" << 0 << 0 << 0 << 0 << 0x00;
    QTest::newRow("mA") << "mA" << "Linear" << 0 << 0 << 0 << 0 << 0x01;
    QTest::newRow("Vac") << "Vac" << "Linear" << 0 << 0 << 0 << 0 << 0x06;
    QTest::newRow("mAac") << "mAac" << "Linear" << 0 << 0 << 0 << 0 << 0x07;
    QTest::newRow("unknown unit") << "A" << "Linear" << 0 << 0 << 0 << 0 << 0x00;
    QTest::newRow("table") << "V" << "Table" << 0 << 0 << 0 << 0 << 0x08;
    QTest::newRow("remote") << "V" << "Linear" << 0 << 0 << 0 << 1 << 0x10;
    QTest::newRow("reverse") << "V" << "Linear" << 0 << 0 << 1 << 0 << 0x20;
    QTest::newRow("limits") << "V" << "Linear" << 0 << 1 << 0 << 0 << 0x40;
    QTest::newRow("response") << "V" << "Linear" << 1 << 0 << 0 << 0 << 0x80;
    QTest::newRow("everything") << "mAac" << "Table" << 1 << 1 << 1 << 1 << 0xFF;
    // clang-format on
}

// The flag word written, and the record it gives back when read.
void TestDrv718::flagWord() {
    QFETCH(QString, unit);
    QFETCH(QString, shape);
    QFETCH(int, respon);
    QFETCH(int, limits);
    QFETCH(int, reverse);
    QFETCH(int, remote);
    QFETCH(int, flags);
    SettingsSet s;
    s.Inp1MeUnit = unit;
    s.Inp1Shape = shape;
    s.Inp1Respon = respon;
    s.UserLmtEna = limits;
    s.DirecrReve = reverse;
    s.RemoteCont = remote;
    QCOMPARE(int(KV718FlagA(s)), flags);

    if (unit == QLatin1String("A"))
        return;  // an unknown unit is not kept
    SettingsSet back;
    back.Inp1Respon = back.UserLmtEna = back.DirecrReve = back.RemoteCont = 7;
    KV718ReadFlagA(quint16(flags), back);
    QVERIFY(drvbench::sameFields(back, s,
                                 {DRV_FIELD(Inp1MeUnit), DRV_FIELD(Inp1Shape),
                                  DRV_FIELD(Inp1Respon), DRV_FIELD(UserLmtEna),
                                  DRV_FIELD(DirecrReve), DRV_FIELD(RemoteCont)}));
}

void TestDrv718::inputCalibration_data() {
    QTest::addColumn<QString>("unit");
    QTest::addColumn<int>("range");
    QTest::addColumn<float>("lo");
    QTest::addColumn<float>("hi");
    QTest::addColumn<int>("zero");
    QTest::addColumn<int>("full");
    QTest::addColumn<int>("miz");
    QTest::addColumn<int>("ms");
    QTest::addColumn<int>("samples");

    // clang-format off
    // DC: -10..10 V over the 0-10 V row spans the converter from 2*CL-CH to CH.
    QTest::newRow("-10..10 V") << "V" << 10 << -10.0f << 10.0f << 5536 << 60000 << 777 << 10 << 2;
    QTest::newRow("0..10 V") << "V" << 10 << 0.0f << 10.0f << 32768 << 60000 << 777 << 50 << 6;
    // 1 V: 22 * 1361.6 + 5536 = 35491.2; the half added first makes it 35492.
    QTest::newRow("1..10 V") << "V" << 10 << 1.0f << 10.0f << 35492 << 60000 << 777 << 400 << 41;
    QTest::newRow("4..20 mA") << "mA" << 3 << 4.0f << 20.0f << 38215 << 60000 << 777 << 4000 << 401;
    // AC: zero is the row's count at minimum, MIZ and full are counts from the row minimum.
    QTest::newRow("0..100 Vac") << "Vac" << 15 << 0.0f << 100.0f << 32768 << 13616 << 0 << 50 << 6;
    QTest::newRow("1..100 Vac") << "Vac" << 15 << 1.0f << 100.0f << 32768 << 13616 << 137 << 50 << 6;
    QTest::newRow("2..10 Vac") << "Vac" << 11 << 2.0f << 10.0f << 32768 << 27232 << 0 << 50 << 6;
    QTest::newRow("5..15 mAac") << "mAac" << 3 << 5.0f << 15.0f << 32768 << 20424 << 6808 << 50 << 6;
    // clang-format on
}

void TestDrv718::inputCalibration() {
    QFETCH(QString, unit);
    QFETCH(int, range);
    QFETCH(float, lo);
    QFETCH(float, hi);
    QFETCH(int, ms);
    SettingsSet s = record(unit, range, lo, hi);
    s.Inp1Samples = ms;
    RegMap values;
    values.MIZ = 777;
    QString message;
    QVERIFY2(KV718A_CaculateInCal(s, inputTable(), values, message), qPrintable(message));
    QTEST(int(values.Usr_In1_Z), "zero");
    QTEST(int(values.Usr_In1_F), "full");
    QTEST(int(values.MIZ), "miz");
    QTEST(int(values.ST_Samples), "samples");
    QCOMPARE(int(KV718SamplesMs(values.ST_Samples)), ms);
    QCOMPARE(int(quint16(values.Flag_A)), int(KV718FlagA(s)));
}

void TestDrv718::inputCalibrationKeepsDcOffset() {
    // An unknown unit sets no coupling and leaves every count as it was.
    RegMap values;
    values.MIZ = 11;
    values.Usr_In1_Z = 22;
    values.Usr_In1_F = 33;
    QString message;
    QVERIFY(KV718A_CaculateInCal(record(QStringLiteral("A"), 10, 0, 10), inputTable(), values,
                                 message));
    QCOMPARE(values.MIZ, 11);
    QCOMPARE(values.Usr_In1_Z, 22);
    QCOMPARE(values.Usr_In1_F, 33);
}

void TestDrv718::inputCalibrationFailures_data() {
    QTest::addColumn<int>("range");
    QTest::addColumn<QString>("message");
    QTest::newRow("row beyond the table") << 17 << "KV718A_CaculateInCal: Invalid Input 1 Range";
    QTest::newRow("negative row") << -1 << "KV718A_CaculateInCal: Invalid Input 1 Range";
    QTest::newRow("row not calibrated") << 12 << "KV718A_CaculateInCal: Update Calibration Values";
}

void TestDrv718::inputCalibrationFailures() {
    QFETCH(int, range);
    RegMap values;
    QString message;
    QVERIFY(!KV718A_CaculateInCal(record(QStringLiteral("V"), range, 0, 1), inputTable(), values,
                                  message));
    QTEST(message, "message");
}

void TestDrv718::programmingRunFollowsTheOrder() {
    drvbench::Bench bench(Kv718Type, 3);
    QVERIFY(bench.ready());
    const SettingsSet s = kv718Record(QStringLiteral("V"), -10, 10);
    QCOMPARE(s.Inp1RngSet, 10);
    QVERIFY2(bench.program(Kv718Driver(), s), qPrintable(bench.result));
    QCOMPARE(bench.result, QString("KV718-xA Programmed"));
    QString difference;
    QVERIFY2(drvbench::sameFrames(bench.sent, kv718Programming(), difference),
             qPrintable(difference));

    // The input counts span the module's own calibration of the chosen range,
    // for -10..10 V the whole bipolar row.
    const RegMap map = RegMapFor(Kv718AMap);
    const int rangeRegister = 2 * (s.Inp1RngSet + 7);  // even register of the pair
    const qint32 cl = bench.sim->registerValue(rangeRegister);
    const qint32 ch = bench.sim->registerValue(rangeRegister + 1);
    const qint32 zero = bench.sim->registerValue(map.Usr_In1_Z);
    const qint32 full = bench.sim->registerValue(map.Usr_In1_F);
    QVERIFY2(qAbs(zero - (2 * cl - ch)) <= 1, qPrintable(QString::number(zero)));
    QVERIFY2(qAbs(full - ch) <= 1, qPrintable(QString::number(full)));
    QCOMPARE(bench.sim->registerValue(map.Flag_A), 0xA0);    // response, reverse, DC volts
    QCOMPARE(bench.sim->registerValue(map.ST_Samples), 11);  // 100 ms
    QCOMPARE(bench.sim->registerValue(map.In_Rng1), s.Inp1RngSet);
}

void TestDrv718::programThenReadGivesTheRecord_data() {
    QTest::addColumn<QString>("unit");
    QTest::addColumn<float>("lo");
    QTest::addColumn<float>("hi");
    QTest::addColumn<QString>("shape");
    QTest::addColumn<int>("samples");
    QTest::newRow("V linear") << "V" << -2.5f << 7.5f << "Linear" << 50;
    QTest::newRow("Vac table") << "Vac" << 1.0f << 100.0f << "Table" << 4000;
}

void TestDrv718::programThenReadGivesTheRecord() {
    QFETCH(QString, unit);
    QFETCH(float, lo);
    QFETCH(float, hi);
    QFETCH(QString, shape);
    QFETCH(int, samples);
    drvbench::Bench bench(Kv718Type, 1);
    QVERIFY(bench.ready());
    SettingsSet s = kv718Record(unit, lo, hi);
    s.Inp1Shape = shape;
    s.Inp1Samples = samples;
    s.RemoteCont = 1;
    s.UserLmtEna = 1;
    s.Inp1Respon = 0;
    QVERIFY2(bench.program(Kv718Driver(), s), qPrintable(bench.result));
    QVERIFY2(bench.read(Kv718Driver(), SettingsSet()), qPrintable(bench.result));
    QCOMPARE(bench.result, QString("KV718-2A Settings Read.."));
    QCOMPARE(bench.run.warning(), QString());
    QString difference;
    QVERIFY2(drvbench::sameFrames(bench.sent, kv718Reading(), difference), qPrintable(difference));

    const SettingsSet& back = bench.run.settings();
    QCOMPARE(back.ModTypeSet, Kv718Type);
    QVERIFY(drvbench::sameFields(
        back, s, {DRV_FIELD(BussIdenti), DRV_FIELD(FileName),    DRV_FIELD(Inp1MeUnit),
                  DRV_FIELD(Inp1RngSet), DRV_FIELD(Inp1mU_Zro),  DRV_FIELD(Inp1mU_Ful),
                  DRV_FIELD(Inp1EngZro), DRV_FIELD(Inp1EngFul),  DRV_FIELD(Inp1EngUnt),
                  DRV_FIELD(Inp1Shape),  DRV_FIELD(Inp1Samples), DRV_FIELD(Inp1Respon),
                  DRV_FIELD(UserLmtEna), DRV_FIELD(DirecrReve),  DRV_FIELD(RemoteCont),
                  DRV_FIELD(Out1RngTyp), DRV_FIELD(Out1EngZro),  DRV_FIELD(Out1EngFul),
                  DRV_FIELD(Out1SigLmZ), DRV_FIELD(Out1SigLmF)}));
    QVERIFY(back.Table1 == s.Table1);
}

void TestDrv718::readWithoutAnOutputRangeWarns() {
    drvbench::Bench bench(Kv718Type, 3);
    QVERIFY(bench.ready());
    bench.sim->setRegisterValue(RegMapFor(Kv718AMap).Out_Rng1, 40);
    QVERIFY2(bench.read(Kv718Driver(), SettingsSet()), qPrintable(bench.result));
    QCOMPARE(bench.run.warning(), QString("Invalid Output 1 Range"));
    QCOMPARE(bench.run.settings().Out1RngTyp, 40);
    // The rest of the record is read as usual.
    QCOMPARE(bench.run.settings().Inp1MeUnit, QString("V"));
    QCOMPARE(bench.run.settings().Inp1Samples, 0);  // factory ST_Samples 1
}

void TestDrv718::wrongModelStopsAtTheFirstStep() {
    drvbench::Bench bench(7, 0);  // a KV714-22
    QVERIFY(bench.ready());
    DiagnosticCapture capture;
    QVERIFY(!bench.program(Kv718Driver(), kv718Record(QStringLiteral("V"), 0, 10)));
    QCOMPARE(bench.result, QString("PROGRAM FAIL Module Type: KV714-22 is not KV718-xA!"));
    QCOMPARE(bench.sent.size(), size_t(1));
    QVERIFY(capture.entries.contains("modKV718vA.cbSet:KV714-22 is not KV718-xA!"));
    QVERIFY(capture.entries.contains(
        "f_KV718vA.cbSet:PROGRAM FAIL Module Type: KV714-22 is not KV718-xA!"));
}

void TestDrv718::inputCalibrationFailureStopsBeforeAnyWrite_data() {
    QTest::addColumn<QString>("unit");
    QTest::addColumn<int>("range");
    QTest::addColumn<QString>("message");
    QTest::newRow("no such row") << "V" << 17
                                 << "PROGRAM FAIL Module Type: KV718A_CaculateInCal: Invalid "
                                    "Input 1 Range";
    // The KV718-xA reports no calibration for the current rows 1-5.
    QTest::newRow("row not calibrated") << "mA" << 3
                                        << "PROGRAM FAIL Module Type: KV718A_CaculateInCal: "
                                           "Update Calibration Values";
}

void TestDrv718::inputCalibrationFailureStopsBeforeAnyWrite() {
    QFETCH(QString, unit);
    QFETCH(int, range);
    drvbench::Bench bench(Kv718Type, 3);
    QVERIFY(bench.ready());
    SettingsSet s = kv718Record(unit, 0, 10);
    s.Inp1RngSet = range;
    QVERIFY(!bench.program(Kv718Driver(), s));
    QTEST(bench.result, "message");
    QCOMPARE(bench.sent.size(), size_t(1));
}

QTEST_GUILESS_MAIN(TestDrv718)
#include "tst_drv718.moc"
