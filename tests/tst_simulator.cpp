// The module simulator seen through the program's own serial layer.
#include "model/codec.h"
#include "model/module_types.h"
#include "model/register_map.h"
#include "serial/adapter_test.h"
#include "serial/frame.h"
#include "serial/transact.h"
#include "sim/simulator.h"
#include "tests/support/diagnostic_capture.h"

#include <QFileInfo>
#include <QTemporaryDir>
#include <QtTest>

#include <fcntl.h>
#include <poll.h>
#include <unistd.h>

using namespace kv;
using namespace kv::KvSerialPort;
using namespace kv::sim;

namespace {
QByteArray message(char command, int busId, int address, const QByteArray& data) {
    QByteArray text(1, command);
    text += char(busId);
    text += char(address);
    text += data;
    text += 'F';
    return text;
}

QByteArray readOf(int address, int busId = 16) {
    return message('R', busId, address, "30303030");
}

QByteArray writeOf(int address, qint32 value, int busId = 16) {
    return message('W', busId, address, LongToWire(value));
}

QByteArray charsOf(const QByteArray& four) {
    QByteArray data;
    for (char c : four)
        data += ToWireDigits(quint8(c), 2);
    return data;
}

ModuleIdentity modelOf(const QString& text, qint32 serial = 100001) {
    ModuleIdentity identity;
    ParseModel(text, identity);
    identity.serial = serial;
    return identity;
}

RegMap mapOf(const ModuleIdentity& identity) {
    return RegMapFor(GetModMap(identity.typeCode));
}

const QString untouched = QStringLiteral("untouched");

struct Exchange {
    bool ok = false;
    QByteArray reply;
    QString error = untouched;
    bool portFault = false;

    QByteArray data() const { return reply.mid(3, 8); }
    qint32 value() const { return WireToLong(data()); }
    char status() const { return reply.size() == MessageLength ? reply[11] : 0; }
};

// One simulator, published as its own COM port for the length of a test.
class Bench {
public:
    explicit Bench(const SimOptions& options = {}) : sim(options), port(nextPort++) {
        QString error;
        if (!sim.start(error) || !sim.publishAsPort(port, error))
            qWarning() << error;
    }

    Exchange transact(const QByteArray& text, qint16 connector = ConnectorPlain,
                      bool debug = false) {
        Exchange exchange;
        exchange.ok = Transact(port, text, connector, debug, exchange.reply, exchange.error,
                               exchange.portFault);
        return exchange;
    }
    qint32 read(int address, int busId = 16) { return transact(readOf(address, busId)).value(); }

    Simulator sim;
    qint16 port;

private:
    static inline qint16 nextPort = 1;
};

SimOptions optionsFor(const QString& model) {
    SimOptions options;
    options.module = modelOf(model);
    return options;
}

QStringList allModels() {
    return {"KV714-20", "KV716-10", "KV720-20", "KV714-22", "KV718-10",
            "KV716-23", "KV760-20", "KV718-1A", "KV718-2A"};
}
}  // namespace

class TestSimulator : public QObject {
    Q_OBJECT
private slots:
    void initTestCase();

    void everyFamilyIdentifiesAndStores_data();
    void everyFamilyIdentifiesAndStores();
    void sixteenBitRegistersSignExtend_data();
    void sixteenBitRegistersSignExtend();
    void readOnlyRegistersKeepTheirValue();
    void fileNameRoundTripInFiveParts();
    void table1TransferAndReadBack();
    void calibrationErrorsInParts();
    void negativeReadingIsSignExtended();
    void minorTrimVerdicts_data();
    void minorTrimVerdicts();
    void pulseModuleMeasures();

