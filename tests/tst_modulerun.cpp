// Programming and reading runs of a simulated KV720 through the whole stack:
// connection, identification, the run handling, the driver, the engine and
// the serial link. The module's frame log is held against the documented order.
#include "drivers/kv720_codes.h"
#include "drivers/kv720_driver.h"
#include "model/codec.h"
#include "model/linearisation.h"
#include "tests/support/driver_bench.h"

#include <QSignalSpy>
#include <QtTest>

using namespace kv;
using drvbench::Bench;
using drvbench::Expect;
using drvbench::Frame;

Q_DECLARE_METATYPE(kv::SettingsSet)

namespace {

std::vector<Frame> programmingOrder(bool thermocouple) {
    Expect e(Kv720Map);
    e.read("Mod_Type")
        .write("TypInput")
        .fileName()
        .writes({"Eng_Unit1", "Eng_Unit2", "Eng_Unit3", "Eng_Unit4", "Eng_In_Z", "Eng_In_F",
                 "Meas_Unit_Z", "Meas_Unit_F", "Buss_ID", "In_Rng1", "in_ch", "in_res",
                 "Type_In_Unit"})
        .reads({"CIN_Z", "CIN_F", "SLOP_P", "SLOP_N"})
        .writes({"Usr_In1_Z", "Usr_In1_F", "Aux_C", "Flag_A", "Orig_OS_PWM", "Orig_FlagA",
                 "Gain_Factor"});
    if (thermocouple)
        e.tableC().read("Term_Temp");
    e.table1()
        .read("Input_B4_Table")
        .write("Out_Rng1")
        .reads({"COUT_Z", "COUT_F"})
        .writes({"Usr_Out1_Z", "Usr_Out1_F", "Sig_Lmt1_Z", "Sig_Lmt1_F"})
        .moduleConfirmed();
    return e.frames();
}

std::vector<Frame> readingOrder() {
    Expect e(Kv720Map);
    e.read("Mod_Type")
        .read("Buss_ID")
        .fileName(true)
        .reads({"TypInput",  "Type_In_Unit", "In_Rng1",    "Meas_Unit_Z", "Meas_Unit_F",
                "Eng_In_F",  "Eng_In_Z",     "in_ch",      "in_res",      "Flag_A",
                "Out_Rng1",  "Usr_Out1_Z",   "Usr_Out1_F", "Sig_Lmt1_Z",  "Sig_Lmt1_F",
                "COUT_Z",    "COUT_F",       "Aux_C",      "IS_ZS1",      "IS_FS1",
                "IS_ZS2",    "IS_FS2",       "Eng_Unit1",  "Eng_Unit2",   "Eng_Unit3",
                "Eng_Unit4", "Orig_OS_PWM",  "Orig_FlagA", "Gain_Factor"})
        .table1(true)
        .reads({"Input_B4_Table", "Int_Temp"})
        .moduleConfirmed();
    return e.frames();
}

int addressOf(const char* name) {
    return drvbench::addressOf(name, Kv720Map);
}

SettingsSet milliVolts() {
    SettingsSet s;
    s.Inp1RngTyp = Kv720MilliVolt;
    s.Inp1Shape = "Linear";
    s.Inp1MeUnit = "mV";
    s.Typ1InUnit = Kv720TypeInUnit(0, 0);
    s.Inp1mU_Zro = 0;
    s.Inp1mU_Ful = 20;
    s.Inp1EngZro = 0;
    s.Inp1EngFul = 250;
    s.Inp1EngUnt = "kPa ";
    s.AuxVmA = 1.0f;
    s.AuxIsI = 1;
    s.Inp1Respon = 1;
    s.Out1RngTyp = 3;  // 0-20 mA
    s.Out1EngZro = 4;
    s.Out1EngFul = 20;
    s.Out1SigLmZ = 4;
    s.Out1SigLmF = 20;
    s.BussIdenti = 7;
    s.SetFileName("PUMP 3 INLET");
    return s;
}

SettingsSet thermocouple() {
    SettingsSet s = milliVolts();
    s.Inp1RngTyp = Kv720Thermocouple;
    s.Inp1Shape = "Type K";
    s.Inp1MeUnit = "°C";
    s.Typ1InUnit = Kv720TypeInUnit(0, 3);
    s.Inp1mU_Zro = 0;
    s.Inp1mU_Ful = 100;
    s.Inp1EngUnt = "°C  ";
    s.Inp1BurnOut = 1;
    s.Typ1InRes = 1;
    return s;
}

SettingsSet rtd() {
    SettingsSet s = milliVolts();
    s.Inp1RngTyp = Kv720Rtd3Wire;
    s.Inp1Shape = "pt100.";
    s.Inp1MeUnit = "°C";
    s.Typ1InUnit = Kv720TypeInUnit(0, 0);
    s.Inp1mU_Zro = 0;
    s.Inp1mU_Ful = 100;
    s.Inp1EngUnt = "°C  ";
    s.RemoteCont = 1;
    s.UserLmtEna = 1;
    s.Out1SigLmZ = 5;
    s.Out1SigLmF = 19;
    return s;
}

SettingsSet potentiometer() {
    SettingsSet s = milliVolts();
    s.Inp1RngTyp = Kv720Potentiometer;
    s.Inp1MeUnit = "%Pot";
    s.Inp1Shape = "Table";
    s.Typ1InUnit = Kv720TypeInUnit(0, 1);
    s.Inp1mU_Zro = 10;
    s.Inp1mU_Ful = 90;
    s.DirecrReve = 1;
    drvbench::curveTable(s);
    return s;
}

SettingsSet resistance() {
    SettingsSet s = milliVolts();
    s.Inp1RngTyp = Kv720Resistance;
    s.Inp1MeUnit = "kohm";
    s.Typ1InUnit = Kv720TypeInUnit(1, 0);
    s.Inp1mU_Zro = 0;
    s.Inp1mU_Ful = 2;
    s.Out1RngTyp = 6;  // 0-5 V
    s.Out1EngZro = 1;
    s.Out1EngFul = 5;
    s.Out1SigLmZ = 1;
    s.Out1SigLmF = 5;
    return s;
}

sim::ModuleIdentity module(const char* model = "KV720-20", qint32 serial = 100001) {
    sim::ModuleIdentity identity;
    sim::ParseModel(model, identity);
    identity.serial = serial;
    return identity;
}

// A KV720 identified and idle. Its input gain G = CIN_F - CIN_Z counts over a
// range; the default 5680 keeps table C within its 16 bits.
struct Kv720Bench : Bench {
    explicit Kv720Bench(const sim::ModuleIdentity& identity = module(), qint32 cinF = 6880)
        : Bench(identity) {
        sim->setRegisterValue(addressOf("CIN_F"), cinF);
        identified = ready();
    }
    explicit Kv720Bench(const sim::SimFaults& faults) : Kv720Bench() { sim->setFaults(faults); }
    bool identified = false;
};

}  // namespace

