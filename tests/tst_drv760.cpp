#include "drivers/kv760_driver.h"
#include "drivers/kv760_input.h"
#include "drivers/step_runner.h"
#include "engine/request_engine.h"
#include "tests/support/driver_bench.h"

#include <QtTest>

using namespace kv;

namespace {

// The excitation calibration a KV760 reports at identification.
RegMap factory() {
    RegMap values;
    values.IS_ZS1 = 1800;
    values.IS_FS1 = 61000;
    values.VS_ZS1 = 1700;
    values.VS_FS1 = 60500;
    return values;
}

SettingsSet record(qint32 sensor, float level) {
    SettingsSet s;
    s.Inp1RngTyp = sensor;
    s.TrigLevel = level;
    s.Inp1MeUnit = QStringLiteral("Hz");
    s.Inp1Shape = QStringLiteral("Linear");
    s.Inp1mU_Zro = 0;
    s.Inp1mU_Ful = 1000;
    s.AuxImA = 20;
    s.AuxVmA = 12;
    return s;
}

// The registers a programming run leaves, as a read gives them back.
RegMap programmed(const KV760Input& input) {
    RegMap values = factory();
    values.Type_In_Unit = input.typeInUnit;
    values.Flag_A = input.flagA;
    values.Trig_Level = input.trigLevel;
    values.Meas_Unit_Z = input.lowHz;
    values.Meas_Unit_F = input.highHz;
    values.Aux_C = input.auxCurrent;
    values.Aux_V = input.auxVoltage;
    return values;
}

// Sets the options from a mask: response, remote, reverse, limits, track.
void setOptions(SettingsSet& s, int options) {
    s.Inp1Respon = options & 1;
    s.RemoteCont = (options >> 1) & 1;
    s.DirecrReve = (options >> 2) & 1;
    s.UserLmtEna = (options >> 3) & 1;
    s.TrigMode = (options >> 4) & 1;
}

constexpr int Kv760Type = 9;

// A record as the KV760 window would hand it over.
SettingsSet kv760Record() {
    SettingsSet s;
    s.ModTypeSet = Kv760Type;
    s.BussIdenti = 5;
    s.SetFileName(QStringLiteral("PUMP 7 SPEED"));
    s.Inp1RngTyp = 3;
    s.Inp1MeUnit = QStringLiteral("Hz");
    s.Inp1Shape = QStringLiteral("Linear");
    s.Inp1mU_Zro = 10;
    s.Inp1mU_Ful = 1000;
    s.Inp1EngZro = 0;
    s.Inp1EngFul = 3000;
    s.Inp1EngUnt = QStringLiteral("rpm ");
    s.TrigLevel = 2.4f;
    s.TrigMode = 1;
    s.AuxImA = 8;
    s.AuxVmA = 12;
    s.Out1RngTyp = 3;  // 0-20 mA
    s.Out1EngZro = 4;
    s.Out1EngFul = 20;
    s.Out1SigLmZ = 3.8f;
    s.Out1SigLmF = 20.5f;
    drvbench::curveTable(s);
    return s;
}

// The programming order of the KV760, row by row.
std::vector<drvbench::Frame> kv760Programming() {
    drvbench::Expect e(Kv760Map);
    e.read("Mod_Type")
        .write("Flag_C")
        .fileName()
        .writes({"Eng_Unit1", "Eng_Unit2", "Eng_Unit3", "Eng_Unit4", "Eng_In_Z", "Eng_In_F",
                 "Meas_Unit_Z", "Meas_Unit_F", "Trig_Level", "Aux_C", "Aux_V", "Out_Rng1",
                 "Usr_Out1_Z", "Usr_Out1_F", "Sig_Lmt1_Z", "Sig_Lmt1_F", "Flag_A", "Type_In_Unit"})
        .table1()
        .read("Int_Temp")
        .write("Buss_ID")
        .data("Flag_C")
        .read("Remote1")
        .moduleConfirmed();
    return e.frames();
}

std::vector<drvbench::Frame> kv760Reading() {
    drvbench::Expect e(Kv760Map);
    e.read("Mod_Type")
        .read("Buss_ID")
        .fileName(true)
        .reads({"TypInput", "Meas_Unit_Z", "Meas_Unit_F", "Eng_In_F", "Eng_In_Z", "Eng_Unit1",
                "Eng_Unit2", "Eng_Unit3", "Eng_Unit4", "Flag_A", "Type_In_Unit", "Out_Rng1",
                "Usr_Out1_Z", "Usr_Out1_F", "Sig_Lmt1_Z", "Sig_Lmt1_F", "Trig_Level", "Aux_C",
                "Aux_V"})
        .table1(true)
        .reads({"Remote1", "Int_Temp"})
        .moduleConfirmed();
    return e.frames();
}

// A KV760 map and an idle engine, for single steps without a module.
struct StepBench {
    RequestEngine engine;
    QString requester = QStringLiteral("MCT00007");
    SettingsSet settings = kv760Record();
    StepBench() {
        SetRegMap(RegAdd, Kv760Map);
        RegVal.Mod_Type = Kv760Type;
        engine.setState(StateRun);
    }
    bool step(qint16 kind, qint32 id, qint16 busId, QString& text) {
        const bool queued = GS760(engine, kind, requester, settings, id, busId, text);
        engine.setState(StateRun);  // as if the queued request had been answered
        return queued;
    }
};

}  // namespace