    void silenceSchedules_data();
    void silenceSchedules();
    void droppedWriteStillTakesEffect();
    void corruptedCheckIsNeverAccepted();
    void noiseBeforeReply();
    void splitReplyStillArrives();
    void latency_data();
    void latency();
    void swapIsSeenInNextModuleTypeRead();
    void swapAtRunTime();
    void portHeldBusy();
    void primedAdapterAnswersOnlyAfterPriming();
    void adapterSelfTest_data();
    void adapterSelfTest();

    void garbageIsIgnoredAndCounted();
    void logRecordsFrames();
    void portLinkLifecycle();

private:
    QTemporaryDir portDir_;
};

void TestSimulator::initTestCase() {
    QVERIFY(portDir_.isValid());
    qputenv("KV700_PORT_DIR", portDir_.path().toLocal8Bit());
}

void TestSimulator::everyFamilyIdentifiesAndStores_data() {
    QTest::addColumn<QString>("model");
    for (const QString& model : allModels())
        QTest::newRow(qPrintable(model)) << model;
}

void TestSimulator::everyFamilyIdentifiesAndStores() {
    QFETCH(QString, model);
    SimOptions options = optionsFor(model);
    options.module.serial = 4711;
    Bench bench(options);
    const RegMap map = mapOf(options.module);

    // The program asks 255 before it knows the family, then the map's own address.
    QCOMPARE(bench.read(RegMap().Mod_Type), options.module.typeCode);
    QCOMPARE(bench.read(map.Mod_Type), options.module.typeCode);
    QCOMPARE(bench.read(map.Serial_No), 4711);
    if (map.TypInput >= 0)
        QCOMPARE(bench.read(map.TypInput), options.module.subType);
    QCOMPARE(ModelText(options.module.typeCode, qint16(options.module.subType)), model);

    const Exchange write = bench.transact(writeOf(map.Usr_Out1_F, 23456));
    QVERIFY(write.ok);
    QCOMPARE(write.reply[0], 'W');
    QCOMPARE(write.value(), 23456);
    QCOMPARE(bench.read(map.Usr_Out1_F), 23456);
    QCOMPARE(bench.sim.registerValue(map.Usr_Out1_F), 23456);
}

void TestSimulator::sixteenBitRegistersSignExtend_data() {
    QTest::addColumn<QString>("model");
    for (const char* model : {"KV720-20", "KV714-22", "KV716-22", "KV760-20", "KV718-1A"})
        QTest::newRow(model) << QString(model);
}

void TestSimulator::sixteenBitRegistersSignExtend() {
    QFETCH(QString, model);
    Bench bench(optionsFor(model));
    const RegMap map = mapOf(bench.sim.module());
    QVERIFY(bench.transact(writeOf(map.Flag_A, 0x1FFFF)).ok);
    const Exchange read = bench.transact(readOf(map.Flag_A));
    QCOMPARE(read.data(), QByteArray("????????"));
    qint16 narrowed = 0;
    QVERIFY(WireToInt(read.data(), narrowed));
    QCOMPARE(narrowed, qint16(-1));
}

void TestSimulator::readOnlyRegistersKeepTheirValue() {
    Bench bench(optionsFor("KV720-20"));
    const RegMap map = mapOf(bench.sim.module());
    const qint32 cinZ = bench.read(map.CIN_Z);

    const Exchange typeWrite = bench.transact(writeOf(map.Mod_Type, 7));
    QVERIFY(typeWrite.ok);
    QCOMPARE(typeWrite.value(), 4);
    QVERIFY(typeWrite.status() != '0');
    QCOMPARE(bench.read(map.Mod_Type), 4);

    QVERIFY(bench.transact(writeOf(map.CIN_Z, cinZ + 99)).ok);
    QCOMPARE(bench.read(map.CIN_Z), cinZ);
}