class TestModuleRun : public QObject {
    Q_OBJECT
private slots:
    void programmingFollowsTheOrder_data();
    void programmingFollowsTheOrder();
    void programmedRegisters();
    void programThenReadBack_data();
    void programThenReadBack();

    void wrongModel();
    void inputOutOfRange();
    void secondRunRefused();
    void droppedReplyIsRetried();
    void deadModuleEndsTheRun_data();
    void deadModuleEndsTheRun();
    void disconnectEndsTheRun();
    void swappedModuleIsNotProgrammed();
};

void TestModuleRun::programmingFollowsTheOrder_data() {
    QTest::addColumn<SettingsSet>("settings");
    QTest::addColumn<bool>("thermocouple");
    QTest::newRow("mV") << milliVolts() << false;
    QTest::newRow("thermocouple") << thermocouple() << true;
}

void TestModuleRun::programmingFollowsTheOrder() {
    QFETCH(SettingsSet, settings);
    QFETCH(bool, thermocouple);
    Kv720Bench bench;
    QVERIFY(bench.identified);
    QSignalSpy progress(&bench.run, &ModuleRun::progress);
    QSignalSpy status(&bench.run, &ModuleRun::statusChanged);
    QVERIFY2(bench.program(Kv720Driver(), settings), qPrintable(bench.result));
    QCOMPARE(bench.result, QString("Programmed"));
    QCOMPARE(status.first().at(0).toString(), QString("Programming.."));
    QString difference;
    QVERIFY2(drvbench::sameFrames(bench.sent, programmingOrder(thermocouple), difference),
             qPrintable(difference));

    // Progress runs from step 0 to the last step, never backwards.
    int last = -1;
    for (const QList<QVariant>& step : progress) {
        QVERIFY(step.at(1).toInt() >= last);
        last = step.at(1).toInt();
    }
    QCOMPARE(progress.first().at(1).toInt(), 0);
    QCOMPARE(progress.last().at(1).toInt(), progress.last().at(2).toInt());
    QVERIFY(!bench.connection.engine().reserved());
}

