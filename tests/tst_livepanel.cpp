// The live panel on a module: a simulated KV720 connected through the engine,
// and the remote output controls.
#include "engine/diagnostics.h"
#include "engine/module_connection.h"
#include "model/register_map.h"
#include "sim/simulator.h"
#include "tests/support/live_modules.h"
#include "ui/live/live_panel.h"

#include <QLabel>
#include <QLineEdit>
#include <QPushButton>
#include <QTemporaryDir>
#include <QtTest>

#include <map>

using namespace kv;

namespace {
constexpr int Port = 7;
const QColor alarmRed(255, 0, 0);

// A simulated module on a private COM port, its registers preset before the
// program connects, and the live panel on the connection.
struct Bench {
    QTemporaryDir portDir;
    std::unique_ptr<sim::Simulator> sim;
    ModuleConnection connection;
    LivePanel panel{connection};

    explicit Bench(int typeCode, const std::map<int, qint32>& registers = {}) {
        qputenv("KV700_PORT_DIR", portDir.path().toLocal8Bit());
        sim::SimOptions options;
        options.module.typeCode = typeCode;
        options.module.subType = 1;
        options.module.serial = 200123;
        options.heldReading = 2500;
        sim = std::make_unique<sim::Simulator>(options);
        QString error;
        if (!sim->start(error) || !sim->publishAsPort(Port, error))
            qWarning() << "simulator:" << error;
        for (const auto& [address, value] : registers)
            sim->setRegisterValue(address, value);
        connection.engine().setPort(Port);
        connection.OpenCom(true, error);
    }

    template <typename Done>
    bool tickUntil(Done done, int ticks = 3000) {
        for (int i = 0; i < ticks && !done(); ++i)
            connection.tick();
        return done();
    }
    bool reachRunMode() {
        return tickUntil([this] { return StatusText() == QLatin1String("Run Mode"); });
    }
    // Polling paused and the engine idle, so a typed entry meets a free engine.
    bool idle() {
        connection.setPollingSuspended(true);
        return tickUntil([this] { return connection.engine().state() == StateRun; });
    }
    QString text(const char* name) const {
        auto* label = panel.findChild<QLabel*>(QLatin1String(name));
        return label ? label->text() : QStringLiteral("<no %1>").arg(QLatin1String(name));
    }
};

bool buttonRed(const LivePanel& panel, int channel) {
    return panel.remoteRefused(channel) &&
           panel.cmdRemote(channel)->palette().color(QPalette::Button) == alarmRed;
}
}  // namespace

class TestLivePanel : public QObject {
    Q_OBJECT
private slots:
    void simulatedKv720ShowsItsMovingInput();
    void remoteOutputIsWrittenAndProjected();
    void remoteRefusedWhileTheEngineIsNotRunning();
};

void TestLivePanel::simulatedKv720ShowsItsMovingInput() {
    Bench bench(4);  // KV720-20: 0..100 % in, 4..20 mA out
    QVERIFY(!bench.panel.view().active);
    QVERIFY(bench.reachRunMode());
    QVERIFY(bench.panel.view().active);
    QCOMPARE(bench.panel.view().identity.serial, QStringLiteral("200123"));
    QCOMPARE(bench.panel.view().identity.revision, QStringLiteral(" 2.003"));

    QVERIFY2(bench.tickUntil([&] { return bench.text("labInputValue") == "25.00 %   "; }),
             qPrintable(bench.text("labInputValue")));
    QCOMPARE(bench.text("labOutputValue0"), QStringLiteral("8.00 mA"));
    QCOMPARE(bench.panel.view().input.low, Lamp::Pulse);
    QVERIFY(!bench.panel.txtRemoteSet(0)->isVisibleTo(&bench.panel));

    QVERIFY(bench.text("labInputError").isEmpty());

    bench.sim->holdReading(10600);
    QVERIFY(bench.tickUntil([&] { return bench.text("labInputError") == "Input Hi"; }));
    QCOMPARE(bench.panel.view().input.high, Lamp::Alarm);
    QCOMPARE(bench.text("labOutputError0"), QStringLiteral("High Range Limit"));

    QString error;
    bench.connection.OpenCom(false, error);
    QVERIFY(!bench.panel.view().active);
    QCOMPARE(bench.panel.view().identity.serial, QStringLiteral("-"));
    QVERIFY(bench.text("labInputValue").isEmpty());
}