void TestSimulator::fileNameRoundTripInFiveParts() {
    Bench bench(optionsFor("KV714-22"));
    const int address = mapOf(bench.sim.module()).File_Name;
    const QByteArray name = "PUMP STATION 07 TANK";
    QCOMPARE(name.size(), FileNameLength);

    for (int busId = 16; busId <= 32; busId += 4) {
        const Exchange write =
            bench.transact(message('W', busId, address, charsOf(name.mid(busId - 16, 4))));
        QVERIFY2(write.ok, qPrintable(QString::number(busId)));
        QCOMPARE(int(quint8(write.reply[1])), busId);
    }
    QCOMPARE(bench.sim.fileName(), name);

    QByteArray readBack;
    for (int busId = 16; busId <= 32; busId += 4) {
        const Exchange read = bench.transact(readOf(address, busId));
        QVERIFY(read.ok);
        for (int i = 0; i < 4; ++i)
            readBack += char(WireToLong(read.data().mid(2 * i, 2)));
    }
    QCOMPARE(readBack, name);

    // A part the register does not have changes nothing.
    QVERIFY(bench.transact(message('W', 36, address, charsOf("XXXX"))).ok);
    QCOMPARE(bench.sim.fileName(), name);
}

void TestSimulator::table1TransferAndReadBack() {
    Bench bench(optionsFor("KV760-20"));
    const int address = mapOf(bench.sim.module()).Table1;

    std::vector<qint32> table(Table1Points, 0);
    quint32 x = 0;
    for (int i = 0; i <= 100; ++i) {
        table[i] = qint32(std::lround(10000 * std::pow(i / 100.0, 1.5)));
        x ^= quint32(table[i]);
    }
    table[101] = qint32(~x & 0xFFFF);

    for (int k = 0; k <= 100; k += 2) {
        const QByteArray data = ToWireDigits(table[k], 4) + ToWireDigits(table[k + 1], 4);
        const Exchange step = bench.transact(message('T', 16 + k, address, data));
        QVERIFY(step.ok);
        QCOMPARE(step.reply[0], 'W');  // answered, not taken as done after its time-out
    }
    QCOMPARE(bench.sim.table1(), table);

    std::vector<qint32> readBack(Table1Points, -1);
    for (int k = 0; k <= 100; k += 2) {
        const Exchange read = bench.transact(readOf(address, 16 + k));
        QVERIFY(read.ok);
        readBack[k] = WireToLong(read.data().left(4));
        readBack[k + 1] = WireToLong(read.data().mid(4));
    }
    quint32 check = 0;
    for (int i = 0; i <= 100; ++i)
        check ^= quint32(readBack[i]);
    QCOMPARE(qint32(~check & 0xFFFF), readBack[101]);
    QCOMPARE(readBack, table);
}

void TestSimulator::calibrationErrorsInParts() {
    Bench bench(optionsFor("KV720-20"));
    const int address = mapOf(bench.sim.module()).Cal_Errors;
    std::vector<int> errors;
    for (int busId = 16; busId <= 96; busId += 4) {
        const Exchange read = bench.transact(readOf(address, busId));
        QVERIFY(read.ok);
        for (int i = 0; i < 4; ++i)
            errors.push_back(qint8(WireToLong(read.data().mid(2 * i, 2))));
    }
    QCOMPARE(int(errors.size()), 84);
    QCOMPARE(errors, bench.sim.calErrors());
    const auto nonZero = std::count_if(errors.begin(), errors.end(), [](int e) { return e != 0; });
    QVERIFY(nonZero > 0 && nonZero < 10);
    QVERIFY(std::any_of(errors.begin(), errors.end(), [](int e) { return e < 0; }));
}

void TestSimulator::negativeReadingIsSignExtended() {
    SimOptions options = optionsFor("KV714-22");
    options.heldReading = -150;
    Bench bench(options);
    const Exchange read = bench.transact(readOf(mapOf(bench.sim.module()).Input_Reading));
    QVERIFY(read.ok);
    QCOMPARE(read.data(), LongToWire(-150));
    qint16 reading = 0;
    QVERIFY(WireToInt(read.data(), reading));
    QCOMPARE(reading, qint16(-150));
}