void TestModuleRun::programmedRegisters() {
    Kv720Bench bench(module(), 58000);  // G = 56800
    QVERIFY(bench.identified);
    QVERIFY2(bench.program(Kv720Driver(), milliVolts()), qPrintable(bench.result));
    const sim::Simulator& sim = *bench.sim;
    auto value = [&](const char* name) { return sim.registerValue(addressOf(name)); };
    auto single = [&](const char* name) { return WireToSingle(LongToWire(value(name))); };
    QCOMPARE(value("TypInput"), 1);
    QCOMPARE(sim.fileName(), QByteArray("PUMP 3 INLET        "));
    QCOMPARE(value("Eng_Unit1"), int('k'));
    QCOMPARE(value("Eng_Unit4"), int(' '));
    QCOMPARE(single("Eng_In_F"), 250.0f);
    QCOMPARE(single("Meas_Unit_F"), 20.0f);
    QCOMPARE(value("Buss_ID"), 7);
    QCOMPARE(value("In_Rng1"), 4);  // 0-20 mV
    QCOMPARE(value("in_ch"), 3);
    QCOMPARE(value("in_res"), 1);
    QCOMPARE(value("Type_In_Unit"), 0x11);
    // Zero at 0 mV: 200 counts with the offset bit; full: 20/20 of G above CIN_Z.
    QCOMPARE(value("Usr_In1_Z"), 200);
    QCOMPARE(value("Usr_In1_F"), 58000);
    QCOMPARE(value("Orig_OS_PWM"), 200);
    QCOMPARE(value("Gain_Factor"), 10000);
    // 1 mA: high current band, (1 - 0.8) / 9.2 of IS_ZS2..IS_FS2 (2100..61000)
    QCOMPARE(value("Aux_C"), 3380);
    // offset bit 0, response bit 1, high band bit 5
    QCOMPARE(value("Flag_A"), 0x23);
    QCOMPARE(value("Orig_FlagA"), 0x23);
    const std::vector<qint32> table = sim.table1();
    for (int i = 0; i <= Table1LastUsed; ++i)
        QCOMPARE(table[i], i * 100);
    QCOMPARE(table[101], TableChecksumOf(table.data(), Table1LastUsed));
    // 4-20 mA of the 0-20 mA range between COUT_Z 3000 and COUT_F 59000
    QCOMPARE(value("Out_Rng1"), 3);
    QCOMPARE(value("Usr_Out1_Z"), 14200);
    QCOMPARE(value("Usr_Out1_F"), 59000);
    QCOMPARE(value("Sig_Lmt1_Z"), 14200);
    QCOMPARE(value("Sig_Lmt1_F"), 59000);
}

void TestModuleRun::programThenReadBack_data() {
    QTest::addColumn<SettingsSet>("settings");
    QTest::newRow("mV") << milliVolts();
    QTest::newRow("thermocouple") << thermocouple();
    QTest::newRow("RTD") << rtd();
    QTest::newRow("potentiometer table") << potentiometer();
    QTest::newRow("resistance") << resistance();
}