class TestDrv760 : public QObject {
    Q_OBJECT
private slots:
    void typeAndUnit_data();
    void typeAndUnit();
    void refusedInput_data();
    void refusedInput();
    void triggerBand_data();
    void triggerBand();
    void flagWord_data();
    void flagWord();
    void excitationCounts_data();
    void excitationCounts();
    void readBackGivesTheRecord_data();
    void readBackGivesTheRecord();
    void readBackWithoutSourceCalibrationWarns();

    void programmingRunFollowsTheOrder();
    void programThenReadGivesTheRecord();
    void readWithoutAnOutputRangeWarns();
    void refusedInputStopsBeforeAnyWrite();
    void outputOutOfRangeNamesTheRegister();
    void flagCWritesToldApartByTheDriver();
};

void TestDrv760::typeAndUnit_data() {
    QTest::addColumn<int>("sensor");
    QTest::addColumn<QString>("unit");
    QTest::addColumn<QString>("shape");
    QTest::addColumn<int>("typeInUnit");
    QTest::addColumn<float>("lowHz");
    QTest::addColumn<float>("highHz");
    // clang-format off
    QTest::newRow("type 3 Hz linear") << 3 << "Hz" << "Linear" << 0x30 << 10.0f << 250.0f;
    QTest::newRow("type 1 kHz") << 1 << "kHz" << "Linear" << 0x90 << 10000.0f << 250000.0f;
    QTest::newRow("type 6 table") << 6 << "Hz" << "Table" << 0x61 << 10.0f << 250.0f;
    QTest::newRow("type 7 kHz table") << 7 << "kHz" << "Table" << 0xF1 << 10000.0f << 250000.0f;
    // clang-format on
}

void TestDrv760::typeAndUnit() {
    QFETCH(int, sensor);
    SettingsSet s = record(sensor, 5);
    QFETCH(QString, unit);
    QFETCH(QString, shape);
    s.Inp1MeUnit = unit;
    s.Inp1Shape = shape;
    s.Inp1mU_Zro = 10;
    s.Inp1mU_Ful = 250;
    KV760Input input;
    QString message;
    QVERIFY2(KV760StartValues(s, factory(), input, message), qPrintable(message));
    QTEST(int(input.typeInUnit), "typeInUnit");
    QTEST(input.lowHz, "lowHz");
    QTEST(input.highHz, "highHz");
}