void TestSimulator::minorTrimVerdicts_data() {
    QTest::addColumn<int>("reading");
    QTest::addColumn<int>("code");
    QTest::addColumn<int>("forced");  // -1: the module's own verdict
    QTest::addColumn<int>("verdict");
    QTest::newRow("zero inside window") << 120 << 10 << -1 << 0;
    QTest::newRow("zero outside window") << 3000 << 10 << -1 << 200;
    QTest::newRow("span inside window") << 9800 << 100 << -1 << 0;
    QTest::newRow("span outside window") << 5000 << 100 << -1 << 200;
    QTest::newRow("forced out of range") << 0 << 10 << 200 << 200;
    QTest::newRow("forced done") << 3000 << 10 << 0 << 0;
    QTest::newRow("unknown code") << 0 << 55 << -1 << 1;
}

void TestSimulator::minorTrimVerdicts() {
    QFETCH(int, reading);
    QFETCH(int, code);
    QFETCH(int, forced);
    QFETCH(int, verdict);
    SimOptions options = optionsFor("KV720-20");
    options.heldReading = reading;
    if (forced >= 0)
        options.trimVerdict = forced;
    Bench bench(options);
    const RegMap map = mapOf(bench.sim.module());
    const qint32 zero = bench.read(map.Usr_In1_Z);
    const qint32 span = bench.read(map.Usr_In1_F) - zero;
    const qint32 gain = bench.read(map.Gain_Factor);

    QVERIFY(bench.transact(writeOf(map.Minor_Cal, code)).ok);
    QCOMPARE(bench.read(map.Minor_Cal), verdict);

    const bool done = verdict == 0;
    const qint32 zeroAfter = bench.read(map.Usr_In1_Z);
    const qint32 gainAfter = bench.read(map.Gain_Factor);
    if (done && code == 10) {
        QCOMPARE(zeroAfter, zero + qint32(std::lround(double(reading) * span / 10000)));
    } else {
        QCOMPARE(zeroAfter, zero);
    }
    if (done && code == 100) {
        QCOMPARE(gainAfter, qint32(std::lround(10000.0 * gain / reading)));
    } else {
        QCOMPARE(gainAfter, gain);
    }
}

void TestSimulator::pulseModuleMeasures() {
    SimOptions options = optionsFor("KV760-20");
    options.heldReading = 2500;
    Bench bench(options);
    const RegMap map = mapOf(bench.sim.module());
    const auto single = [&](float address) {
        return WireToSingle(bench.transact(readOf(qRound(address))).data());
    };
    const float low = single(map.Meas_Unit_Z);
    const float high = single(map.Meas_Unit_F);
    QVERIFY(high > low);
    QCOMPARE(single(map.In_Freq), low + (high - low) / 4);
    QVERIFY(single(map.Pulse_Peak) > single(map.Pulse_Valley));
    QVERIFY(single(map.Pulse_Peak_Raw) != single(map.Pulse_Peak));
    // The live trigger level is the programmed count in volts.
    QVERIFY(qAbs(single(map.Trig_Level_RT) - bench.read(map.Trig_Level) / 9930.0) < 1e-3);
}

void TestSimulator::silenceSchedules_data() {
    QTest::addColumn<int>("dropFrame");
    QTest::addColumn<int>("dropEvery");
    QTest::addColumn<int>("deadAfter");
    QTest::addColumn<QList<int>>("outcomes");
    const int A = SimLogEntry::Answered;
    const int D = SimLogEntry::Dropped;
    QTest::newRow("frame 2 dropped") << 2 << 0 << -1 << QList<int>{A, D, A};
    QTest::newRow("every third dropped") << 0 << 3 << -1 << QList<int>{A, A, D, A, A, D};
    QTest::newRow("dead after two") << 0 << 0 << 2 << QList<int>{A, A, SimLogEntry::Dead};
}