void TestModuleRun::programThenReadBack() {
    QFETCH(SettingsSet, settings);
    Kv720Bench bench(module("KV720-20", 123456));
    QVERIFY(bench.identified);
    QVERIFY2(bench.program(Kv720Driver(), settings), qPrintable(bench.result));
    const SettingsSet sent = bench.run.settings();
    QSignalSpy status(&bench.run, &ModuleRun::statusChanged);
    QVERIFY2(bench.read(Kv720Driver(), {}), qPrintable(bench.result));
    QCOMPARE(bench.result, QString("KV720-20 Settings Read.."));
    QCOMPARE(status.first().at(0).toString(), QString("Read program from connected module . . ."));
    QCOMPARE(bench.run.warning(), QString());
    QString difference;
    QVERIFY2(drvbench::sameFrames(bench.sent, readingOrder(), difference), qPrintable(difference));

    const SettingsSet& got = bench.run.settings();
    QCOMPARE(got.ModTypeSet, 4);
    QCOMPARE(got.SerialNumb, 123456);
    QCOMPARE(got.MinorTrim, 0);
    QVERIFY(drvbench::sameFields(
        got, sent, {DRV_FIELD(FileName),    DRV_FIELD(BussIdenti), DRV_FIELD(Inp1RngTyp),
                    DRV_FIELD(Inp1RngSet),  DRV_FIELD(Typ1InUnit), DRV_FIELD(Inp1MeUnit),
                    DRV_FIELD(Inp1Shape),   DRV_FIELD(Inp1mU_Zro), DRV_FIELD(Inp1mU_Ful),
                    DRV_FIELD(Inp1EngZro),  DRV_FIELD(Inp1EngFul), DRV_FIELD(Inp1EngUnt),
                    DRV_FIELD(Typ1Differ),  DRV_FIELD(Typ1InRes),  DRV_FIELD(RemoteCont),
                    DRV_FIELD(Inp1Respon),  DRV_FIELD(UserLmtEna), DRV_FIELD(DirecrReve),
                    DRV_FIELD(Inp1BurnOut), DRV_FIELD(AuxIsI),     DRV_FIELD(AuxVmA),
                    DRV_FIELD(Out1RngTyp),  DRV_FIELD(Out1EngZro), DRV_FIELD(Out1EngFul),
                    DRV_FIELD(Out1SigLmZ),  DRV_FIELD(Out1SigLmF)}));
    QVERIFY(got.Table1 == sent.Table1);
}

void TestModuleRun::wrongModel() {
    Kv720Bench bench(module("KV760-20"));
    QVERIFY(bench.identified);
    QVERIFY(!bench.program(Kv720Driver(), milliVolts()));
    QVERIFY(bench.finished);
    QCOMPARE(bench.result, QString("PROGRAM FAIL Module Type: KV760-20 is not KV720!"));
    QCOMPARE(bench.sent.size(), size_t(1));  // the module type, nothing written

    QVERIFY(!bench.read(Kv720Driver(), {}));
    QCOMPARE(bench.result, QString("Module Type - KV760-20 is not KV720! FAIL"));
    QVERIFY(!bench.connection.engine().reserved());
}

void TestModuleRun::inputOutOfRange() {
    Kv720Bench bench;
    QVERIFY(bench.identified);
    SettingsSet settings = milliVolts();
    settings.Inp1mU_Zro = 300;
    settings.Inp1mU_Ful = 350;
    QVERIFY(!bench.program(Kv720Driver(), settings));
    QCOMPARE(bench.result, QString("PROGRAM FAIL BUSS ID: Maximum input 624mV and maximum offset "
                                   "is 50% of range.9"));
    // The run stops with the bus ID written: the range register keeps the factory range.
    QCOMPARE(bench.sent.back(), (Frame{'R', 16, addressOf("Buss_ID")}));
    QCOMPARE(bench.sim->registerValue(addressOf("In_Rng1")), 4);

    settings.Inp1mU_Zro = 0;
    settings.Inp1mU_Ful = 500.1f;
    QVERIFY(!bench.program(Kv720Driver(), settings));
    QCOMPARE(bench.result, QString("PROGRAM FAIL Module Type: Maximum input range is 500mV"));
    QCOMPARE(bench.sent.size(), size_t(1));
}