void TestDrv760::refusedInput_data() {
    QTest::addColumn<int>("sensor");
    QTest::addColumn<QString>("unit");
    QTest::addColumn<QString>("shape");
    QTest::addColumn<QString>("message");
    // clang-format off
    QTest::newRow("MHz") << 1 << "MHz" << "Linear" << "Input Unit ? :MHz";
    QTest::newRow("lower-case hz") << 1 << "hz" << "Linear" << "Input Unit ? :hz";
    QTest::newRow("shape") << 1 << "Hz" << "Curve" << "Input Shape ? :Curve";
    QTest::newRow("sensor 8") << 8 << "Hz" << "Linear" << "Input ? Sensor ? :8";
    QTest::newRow("sensor 0") << 0 << "Hz" << "Linear" << "Input ? Sensor ? :0";
    // clang-format on
}

void TestDrv760::refusedInput() {
    QFETCH(int, sensor);
    SettingsSet s = record(sensor, 5);
    QFETCH(QString, unit);
    QFETCH(QString, shape);
    s.Inp1MeUnit = unit;
    s.Inp1Shape = shape;
    KV760Input input;
    input.trigLevel = -5;
    QString message;
    QVERIFY(!KV760StartValues(s, factory(), input, message));
    QTEST(message, "message");
    QCOMPARE(input.trigLevel, -5);
}

void TestDrv760::triggerBand_data() {
    QTest::addColumn<int>("sensor");
    QTest::addColumn<float>("level");
    QTest::addColumn<int>("bandBits");
    QTest::addColumn<int>("count");

    QTest::newRow("0.2 V is sensitive") << 1 << 0.2f << 3 << 19860;
    QTest::newRow("0.05 V") << 6 << 0.05f << 3 << 4965;
    QTest::newRow("0.3 V middle") << 1 << 0.3f << 1 << 14895;
    QTest::newRow("0.4 V plain") << 1 << 0.4f << 0 << 3972;
    QTest::newRow("5.5 V") << 2 << 5.5f << 0 << 54615;
    // Type 7 divides its input: 50 V is 0.34 V at the comparator.
    QTest::newRow("HI 50 V") << 7 << 50.0f << 1 << 16881;
    QTest::newRow("HI 8 V") << 7 << 8.0f << 3 << 5402;
    QTest::newRow("HI 250 V") << 7 << 250.0f << 0 << 16881;
}

void TestDrv760::triggerBand() {
    QFETCH(int, sensor);
    QFETCH(float, level);
    KV760Input input;
    QString message;
    QVERIFY2(KV760StartValues(record(sensor, level), factory(), input, message),
             qPrintable(message));
    QTEST(int(input.flagA & 3), "bandBits");
    QTEST(input.trigLevel, "count");
}

void TestDrv760::flagWord_data() {
    // At 5 V, in the plain band but for the HI pulse input, which divides it.
    QTest::addColumn<int>("sensor");
    QTest::addColumn<int>("loading");
    QTest::addColumn<int>("options");
    QTest::addColumn<int>("flags");
    QTest::newRow("NPN") << 1 << 1 << 0 << 0x00;
    QTest::newRow("PNP") << 2 << 0 << 0 << 0x04;
    QTest::newRow("NAMUR") << 3 << 0 << 0 << 0x04;
    QTest::newRow("2 wire") << 4 << 0 << 0 << 0x04;
    QTest::newRow("inductive, no load") << 5 << 0 << 0 << 0x00;
    QTest::newRow("inductive, loaded") << 5 << 1 << 0 << 0x04;
    QTest::newRow("any pulse") << 6 << 1 << 0 << 0x00;
    QTest::newRow("HI pulse") << 7 << 0 << 0 << 0x07;
    QTest::newRow("response") << 1 << 0 << 0x01 << 0x08;
    QTest::newRow("remote") << 1 << 0 << 0x02 << 0x10;
    QTest::newRow("reverse") << 1 << 0 << 0x04 << 0x20;
    QTest::newRow("limits") << 1 << 0 << 0x08 << 0x40;
    QTest::newRow("track") << 1 << 0 << 0x10 << 0x80;
}