void TestSimulator::silenceSchedules() {
    QFETCH(int, dropFrame);
    QFETCH(int, dropEvery);
    QFETCH(int, deadAfter);
    QFETCH(QList<int>, outcomes);
    SimOptions options = optionsFor("KV716-22");
    options.faults.dropFrame = dropFrame;
    options.faults.dropEvery = dropEvery;
    options.faults.deadAfter = deadAfter;
    Bench bench(options);
    const int address = mapOf(bench.sim.module()).Serial_No;
    for (const int outcome : outcomes) {
        const Exchange exchange = bench.transact(readOf(address));
        QCOMPARE(exchange.ok, outcome == SimLogEntry::Answered);
        QVERIFY(!exchange.portFault);
        if (!exchange.ok)
            QCOMPARE(exchange.error, untouched);  // a plain time-out carries no text
        QCOMPARE(int(bench.sim.log().back().outcome), outcome);
    }
    QCOMPARE(bench.sim.log().size(), size_t(outcomes.size()));
}

void TestSimulator::droppedWriteStillTakesEffect() {
    SimOptions options = optionsFor("KV718-1A");
    options.faults.dropFrame = 1;
    Bench bench(options);
    const int address = mapOf(bench.sim.module()).Usr_Out1_Z;
    QVERIFY(!bench.transact(writeOf(address, 777)).ok);
    QCOMPARE(bench.read(address), 777);
}

void TestSimulator::corruptedCheckIsNeverAccepted() {
    SimOptions options = optionsFor("KV720-20");
    options.faults.corruptEvery = 1;
    Bench bench(options);
    const int address = mapOf(bench.sim.module()).Serial_No;
    QVERIFY(!bench.transact(readOf(address)).ok);
    QCOMPARE(bench.sim.log().back().outcome, SimLogEntry::Answered);

    bench.sim.setFaults({});
    QVERIFY(bench.transact(readOf(address)).ok);
}

void TestSimulator::noiseBeforeReply() {
    SimOptions options = optionsFor("KV720-20");
    options.module.serial = 31337;
    options.faults.noiseBytes = 11;
    Bench bench(options);
    const Exchange read = bench.transact(readOf(mapOf(bench.sim.module()).Serial_No));
    QVERIFY(read.ok);
    QCOMPARE(read.value(), 31337);
}

void TestSimulator::splitReplyStillArrives() {
    SimOptions options = optionsFor("KV714-20");
    options.module.serial = 2024;
    options.faults.splitBytes = 5;  // 5 + 5 + 5 + 1 bytes, each in its own read
    options.faults.splitGapMs = 30;
    Bench bench(options);
    DiagnosticCapture capture;
    const Exchange read =
        bench.transact(readOf(mapOf(bench.sim.module()).Serial_No), ConnectorPlain, true);
    QVERIFY(read.ok);
    QCOMPARE(read.value(), 2024);
    // The program's own trace of its reads shows the reply growing piece by piece.
    QList<int> held;
    for (const CapturedLine& line : capture.lines)
        if (line.text.endsWith(QLatin1String(" +")))
            held << int(line.data.size());
    QVERIFY(!held.isEmpty());
    QVERIFY2(held.first() < FrameLength, qPrintable(QString::number(held.first())));
    QCOMPARE(held.last(), FrameLength);
}

void TestSimulator::latency_data() {
    QTest::addColumn<int>("latencyMs");
    QTest::addColumn<bool>("answered");
    QTest::newRow("within the read budget") << 120 << true;
    QTest::newRow("far beyond it") << 4000 << false;
}

void TestSimulator::latency() {
    QFETCH(int, latencyMs);
    QFETCH(bool, answered);
    SimOptions options = optionsFor("KV760-10");
    options.faults.latencyMs = latencyMs;
    Bench bench(options);
    QCOMPARE(bench.transact(readOf(RegMap().Mod_Type)).ok, answered);
}