void TestModuleRun::secondRunRefused() {
    Kv720Bench bench;
    QVERIFY(bench.identified);
    ModuleRun other(bench.connection, "MCT00002");
    const std::size_t from = bench.sim->log().size();
    QString error;
    QVERIFY(bench.run.startProgramming(Kv720Driver(), milliVolts(), error));
    QVERIFY(!bench.run.startReading(Kv720Driver(), {}, error));
    QCOMPARE(error, QString("Please try again !!"));
    QVERIFY(!other.startReading(Kv720Driver(), {}, error));
    QCOMPARE(error, QString("Please try again !!"));
    QVERIFY(bench.finish(from));
    QCOMPARE(bench.result, QString("Programmed"));
}

void TestModuleRun::droppedReplyIsRetried() {
    sim::SimFaults faults;
    faults.dropFrame = 11;  // the write of Eng_Unit2
    Kv720Bench bench(faults);
    QVERIFY(bench.identified);
    QVERIFY2(bench.program(Kv720Driver(), milliVolts()), qPrintable(bench.result));
    QCOMPARE(bench.dropped.size(), size_t(1));
    // The unanswered frame went out again; apart from that, the order is unchanged.
    std::vector<Frame> frames = bench.sent;
    const std::size_t at = bench.dropped[0];
    QCOMPARE(frames[at], frames[at + 1]);
    frames.erase(frames.begin() + long(at));
    QString difference;
    QVERIFY2(drvbench::sameFrames(frames, programmingOrder(false), difference),
             qPrintable(difference));
}

void TestModuleRun::deadModuleEndsTheRun_data() {
    QTest::addColumn<bool>("reading");
    QTest::addColumn<int>("deadAfter");
    QTest::newRow("programming") << false << 20;
    QTest::newRow("reading") << true << 10;
}

void TestModuleRun::deadModuleEndsTheRun() {
    QFETCH(bool, reading);
    QFETCH(int, deadAfter);
    sim::SimFaults faults;
    faults.deadAfter = deadAfter;
    Kv720Bench bench(faults);
    QVERIFY(bench.identified);
    QVERIFY(reading ? !bench.read(Kv720Driver(), {}) : !bench.program(Kv720Driver(), milliVolts()));
    QVERIFY(bench.finished);
    if (reading) {
        QVERIFY2(bench.result.endsWith(" - Too many retries: FAIL"), qPrintable(bench.result));
    } else {
        QVERIFY2(bench.result.startsWith("PROGRAM FAIL "), qPrintable(bench.result));
        QVERIFY2(bench.result.contains(": Too many retries:"), qPrintable(bench.result));
    }
    QVERIFY(!bench.connection.engine().reserved());
    QVERIFY(!bench.connection.engine().connected());
}

void TestModuleRun::disconnectEndsTheRun() {
    Kv720Bench bench;
    QVERIFY(bench.identified);
    // Closed from outside while a request is waiting: no callback ever comes.
    connect(&bench.run, &ModuleRun::progress, &bench.run, [&](const QString&, int step) {
        if (step == 5) {
            QString error;
            bench.connection.OpenCom(false, error);
        }
    });
    QVERIFY(!bench.program(Kv720Driver(), milliVolts()));
    QVERIFY(bench.finished);
    QVERIFY2(bench.result.endsWith(": COM closed"), qPrintable(bench.result));
    QVERIFY(!bench.connection.engine().reserved());
}

void TestModuleRun::swappedModuleIsNotProgrammed() {
    // Another KV720 takes over during the table transfer: every later request
    // succeeds on it, yet the run must not report the first one as programmed.
    sim::SimFaults faults;
    faults.swapAfter = 80;
    faults.swapTo = module("KV720-20", 100002);
    Kv720Bench bench(faults);
    QVERIFY(bench.identified);
    QVERIFY(!bench.program(Kv720Driver(), milliVolts()));
    QVERIFY(bench.finished);
    QCOMPARE(bench.result, QString("PROGRAM FAIL Serial number: Module changed"));
}

QTEST_GUILESS_MAIN(TestModuleRun)
#include "tst_modulerun.moc"