void TestDrv760::flagWord() {
    QFETCH(int, sensor);
    QFETCH(int, loading);
    QFETCH(int, options);
    SettingsSet s = record(sensor, 5);
    s.Typ1InRes = loading;
    setOptions(s, options);
    KV760Input input;
    QString message;
    QVERIFY(KV760StartValues(s, factory(), input, message));
    QTEST(int(quint16(input.flagA)), "flags");
}

void TestDrv760::excitationCounts_data() {
    QTest::addColumn<float>("current");
    QTest::addColumn<float>("voltage");
    QTest::addColumn<int>("currentCount");
    QTest::addColumn<int>("voltageCount");
    // Counts are rounded after adding a half, an exact half going to the even neighbour.
    QTest::newRow("full scale") << 20.0f << 15.0f << 61000 << 60500;
    QTest::newRow("low end") << 0.5f << 1.0f << 2697 << 5066;
    QTest::newRow("inside") << 4.0f << 12.0f << 13162 << 48622;
}

void TestDrv760::excitationCounts() {
    SettingsSet s = record(1, 5);
    QFETCH(float, current);
    QFETCH(float, voltage);
    s.AuxImA = current;
    s.AuxVmA = voltage;
    KV760Input input;
    QString message;
    QVERIFY(KV760StartValues(s, factory(), input, message));
    QTEST(input.auxCurrent, "currentCount");
    QTEST(input.auxVoltage, "voltageCount");
}

void TestDrv760::readBackGivesTheRecord_data() {
    QTest::addColumn<int>("sensor");
    QTest::addColumn<QString>("unit");
    QTest::addColumn<QString>("shape");
    QTest::addColumn<float>("level");
    QTest::addColumn<int>("loading");
    QTest::addColumn<int>("options");
    // clang-format off
    QTest::newRow("NPN Hz") << 1 << "Hz" << "Linear" << 5.5f << 0 << 0;
    QTest::newRow("NAMUR kHz table") << 3 << "kHz" << "Table" << 2.4f << 0 << 0x1F;
    QTest::newRow("inductive loaded") << 5 << "Hz" << "Linear" << 0.15f << 1 << 0x05;
    QTest::newRow("inductive unloaded") << 5 << "kHz" << "Linear" << 0.3f << 0 << 0x0A;
    QTest::newRow("HI pulse") << 7 << "Hz" << "Table" << 50.0f << 0 << 0x10;
    // clang-format on
}

void TestDrv760::readBackGivesTheRecord() {
    QFETCH(int, sensor);
    QFETCH(QString, unit);
    QFETCH(QString, shape);
    QFETCH(float, level);
    QFETCH(int, loading);
    QFETCH(int, options);
    SettingsSet s = record(sensor, level);
    s.Inp1MeUnit = unit;
    s.Inp1Shape = shape;
    s.Inp1mU_Zro = 1.5f;
    s.Inp1mU_Ful = 12.25f;
    s.Typ1InRes = loading;
    setOptions(s, options);
    s.AuxImA = 4.2f;
    s.AuxVmA = 12.35f;
    KV760Input input;
    QString message;
    QVERIFY(KV760StartValues(s, factory(), input, message));

    SettingsSet back;
    QString warning;
    KV760ReadInput(programmed(input), back, warning);
    QCOMPARE(warning, QString());
    QVERIFY(drvbench::sameFields(
        back, s,
        {DRV_FIELD(Inp1RngTyp), DRV_FIELD(Inp1MeUnit), DRV_FIELD(Inp1Shape), DRV_FIELD(Inp1mU_Zro),
         DRV_FIELD(Inp1mU_Ful), DRV_FIELD(TrigLevel), DRV_FIELD(Typ1InRes), DRV_FIELD(Inp1Respon),
         DRV_FIELD(RemoteCont), DRV_FIELD(DirecrReve), DRV_FIELD(UserLmtEna), DRV_FIELD(TrigMode),
         DRV_FIELD(AuxImA), DRV_FIELD(AuxVmA)}));
}

