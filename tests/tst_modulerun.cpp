// Programming and reading runs of a simulated KV720 through the whole stack:
// connection, identification, the run handling, the driver, the engine and
// the serial link. The module's frame log is held against the documented order.
#include "drivers/kv720_codes.h"
#include "drivers/kv720_driver.h"
#include "drivers/module_run.h"
#include "engine/module_connection.h"
#include "engine/request_engine.h"
#include "model/codec.h"
#include "model/linearisation.h"
#include "model/register_map.h"
#include "sim/simulator.h"

#include <QSignalSpy>
#include <QTemporaryDir>
#include <QtTest>

using namespace kv;
using namespace kv::sim;

Q_DECLARE_METATYPE(kv::SettingsSet)

namespace {

constexpr int Kv720Map = 3;
constexpr int RunWaitMs = 60000;
const QString windowTag = QStringLiteral("MCT00001");

// The KV720's programming order as the module sees it: "W reg" is a write and
// its read-back, "D reg id" one part written with that bus ID, "R reg" a read,
// "T reg first-last" the parts of a table. "TC" rows belong to thermocouples only.
const char* const programmingOrder[] = {
    "R Mod_Type",     "W TypInput",        "D File_Name 16", "D File_Name 20",  "D File_Name 24",
    "D File_Name 28", "D File_Name 32",    "W Eng_Unit1",    "W Eng_Unit2",     "W Eng_Unit3",
    "W Eng_Unit4",    "W Eng_In_Z",        "W Eng_In_F",     "W Meas_Unit_Z",   "W Meas_Unit_F",
    "W Buss_ID",      "W In_Rng1",         "W in_ch",        "W in_res",        "W Type_In_Unit",
    "R CIN_Z",        "R CIN_F",           "R SLOP_P",       "R SLOP_N",        "W Usr_In1_Z",
    "W Usr_In1_F",    "W Aux_C",           "W Flag_A",       "W Orig_OS_PWM",   "W Orig_FlagA",
    "W Gain_Factor",  "TC T TableC 16-66", "TC R Term_Temp", "T Table1 16-116", "R Input_B4_Table",
    "W Out_Rng1",     "R COUT_Z",          "R COUT_F",       "W Usr_Out1_Z",    "W Usr_Out1_F",
    "W Sig_Lmt1_Z",   "W Sig_Lmt1_F",
    "R Serial_No",  // the run's check that the module is still the one it started on
};

const char* const readingOrder[] = {
    "R Mod_Type",     "R Buss_ID",        "R File_Name 16",   "R File_Name 20", "R File_Name 24",
    "R File_Name 28", "R File_Name 32",   "R TypInput",       "R Type_In_Unit", "R In_Rng1",
    "R Meas_Unit_Z",  "R Meas_Unit_F",    "R Eng_In_F",       "R Eng_In_Z",     "R in_ch",
    "R in_res",       "R Flag_A",         "R Out_Rng1",       "R Usr_Out1_Z",   "R Usr_Out1_F",
    "R Sig_Lmt1_Z",   "R Sig_Lmt1_F",     "R COUT_Z",         "R COUT_F",       "R Aux_C",
    "R IS_ZS1",       "R IS_FS1",         "R IS_ZS2",         "R IS_FS2",       "R Eng_Unit1",
    "R Eng_Unit2",    "R Eng_Unit3",      "R Eng_Unit4",      "R Orig_OS_PWM",  "R Orig_FlagA",
    "R Gain_Factor",  "RT Table1 16-116", "R Input_B4_Table", "R Int_Temp",     "R Serial_No",
};

struct Frame {
    char command;
    int busId;
    int address;
    bool operator==(const Frame& o) const {
        return command == o.command && busId == o.busId && address == o.address;
    }
};

QString show(const Frame& f) {
    return QStringLiteral("%1 %2 id %3").arg(QChar(f.command)).arg(f.address).arg(f.busId);
}

int addressOf(const QString& name) {
    const RegMap map = RegMapFor(Kv720Map);
    for (const RegisterRow& row : AllRegisters())
        if (name == QLatin1String(row.field.name()))
            return row.field.address(map);
    qFatal("no register %s", qPrintable(name));
}

QList<Frame> expectedFrames(const char* const* order, int count, bool thermocouple) {
    QList<Frame> frames;
    for (int i = 0; i < count; ++i) {
        QStringList words = QString(order[i]).split(' ');
        if (words[0] == "TC") {
            if (!thermocouple)
                continue;
            words.removeFirst();
        }
        const int address = addressOf(words[1]);
        if (words[0] == "W") {
            frames << Frame{'W', 16, address} << Frame{'R', 16, address};
        } else if (words[0] == "R") {
            frames << Frame{'R', words.size() > 2 ? words[2].toInt() : 16, address};
        } else if (words[0] == "D") {
            frames << Frame{'W', words[2].toInt(), address};
        } else {
            const QStringList ends = words[2].split('-');
            for (int id = ends[0].toInt(); id <= ends[1].toInt(); id += 2)
                frames << Frame{words[0] == "T" ? 'W' : 'R', id, address};
        }
    }
    return frames;
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
    for (int i = 0; i <= Table1LastUsed; ++i)
        s.Table1[i] = i * i;
    TableChecksum(s.Table1.data(), Table1LastUsed);
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

float singleAt(const Simulator& sim, const char* name) {
    return WireToSingle(LongToWire(sim.registerValue(addressOf(name))));
}

// One simulated KV720 on its own COM port, connected and identified.
class Bench {
public:
    explicit Bench(ModuleIdentity module = {}, qint32 cinF = 6880) : sim(optionsFor(module)) {
        QString error;
        ok = sim.start(error) && sim.publishAsPort(port, error);
        // G = 5680 counts over a range, so that table C fits its 16 bits.
        if (ok && FamilyOfType(module.typeCode) == Kv720Map)
            sim.setRegisterValue(addressOf("CIN_F"), cinF);
        connection.engine().setPort(port);
        QSignalSpy identified(&connection, &ModuleConnection::runMode);
        ok = ok && connection.OpenCom(true, error);
        connection.startTimer(1);
        ok = ok && identified.wait(30000);
        if (!ok)
            qWarning() << "bench:" << error;
    }

    // The frames the module received since the last mark.
    QList<Frame> framesSinceMark() const {
        QList<Frame> frames;
        for (const SimLogEntry& entry : sim.log())
            if (entry.kind == SimLogEntry::Request && entry.sequence > mark)
                frames << Frame{entry.command, entry.busId, entry.address};
        return frames;
    }
    // Positions of the unanswered frames among those since the mark.
    QList<int> droppedSinceMark() const {
        QList<int> dropped;
        int position = 0;
        for (const SimLogEntry& entry : sim.log()) {
            if (entry.kind != SimLogEntry::Request || entry.sequence <= mark)
                continue;
            if (entry.outcome == SimLogEntry::Dropped)
                dropped << position;
            ++position;
        }
        return dropped;
    }
    void setMark() {
        const std::vector<SimLogEntry> log = sim.log();
        mark = log.empty() ? 0 : log.back().sequence;
    }

    struct Outcome {
        bool ended = false;
        bool ok = false;
        QString text;
        QList<Frame> frames;  // received from the start of the run to its end
    };

    Outcome program(ModuleRun& run, const SettingsSet& settings) {
        return runToEnd(run, [&](QString& error) {
            return run.startProgramming(Kv720Driver(), settings, error);
        });
    }
    Outcome read(ModuleRun& run) {
        return runToEnd(run,
                        [&](QString& error) { return run.startReading(Kv720Driver(), {}, error); });
    }

    Simulator sim;
    qint16 port = nextPort++;
    ModuleConnection connection;
    bool ok = false;
    qint64 mark = 0;

private:
    static SimOptions optionsFor(const ModuleIdentity& module) {
        SimOptions options;
        options.module = module;
        return options;
    }

    template <typename Start>
    Outcome runToEnd(ModuleRun& run, Start start) {
        Outcome outcome;
        QSignalSpy finished(&run, &ModuleRun::finished);
        // The frames up to the end: the live polling starts again right after it.
        QList<Frame> frames;
        QObject::connect(&run, &ModuleRun::finished, &run, [&] { frames = framesSinceMark(); });
        QString error;
        if (!start(error)) {
            outcome.text = error;
            return outcome;
        }
        // The run's first request goes out on the next tick; a poll that the
        // reservation waited for is already logged.
        setMark();
        outcome.ended = finished.wait(RunWaitMs);
        if (outcome.ended) {
            outcome.ok = finished.at(0).at(0).toBool();
            outcome.text = finished.at(0).at(1).toString();
        }
        outcome.frames = frames;
        return outcome;
    }

    static inline qint16 nextPort = 1;
};

ModuleIdentity kv720(qint32 serial = 100001) {
    ModuleIdentity module;
    ParseModel("KV720-20", module);
    module.serial = serial;
    return module;
}

void compareFrames(const QList<Frame>& actual, const QList<Frame>& expected) {
    const int common = int(qMin(actual.size(), expected.size()));
    for (int i = 0; i < common; ++i)
        QVERIFY2(actual[i] == expected[i], qPrintable(QStringLiteral("frame %1: %2, expected %3")
                                                          .arg(i)
                                                          .arg(show(actual[i]))
                                                          .arg(show(expected[i]))));
    QCOMPARE(actual.size(), expected.size());
}

}  // namespace

class TestModuleRun : public QObject {
    Q_OBJECT
private slots:
    void initTestCase();

