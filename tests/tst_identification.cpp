// Connecting, identifying and watching a module, against the simulator.
#include "engine/diagnostics.h"
#include "engine/module_connection.h"
#include "model/module_ranges.h"
#include "model/module_types.h"
#include "model/register_map.h"
#include "sim/simulator.h"

#include <QSignalSpy>
#include <QTemporaryDir>
#include <QtTest>

using namespace kv;
using kv::sim::ModuleIdentity;
using kv::sim::Simulator;

namespace {
constexpr int Port = 6;

struct Bench {
    QTemporaryDir portDir;
    std::unique_ptr<Simulator> sim;
    ModuleConnection connection;

    explicit Bench(const ModuleIdentity& module) {
        qputenv("KV700_PORT_DIR", portDir.path().toLocal8Bit());
        sim::SimOptions options;
        options.module = module;
        sim = std::make_unique<Simulator>(options);
        QString error;
        if (!sim->start(error) || !sim->publishAsPort(Port, error))
            qWarning() << "simulator:" << error;
        connection.engine().setPort(Port);
        QString ignored;
        connection.OpenCom(true, ignored);
    }

    // Ticks until `done` holds or the tick budget runs out.
    template <typename Done>
    bool tickUntil(Done done, int ticks = 2000) {
        for (int i = 0; i < ticks && !done(); ++i)
            connection.tick();
        return done();
    }
    bool reachRunMode() {
        return tickUntil([this] { return StatusText() == QLatin1String("Run Mode"); });
    }
    bool sentWithBusId(int busId) const {
        for (const sim::SimLogEntry& entry : sim->log())
            if (entry.kind == sim::SimLogEntry::Request && entry.busId == busId)
                return true;
        return false;
    }
};

ModuleIdentity identity(int typeCode, int subType, qint32 serial = 200123) {
    ModuleIdentity id;
    id.typeCode = typeCode;
    id.subType = subType;
    id.serial = serial;
    return id;
}
}  // namespace

class TestIdentification : public QObject {
    Q_OBJECT
private slots:
    void identifiesEveryFamily_data();
    void identifiesEveryFamily();
    void swappedModuleIsIdentifiedAgain();
    void unknownTypeStopsIdentification();
    void noDefStopsPolling();
    void remoteReadBackIsNoFailure();
    void missingPortDisconnects();
};

void TestIdentification::identifiesEveryFamily_data() {
    QTest::addColumn<int>("typeCode");
    QTest::addColumn<int>("subType");
    QTest::addColumn<int>("map");
    QTest::addColumn<QString>("model");
    QTest::newRow("KV714-20") << 1 << 0 << 1 << "KV714-20";
    QTest::newRow("KV716-20") << 3 << 0 << 2 << "KV716-20";
    QTest::newRow("KV720-20") << 4 << 1 << 3 << "KV720-20";
    QTest::newRow("KV714-22") << 7 << 0 << 4 << "KV714-22";
    QTest::newRow("KV716-22") << 8 << 0 << 5 << "KV716-22";
    QTest::newRow("KV760-20") << 9 << 0 << 6 << "KV760-20";
    QTest::newRow("KV718-1A") << 10 << 3 << 7 << "KV718-1A";
}

void TestIdentification::identifiesEveryFamily() {
    QFETCH(int, typeCode);
    QFETCH(int, subType);
    QFETCH(int, map);
    QFETCH(QString, model);
    Bench bench(identity(typeCode, subType));
    QSignalSpy runMode(&bench.connection, &ModuleConnection::runMode);
    QVERIFY(bench.reachRunMode());
    QCOMPARE(runMode.count(), 1);
    QCOMPARE(ModuleMap, map);
    QCOMPARE(RegVal.Mod_Type, typeCode);
    QCOMPARE(RegVal.Serial_No, 200123);
    QCOMPARE(ModelText(RegVal.Mod_Type, RegVal.TypInput), model);  // the sub-type was read too
    QCOMPARE(bench.connection.engine().state(), qint32(StateRun));

    // The range tables carry the module's own counts, read from its range registers.
    // The KV720 reads no calibration values; every other family does.
    QCOMPARE(bench.sentWithBusId(PhaseCalibration), map != 3);
    if (map == 3)
        return;
    bool rangeSeen = false;
    for (int reg = RegAdd.Rng_First; reg <= RegAdd.Rng_Last; ++reg) {
        const RangeRegister info = GetRangeInfo(reg, map);
        if (info.channel == 0)
            continue;
        const RangeDescriptor& entry = ProgramRangeTable(info.channel)[info.range];
        QCOMPARE(info.oddHalf ? entry.countMax : entry.countMin, bench.sim->registerValue(reg));
        rangeSeen = true;
    }
    QVERIFY(rangeSeen);
}