void TestDrv760::readBackWithoutSourceCalibrationWarns() {
    KV760Input input;
    QString message;
    QVERIFY(KV760StartValues(record(1, 5), factory(), input, message));
    RegMap values = programmed(input);
    values.VS_FS1 = values.VS_ZS1;
    SettingsSet back;
    QString warning = QStringLiteral("before, ");
    KV760ReadInput(values, back, warning);
    QCOMPARE(warning, QStringLiteral("before, kv760AuxRead failed , "));
    QCOMPARE(back.AuxImA, 20.0f);
}

void TestDrv760::programmingRunFollowsTheOrder() {
    drvbench::Bench bench(Kv760Type, 0);
    QVERIFY(bench.ready());
    QVERIFY2(bench.program(Kv760Driver(), kv760Record()), qPrintable(bench.result));
    QCOMPARE(bench.result, QString("Programmed"));
    QString difference;
    QVERIFY2(drvbench::sameFrames(bench.sent, kv760Programming(), difference),
             qPrintable(difference));

    // The module ends with its programming flag cleared and the record's values.
    const RegMap map = RegMapFor(Kv760Map);
    QCOMPARE(bench.sim->registerValue(map.Flag_C), 0);
    QCOMPARE(bench.sim->registerValue(map.Type_In_Unit), 0x30);
    QCOMPARE(bench.sim->registerValue(map.Flag_A), 0x84);  // track mode, NAMUR load, plain band
    QCOMPARE(bench.sim->registerValue(map.Trig_Level), 23832);  // 2.4 V x 9930
    QCOMPARE(bench.sim->registerValue(map.Buss_ID), 5);
    QCOMPARE(bench.sim->fileName(), QByteArray("PUMP 7 SPEED        "));
    const std::vector<qint32> table = bench.sim->table1();
    QCOMPARE(table[50], 2500);
    QCOMPARE(table[101], kv760Record().Table1[101]);
}

void TestDrv760::programThenReadGivesTheRecord() {
    drvbench::Bench bench(Kv760Type, 1);
    QVERIFY(bench.ready());
    SettingsSet s = kv760Record();
    s.Inp1RngTyp = 5;  // inductive, loaded, in kHz with a table
    s.Typ1InRes = 1;
    s.Inp1MeUnit = QStringLiteral("kHz");
    s.Inp1Shape = QStringLiteral("Table");
    s.TrigLevel = 0.15f;
    s.Inp1mU_Zro = 0.5f;
    s.Inp1mU_Ful = 2.25f;
    s.RemoteCont = 1;
    s.UserLmtEna = 1;
    QVERIFY2(bench.program(Kv760Driver(), s), qPrintable(bench.result));

    QVERIFY2(bench.read(Kv760Driver(), SettingsSet()), qPrintable(bench.result));
    QCOMPARE(bench.result, QString("KV760-10 Settings Read.."));
    QCOMPARE(bench.run.warning(), QString());
    QString difference;
    QVERIFY2(drvbench::sameFrames(bench.sent, kv760Reading(), difference), qPrintable(difference));

    const SettingsSet& back = bench.run.settings();
    QCOMPARE(back.ModTypeSet, Kv760Type);
    QCOMPARE(back.Out1EngUnt, QString("mA"));
    QVERIFY(drvbench::sameFields(
        back, s, {DRV_FIELD(BussIdenti), DRV_FIELD(FileName),   DRV_FIELD(Inp1RngTyp),
                  DRV_FIELD(Inp1MeUnit), DRV_FIELD(Inp1Shape),  DRV_FIELD(Inp1mU_Zro),
                  DRV_FIELD(Inp1mU_Ful), DRV_FIELD(Inp1EngZro), DRV_FIELD(Inp1EngFul),
                  DRV_FIELD(Inp1EngUnt), DRV_FIELD(TrigLevel),  DRV_FIELD(TrigMode),
                  DRV_FIELD(Typ1InRes),  DRV_FIELD(Inp1Respon), DRV_FIELD(RemoteCont),
                  DRV_FIELD(DirecrReve), DRV_FIELD(UserLmtEna), DRV_FIELD(AuxImA),
                  DRV_FIELD(AuxVmA),     DRV_FIELD(Out1RngTyp), DRV_FIELD(Out1EngZro),
                  DRV_FIELD(Out1EngFul), DRV_FIELD(Out1SigLmZ), DRV_FIELD(Out1SigLmF)}));
    QVERIFY(back.Table1 == s.Table1);
}