    void programmingFollowsTheOrder_data();
    void programmingFollowsTheOrder();
    void programmedRegisters();
    void programThenReadBack_data();
    void programThenReadBack();
    void readingFollowsTheOrder();

    void wrongModel();
    void inputOutOfRange();
    void secondRunRefused();
    void droppedReplyIsRetried();
    void deadModuleEndsTheRun();
    void deadModuleEndsARead();
    void disconnectEndsTheRun();
    void swappedModuleIsNotProgrammed();

private:
    QTemporaryDir portDir_;
};

void TestModuleRun::initTestCase() {
    QVERIFY(portDir_.isValid());
    qputenv("KV700_PORT_DIR", portDir_.path().toLocal8Bit());
}

void TestModuleRun::programmingFollowsTheOrder_data() {
    QTest::addColumn<SettingsSet>("settings");
    QTest::addColumn<bool>("thermocouple");
    QTest::newRow("mV") << milliVolts() << false;
    QTest::newRow("thermocouple") << thermocouple() << true;
    QTest::newRow("RTD") << rtd() << false;
}

void TestModuleRun::programmingFollowsTheOrder() {
    QFETCH(SettingsSet, settings);
    QFETCH(bool, thermocouple);
    Bench bench(kv720());
    QVERIFY(bench.ok);
    ModuleRun run(bench.connection, windowTag);
    QSignalSpy progress(&run, &ModuleRun::progress);
    QSignalSpy status(&run, &ModuleRun::statusChanged);
    const Bench::Outcome outcome = bench.program(run, settings);
    QVERIFY(outcome.ended);
    QVERIFY2(outcome.ok, qPrintable(outcome.text));
    QCOMPARE(outcome.text, QString("Programmed"));
    QCOMPARE(status.first().at(0).toString(), QString("Programming.."));
    compareFrames(outcome.frames,
                  expectedFrames(programmingOrder, int(std::size(programmingOrder)), thermocouple));

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
    Bench bench(kv720());
    QVERIFY(bench.ok);
    bench.sim.setRegisterValue(addressOf("CIN_F"), 58000);  // G = 56800
    ModuleRun run(bench.connection, windowTag);
    const Bench::Outcome outcome = bench.program(run, milliVolts());
    QVERIFY2(outcome.ok, qPrintable(outcome.text));
    const Simulator& sim = bench.sim;
    auto value = [&](const char* name) { return sim.registerValue(addressOf(name)); };
    QCOMPARE(value("TypInput"), 1);
    QCOMPARE(sim.fileName(), QByteArray("PUMP 3 INLET        "));
    QCOMPARE(value("Eng_Unit1"), int('k'));
    QCOMPARE(value("Eng_Unit4"), int(' '));
    QCOMPARE(singleAt(sim, "Eng_In_F"), 250.0f);
    QCOMPARE(singleAt(sim, "Meas_Unit_F"), 20.0f);
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
    Bench bench(kv720(123456));
    QVERIFY(bench.ok);
    ModuleRun run(bench.connection, windowTag);
    const Bench::Outcome programmed = bench.program(run, settings);
    QVERIFY2(programmed.ok, qPrintable(programmed.text));
    const SettingsSet sent = run.settings();
    const Bench::Outcome read = bench.read(run);
    QVERIFY2(read.ok, qPrintable(read.text));
    QCOMPARE(read.text, QString("KV720-20 Settings Read.."));
    QCOMPARE(run.warning(), QString());
    const SettingsSet& got = run.settings();

    QCOMPARE(got.ModTypeSet, 4);
    QCOMPARE(got.SerialNumb, 123456);
    QCOMPARE(got.FileName, sent.FileName);
    QCOMPARE(got.BussIdenti, sent.BussIdenti);
    QCOMPARE(got.Inp1RngTyp, sent.Inp1RngTyp);
    QCOMPARE(got.Inp1RngSet, sent.Inp1RngSet);
    QCOMPARE(got.Typ1InUnit, sent.Typ1InUnit);
    QCOMPARE(got.Inp1MeUnit, sent.Inp1MeUnit);
    QCOMPARE(got.Inp1Shape, sent.Inp1Shape);
    QCOMPARE(got.Inp1mU_Zro, sent.Inp1mU_Zro);
    QCOMPARE(got.Inp1mU_Ful, sent.Inp1mU_Ful);
    QCOMPARE(got.Inp1EngZro, sent.Inp1EngZro);
    QCOMPARE(got.Inp1EngFul, sent.Inp1EngFul);
    QCOMPARE(got.Inp1EngUnt, sent.Inp1EngUnt);
    QCOMPARE(got.Typ1Differ, sent.Typ1Differ);
    QCOMPARE(got.Typ1InRes, sent.Typ1InRes);
    QCOMPARE(got.RemoteCont, sent.RemoteCont);
    QCOMPARE(got.Inp1Respon, sent.Inp1Respon);
    QCOMPARE(got.UserLmtEna, sent.UserLmtEna);
    QCOMPARE(got.DirecrReve, sent.DirecrReve);
    QCOMPARE(got.Inp1BurnOut, sent.Inp1BurnOut);
    QCOMPARE(got.MinorTrim, 0);
    QCOMPARE(got.AuxIsI, sent.AuxIsI);
    QCOMPARE(got.AuxVmA, sent.AuxVmA);
    QCOMPARE(got.Out1RngTyp, sent.Out1RngTyp);
    QCOMPARE(got.Out1EngZro, sent.Out1EngZro);
    QCOMPARE(got.Out1EngFul, sent.Out1EngFul);
    QCOMPARE(got.Out1SigLmZ, sent.Out1SigLmZ);
    QCOMPARE(got.Out1SigLmF, sent.Out1SigLmF);
    QVERIFY(got.Table1 == sent.Table1);
}

void TestModuleRun::readingFollowsTheOrder() {
    Bench bench(kv720());
    QVERIFY(bench.ok);
    ModuleRun run(bench.connection, windowTag);
    QSignalSpy status(&run, &ModuleRun::statusChanged);
    const Bench::Outcome outcome = bench.read(run);
    QVERIFY2(outcome.ok, qPrintable(outcome.text));
    QCOMPARE(status.first().at(0).toString(), QString("Read program from connected module . . ."));
    compareFrames(outcome.frames,
                  expectedFrames(readingOrder, int(std::size(readingOrder)), false));
    // The factory state: 0-20 mV linear in, 4-20 mA out of 0-20 mA.
    QCOMPARE(run.settings().FileName, QString("FACTORY SETTINGS    "));
    QCOMPARE(run.settings().Inp1RngSet, 4);
    QCOMPARE(run.settings().Inp1Shape, QString("Linear"));
    QCOMPARE(run.settings().Out1EngZro, 4.0f);
    QCOMPARE(run.settings().Out1EngFul, 20.0f);
}

void TestModuleRun::wrongModel() {
    ModuleIdentity module;
    ParseModel("KV760-20", module);
    Bench bench(module);
    QVERIFY(bench.ok);
    ModuleRun run(bench.connection, windowTag);
    const Bench::Outcome programmed = bench.program(run, milliVolts());
    QVERIFY(programmed.ended);
    QVERIFY(!programmed.ok);
    QCOMPARE(programmed.text, QString("PROGRAM FAIL Module Type: KV760-20 is not KV720!"));
    QCOMPARE(programmed.frames.size(), 1);  // the module type, nothing written

    const Bench::Outcome read = bench.read(run);
    QVERIFY(!read.ok);
    QCOMPARE(read.text, QString("Module Type - KV760-20 is not KV720! FAIL"));
    QVERIFY(!bench.connection.engine().reserved());
}

void TestModuleRun::inputOutOfRange() {
    Bench bench(kv720());
    QVERIFY(bench.ok);
    ModuleRun run(bench.connection, windowTag);
    SettingsSet settings = milliVolts();
    settings.Inp1mU_Zro = 300;
    settings.Inp1mU_Ful = 350;
    const Bench::Outcome outcome = bench.program(run, settings);
    QVERIFY(!outcome.ok);
    QCOMPARE(outcome.text, QString("PROGRAM FAIL BUSS ID: Maximum input 624mV and maximum offset "
                                   "is 50% of range.9"));
    // The run stops with the bus ID written: the range register keeps the factory range.
    QCOMPARE(outcome.frames.last(), (Frame{'R', 16, addressOf("Buss_ID")}));
    QCOMPARE(bench.sim.registerValue(addressOf("In_Rng1")), 4);

    settings.Inp1mU_Zro = 0;
    settings.Inp1mU_Ful = 500.1f;
    const Bench::Outcome early = bench.program(run, settings);
    QCOMPARE(early.text, QString("PROGRAM FAIL Module Type: Maximum input range is 500mV"));
    QCOMPARE(early.frames.size(), 1);
}

void TestModuleRun::secondRunRefused() {
    Bench bench(kv720());
    QVERIFY(bench.ok);
    ModuleRun run(bench.connection, windowTag);
    ModuleRun other(bench.connection, "MCT00002");
    QSignalSpy finished(&run, &ModuleRun::finished);
    QString error;
    QVERIFY(run.startProgramming(Kv720Driver(), milliVolts(), error));
    QVERIFY(!run.startReading(Kv720Driver(), {}, error));
    QCOMPARE(error, QString("Please try again !!"));
    QVERIFY(!other.startReading(Kv720Driver(), {}, error));
    QCOMPARE(error, QString("Please try again !!"));
    QVERIFY(finished.wait(RunWaitMs));
    QCOMPARE(finished.at(0).at(1).toString(), QString("Programmed"));
}

void TestModuleRun::droppedReplyIsRetried() {
    Bench bench(kv720());
    QVERIFY(bench.ok);
    SimFaults faults;
    faults.dropFrame = 40;  // inside the engineering unit writes
    bench.sim.setFaults(faults);
    ModuleRun run(bench.connection, windowTag);
    const Bench::Outcome outcome = bench.program(run, milliVolts());
    QVERIFY2(outcome.ok, qPrintable(outcome.text));
    const QList<int> dropped = bench.droppedSinceMark();
    QCOMPARE(dropped.size(), 1);
    // The unanswered frame went out again; apart from that, the order is unchanged.
    QList<Frame> frames = outcome.frames;
    QCOMPARE(frames[dropped[0]], frames[dropped[0] + 1]);
    frames.removeAt(dropped[0]);
    compareFrames(frames,
                  expectedFrames(programmingOrder, int(std::size(programmingOrder)), false));
}

void TestModuleRun::deadModuleEndsTheRun() {
    Bench bench(kv720());
    QVERIFY(bench.ok);
    SimFaults faults;
    faults.deadAfter = 20;
    bench.sim.setFaults(faults);
    ModuleRun run(bench.connection, windowTag);
    const Bench::Outcome outcome = bench.program(run, milliVolts());
    QVERIFY(outcome.ended);
    QVERIFY(!outcome.ok);
    QVERIFY2(outcome.text.startsWith("PROGRAM FAIL "), qPrintable(outcome.text));
    QVERIFY2(outcome.text.contains(": Too many retries:"), qPrintable(outcome.text));
    QVERIFY(!bench.connection.engine().reserved());
    QVERIFY(!bench.connection.engine().connected());
}

void TestModuleRun::deadModuleEndsARead() {
    Bench bench(kv720());
    QVERIFY(bench.ok);
    SimFaults faults;
    faults.deadAfter = 10;
    bench.sim.setFaults(faults);
    ModuleRun run(bench.connection, windowTag);
    const Bench::Outcome outcome = bench.read(run);
    QVERIFY(outcome.ended);
    QVERIFY(!outcome.ok);
    QVERIFY2(outcome.text.endsWith(" - Too many retries: FAIL"), qPrintable(outcome.text));
}

void TestModuleRun::disconnectEndsTheRun() {
    Bench bench(kv720());
    QVERIFY(bench.ok);
    ModuleRun run(bench.connection, windowTag);
    // Closed from outside while a request is waiting: no callback ever comes.
    connect(&run, &ModuleRun::progress, &run, [&](const QString&, int step) {
        if (step == 5) {
            QString error;
            bench.connection.OpenCom(false, error);
        }
    });
    const Bench::Outcome outcome = bench.program(run, milliVolts());
    QVERIFY(outcome.ended);
    QVERIFY(!outcome.ok);
    QVERIFY2(outcome.text.endsWith(": COM closed"), qPrintable(outcome.text));
    QVERIFY(!bench.connection.engine().reserved());
}

void TestModuleRun::swappedModuleIsNotProgrammed() {
    // Another KV720 takes over during the table transfer: every later request
    // succeeds on it, yet the run must not report the first one as programmed.
    Bench bench(kv720(100001));
    QVERIFY(bench.ok);
    SimFaults faults;
    faults.swapAfter = 80;
    faults.swapTo = kv720(100002);
    bench.sim.setFaults(faults);
    ModuleRun run(bench.connection, windowTag);
    const Bench::Outcome outcome = bench.program(run, milliVolts());
    QVERIFY(outcome.ended);
    QVERIFY(!outcome.ok);
    QCOMPARE(outcome.text, QString("PROGRAM FAIL Serial number: Module changed"));
}

QTEST_GUILESS_MAIN(TestModuleRun)
#include "tst_modulerun.moc"