void TestSimulator::swapIsSeenInNextModuleTypeRead() {
    SimOptions options = optionsFor("KV720-20");
    options.faults.swapAfter = 1;
    options.faults.swapTo = modelOf("KV718-1A", 555);
    Bench bench(options);
    const RegMap before = mapOf(options.module);
    const RegMap after = mapOf(options.faults.swapTo);

    QCOMPARE(bench.read(before.Mod_Type), 4);
    QCOMPARE(bench.read(RegMap().Mod_Type), 10);
    QCOMPARE(bench.read(after.Mod_Type), 10);
    QCOMPARE(bench.read(after.Serial_No), 555);
    QCOMPARE(bench.read(after.TypInput), 3);
}

void TestSimulator::swapAtRunTime() {
    Bench bench(optionsFor("KV714-22"));
    const RegMap map = mapOf(bench.sim.module());
    const qint32 serial = bench.read(map.Serial_No);
    bench.sim.swapModule(modelOf("KV714-22", serial + 1));
    QCOMPARE(bench.read(map.Mod_Type), 7);
    QCOMPARE(bench.read(map.Serial_No), serial + 1);
}

void TestSimulator::portHeldBusy() {
    Bench bench(optionsFor("KV720-20"));
    QString error;
    QVERIFY2(bench.sim.setPortBusy(true, error), qPrintable(error));
    const Exchange refused = bench.transact(readOf(RegMap().Mod_Type));
    QVERIFY(!refused.ok);
    QVERIFY(refused.portFault);
    QCOMPARE(refused.error, QStringLiteral("/Port is use"));

    QVERIFY(bench.sim.setPortBusy(false, error));
    QVERIFY(bench.transact(readOf(RegMap().Mod_Type)).ok);
}

void TestSimulator::primedAdapterAnswersOnlyAfterPriming() {
    SimOptions options = optionsFor("KV720-20");
    options.adapter = 1;
    Bench bench(options);
    QVERIFY(!bench.transact(readOf(RegMap().Mod_Type), ConnectorPlain).ok);
    const Exchange primed = bench.transact(readOf(RegMap().Mod_Type), ConnectorPrimed);
    QVERIFY(primed.ok);
    QCOMPARE(primed.value(), 4);
}

void TestSimulator::adapterSelfTest_data() {
    QTest::addColumn<int>("decayMs");
    QTest::addColumn<int>("deadAfter");
    QTest::addColumn<bool>("passes");
    QTest::addColumn<QString>("reportStart");
    QTest::newRow("keeps sending about 100 ms") << 100 << -1 << true << "PASS KV705 !!! ";
    QTest::newRow("keeps sending too long") << 400 << -1 << false << "FAIL KV705 decay";
    QTest::newRow("silent adapter") << 100 << 0 << false << "FAIL KV705 ";
}

void TestSimulator::adapterSelfTest() {
    QFETCH(int, decayMs);
    QFETCH(int, deadAfter);
    QFETCH(bool, passes);
    QFETCH(QString, reportStart);
    SimOptions options = optionsFor("KV720-20");
    options.adapter = 1;
    options.adapterDecayMs = decayMs;
    options.faults.deadAfter = deadAfter;
    Bench bench(options);
    // The test measures time; a passing adapter gets three tries on a busy machine.
    AdapterTestOutcome outcome;
    for (int attempt = 0; attempt < (passes ? 3 : 1) && !outcome.passed; ++attempt) {
        outcome = TestAdapter(bench.port, AdapterTestMessage());
        QTest::qWait(decayMs + 50);  // let the tail of the last attempt die away
    }
    QCOMPARE(outcome.passed, passes);
    QVERIFY2(outcome.report.startsWith(reportStart), qPrintable(outcome.report));
    if (decayMs > 200)
        QVERIFY2(outcome.report.contains("> 200mS"), qPrintable(outcome.report));
}