void TestIdentification::swappedModuleIsIdentifiedAgain() {
    Bench bench(identity(4, 1, 300001));
    QVERIFY(bench.reachRunMode());
    QCOMPARE(ModuleMap, 3);
    QSignalSpy swapped(&bench.connection, &ModuleConnection::moduleControlsChanged);
    bench.sim->swapModule(identity(9, 0, 300002));
    // Within one polling cycle the change is noticed and the new module identified.
    QVERIFY(bench.tickUntil([&] { return ModuleMap == 6 && StatusText() == "Run Mode"; }));
    QVERIFY(swapped.count() >= 1);
    QCOMPARE(RegVal.Serial_No, 300002);
}

void TestIdentification::unknownTypeStopsIdentification() {
    Bench bench(identity(42, 0));
    QVERIFY(
        bench.tickUntil([&] { return bench.connection.engine().state() == StateUnknownModule; }));
    QCOMPARE(StatusText(), QString("Debug module"));
    QCOMPARE(ModuleMap, int(UnknownModuleMap));
    const int frames = bench.sim->frameCount();
    for (int i = 0; i < 50; ++i)
        bench.connection.tick();
    QCOMPARE(bench.sim->frameCount(), frames);  // nothing more is sent
}

void TestIdentification::noDefStopsPolling() {
    Bench bench(identity(4, 1));
    QVERIFY(bench.reachRunMode());
    int frames = bench.sim->frameCount();
    for (int i = 0; i < 100; ++i)
        bench.connection.tick();
    QVERIFY(bench.sim->frameCount() > frames);  // polling runs
    bench.connection.setPollingSuspended(true);
    bench.connection.tick();  // a poll already queued still completes
    frames = bench.sim->frameCount();
    for (int i = 0; i < 200; ++i)
        bench.connection.tick();
    QCOMPARE(bench.sim->frameCount(), frames);
}

void TestIdentification::remoteReadBackIsNoFailure() {
    Bench bench(identity(4, 1));
    QVERIFY(bench.reachRunMode());
    bench.connection.setPollingSuspended(true);
    bench.connection.tick();
    QString error;
    QVERIFY(bench.connection.engine().W_DelayCB(RegAdd.Remote1, 5000, ValueLong, "hub", CallbackHub,
                                                error));
    QVERIFY(bench.tickUntil([&] { return bench.connection.engine().state() == StateRun; }));
    QCOMPARE(RegVal.Remote1, 5000);
    QVERIFY2(!StatusText().startsWith("Hub.cbGet"), qPrintable(StatusText()));
}

void TestIdentification::missingPortDisconnects() {
    QTemporaryDir empty;
    qputenv("KV700_PORT_DIR", empty.path().toLocal8Bit());
    ModuleConnection connection;
    connection.engine().setPort(Port);
    QString error;
    QVERIFY(connection.OpenCom(true, error));
    for (int i = 0; i < 5 && connection.engine().connected(); ++i)
        connection.tick();
    QVERIFY(!connection.engine().connected());
    QCOMPARE(connection.engine().state(), qint32(StateClosed));
    QVERIFY2(StatusText().startsWith("Communicate:%"), qPrintable(StatusText()));
}

QTEST_GUILESS_MAIN(TestIdentification)
#include "tst_identification.moc"