void TestDrv760::readWithoutAnOutputRangeWarns() {
    drvbench::Bench bench(Kv760Type, 0);
    QVERIFY(bench.ready());
    bench.sim->setRegisterValue(RegMapFor(Kv760Map).Out_Rng1, 17);
    QVERIFY2(bench.read(Kv760Driver(), kv760Record()), qPrintable(bench.result));
    QCOMPARE(bench.run.warning(), QString("Invalid Output 1 Range, "));
    QCOMPARE(bench.run.settings().Out1RngTyp, 17);
    QCOMPARE(bench.run.settings().Out1EngZro, 0.0f);
    QCOMPARE(bench.run.settings().Out1EngFul, 0.0f);
}

void TestDrv760::refusedInputStopsBeforeAnyWrite() {
    drvbench::Bench bench(Kv760Type, 0);
    QVERIFY(bench.ready());
    SettingsSet s = kv760Record();
    s.Inp1RngTyp = 8;
    QVERIFY(!bench.program(Kv760Driver(), s));
    QCOMPARE(bench.result, QString("PROGRAM FAIL Module Type: Input ? Sensor ? :8"));
    QCOMPARE(bench.sent.size(), size_t(1));
    QCOMPARE(bench.sent[0].command, 'R');
}

void TestDrv760::outputOutOfRangeNamesTheRegister() {
    drvbench::Bench bench(Kv760Type, 0);
    QVERIFY(bench.ready());
    SettingsSet s = kv760Record();
    s.Out1EngFul = 30;  // 0-20 mA allows 21
    QVERIFY(!bench.program(Kv760Driver(), s));
    QCOMPARE(bench.result, QString("PROGRAM FAIL Aux V calculated: UsrCalRangeSet: Max > 21"));
    // Everything up to the excitation went out; the output range did not.
    const std::vector<drvbench::Frame> all = kv760Programming();
    const drvbench::Frame auxV{'R', 16, RegMapFor(Kv760Map).Aux_V};
    const auto end = std::find(all.begin(), all.end(), auxV);
    QVERIFY(end != all.end());
    QString difference;
    QVERIFY2(drvbench::sameFrames(bench.sent, {all.begin(), end + 1}, difference),
             qPrintable(difference));
}

void TestDrv760::flagCWritesToldApartByTheDriver() {
    StepBench b;
    QString text;
    QVERIFY2(b.step(DispatchProgram, RegAdd.Mod_Type, 16, text), qPrintable(text));
    // The first write's acknowledgement carries 16 like any other; it starts the file name.
    QVERIFY2(b.step(DispatchProgram, RegAdd.Flag_C, 16, text), qPrintable(text));
    QCOMPARE(b.engine.awaitedAddress(), RegAdd.File_Name);
    QVERIFY(b.step(DispatchProgram, RegAdd.File_Name, 16, text));
    // In the middle of the file name a Flag_C acknowledgement is neither write.
    QVERIFY(!b.step(DispatchProgram, RegAdd.Flag_C, 16, text));
    QCOMPARE(text, QString("PROGRAM FAIL Control Flag C:  Return ID16 Invalid"));
}

QTEST_GUILESS_MAIN(TestDrv760)
#include "tst_drv760.moc"