void TestSimulator::garbageIsIgnoredAndCounted() {
    SimOptions options = optionsFor("KV720-20");
    options.module.serial = 9090;
    Bench bench(options);
    const int address = mapOf(bench.sim.module()).Serial_No;
    QByteArray badFrame = BuildFrame(readOf(address));
    badFrame[15] = char(badFrame[15] ^ 0x01);
    const QByteArray garbage = QByteArray("xyz") + badFrame;

    const int fd = ::open(bench.sim.slavePath().toLocal8Bit().constData(), O_RDWR | O_NOCTTY);
    QVERIFY(fd >= 0);
    const QByteArray sent = garbage + BuildFrame(readOf(address));
    QCOMPARE(::write(fd, sent.constData(), size_t(sent.size())), ssize_t(sent.size()));
    QByteArray received;
    char buffer[64];
    pollfd p{fd, POLLIN, 0};
    while (received.size() < FrameLength && poll(&p, 1, 2000) > 0) {
        const ssize_t n = ::read(fd, buffer, sizeof buffer);
        if (n <= 0)
            break;
        received.append(buffer, int(n));
    }
    // Nothing more may follow: the bad frame got no answer.
    QCOMPARE(poll(&p, 1, 100), 0);
    ::close(fd);

    QCOMPARE(received.size(), FrameLength);
    QCOMPARE(WireToLong(received.mid(4, 8)), 9090);
    QCOMPARE(bench.sim.ignoredBytes(), int(garbage.size()));
    QCOMPARE(bench.sim.frameCount(), 1);
    const std::vector<SimLogEntry> log = bench.sim.log();
    QCOMPARE(int(log.size()), 2);
    QCOMPARE(log[0].kind, SimLogEntry::Ignored);
    QCOMPARE(log[0].bytes, garbage);
}

void TestSimulator::logRecordsFrames() {
    Bench bench(optionsFor("KV716-22"));
    const int address = mapOf(bench.sim.module()).Usr_Out2_Z;
    QVERIFY(bench.transact(writeOf(address, 4321, 20)).ok);
    QVERIFY(bench.transact(readOf(address, 48)).ok);

    const std::vector<SimLogEntry> log = bench.sim.log();
    QCOMPARE(int(log.size()), 2);
    QCOMPARE(log[0].command, 'W');
    QCOMPARE(log[0].busId, 20);
    QCOMPARE(log[0].address, address);
    QCOMPARE(log[0].data, LongToWire(4321));
    QCOMPARE(log[1].command, 'R');
    QCOMPARE(log[1].busId, 48);
    QVERIFY(log[1].msec >= log[0].msec);
}

void TestSimulator::portLinkLifecycle() {
    Bench first(optionsFor("KV720-20"));
    const QString link = first.sim.portLinkPath();
    QCOMPARE(QFileInfo(link).symLinkTarget(), first.sim.slavePath());

    // A second simulator may not take a port that leads to a live device.
    Simulator second(optionsFor("KV714-22"));
    QString error;
    QVERIFY(second.start(error));
    QVERIFY(!second.publishAsPort(first.port, error));
    QVERIFY(error.contains(link));

    first.sim.stop();
    QVERIFY(!QFileInfo(link).isSymLink());
    // A link left dangling (a simulator that was killed) is taken over.
    QVERIFY(QFile::link(QStringLiteral("/nonexistent/pts/99"), link));
    QVERIFY2(second.publishAsPort(first.port, error), qPrintable(error));
    QCOMPARE(QFileInfo(link).symLinkTarget(), second.slavePath());
    QByteArray reply;
    bool portFault = false;
    QVERIFY(Transact(first.port, readOf(RegMap().Mod_Type), ConnectorPlain, false, reply, error,
                     portFault));
    QCOMPARE(WireToLong(reply.mid(3, 8)), 7);
}

QTEST_GUILESS_MAIN(TestSimulator)
#include "tst_simulator.moc"