void TestLivePanel::remoteOutputIsWrittenAndProjected() {
    const RegMap kv720 = RegMapFor(Kv720Map);
    Bench bench(4, {{kv720.in_ch, 0x83}});  // output under remote control
    QVERIFY(bench.reachRunMode());
    QVERIFY(bench.tickUntil([&] { return bench.panel.view().outputs[0].remote; }));
    QVERIFY(bench.panel.txtRemoteSet(0)->isVisibleTo(&bench.panel));

    QVERIFY(bench.idle());
    bench.panel.txtRemoteSet(0)->setText("12");
    QVERIFY(!bench.panel.remoteRefused(0));
    QCOMPARE(bench.connection.engine().state(), StateDelayCB);
    // A second entry before the first has gone out finds the engine busy.
    bench.panel.txtRemoteSet(0)->setText("13");
    QCOMPARE(StatusText(), QStringLiteral("Remote Must be in run mode"));
    QVERIFY(buttonRed(bench.panel, 0));
    QCOMPARE(bench.panel.txtRemoteSet(0)->text(), QStringLiteral("13"));

    QVERIFY(bench.tickUntil([&] { return bench.connection.engine().state() == StateRun; }));
    QCOMPARE(RegVal.Remote1, 5000);
    QCOMPARE(bench.sim->registerValue(kv720.Remote1), 5000);

    bench.panel.txtRemoteSet(0)->setText("3.99");
    QCOMPARE(StatusText(), QStringLiteral("Remote <4"));
    QVERIFY(buttonRed(bench.panel, 0));

    bench.panel.txtRemoteSet(0)->setText("20");
    QVERIFY(!bench.panel.remoteRefused(0));
    QVERIFY(bench.panel.cmdRemote(0)->palette().color(QPalette::Button) != alarmRed);
    QVERIFY(bench.tickUntil([&] { return bench.connection.engine().state() == StateRun; }));
    QCOMPARE(RegVal.Remote1, 10000);

    // The projection follows the remote register, not the input.
    bench.connection.setPollingSuspended(false);
    QVERIFY2(bench.tickUntil([&] { return bench.text("labOutputValue0") == "20.00 mA"; }),
             qPrintable(bench.text("labOutputValue0")));
    QCOMPARE(bench.text("labInputValue"), QStringLiteral("25.00 %   "));
    QVERIFY(bench.text("labCusValOutput0").contains("Rem:4.00--20.00mA"));
}

void TestLivePanel::remoteRefusedWhileTheEngineIsNotRunning() {
    test::Kv720WithOutput();
    ModuleConnection connection;  // never connected
    LivePanel panel(connection);
    panel.txtRemoteSet(0)->setText("12");
    QCOMPARE(StatusText(), QStringLiteral("Remote Must be in run mode"));
    QVERIFY(buttonRed(panel, 0));

    RegVal.Out_Rng1 = 0;
    panel.cmdRemote(0)->click();
    QCOMPARE(StatusText(), QStringLiteral("Remote Invalid Output Range !!"));
    QCOMPARE(panel.view().outputs[0].value, QStringLiteral("?? "));
    QCOMPARE(panel.view().outputs[0].summary, QStringLiteral(" = ?? 0"));
    QCOMPARE(panel.findChild<QLabel*>("labOutputValue0")->text(), QStringLiteral("?? "));
}

QTEST_MAIN(TestLivePanel)
#include "tst_livepanel.moc"
