// Remote forcing of an output: the typed value checked against the output's
// range and converted to what the module's remote register takes.
#include "tests/support/live_modules.h"
#include "ui/live/remote_output.h"

#include <QtTest>

using namespace kv;
using namespace kv::test;

namespace {

RemoteRequest request(int channel, const QString& text) {
    return RemoteOutputRequest(LiveSource::Program(), channel, text);
}

}  // namespace

class TestRemoteOutput : public QObject {
    Q_OBJECT
private slots:
    void typedValue_data();
    void typedValue();
    void kv760HasNoOutputCalibrationOfItsOwn();
    void unusableOutputRange();
};

void TestRemoteOutput::typedValue_data() {
    QTest::addColumn<int>("map");
    QTest::addColumn<int>("channel");
    QTest::addColumn<QString>("text");
    QTest::addColumn<bool>("accepted");
    QTest::addColumn<int>("count");
    QTest::addColumn<QString>("refusal");
    const int kv720 = Kv720Map;
    const int kv716 = Kv716v1Map;
    // The KV720 takes 0.01 % of its 4..20 mA span.
    QTest::newRow("KV720 4") << kv720 << 0 << "4" << true << 0 << "";
    QTest::newRow("KV720 20") << kv720 << 0 << "20" << true << 10000 << "";
    QTest::newRow("KV720 blanks around") << kv720 << 0 << " 8 " << true << 2500 << "";
    QTest::newRow("KV720 a half rounds down to even")
        << kv720 << 0 << "4.5" << true << 312 << "";  // 312.5
    QTest::newRow("KV720 a half rounds up to even")
        << kv720 << 0 << "5.5" << true << 938 << "";  // 937.5
    QTest::newRow("KV720 3.99") << kv720 << 0 << "3.99" << false << 0 << "Remote <4";
    QTest::newRow("KV720 20.01") << kv720 << 0 << "20.01" << false << 0 << "Remote  >20";
    // The first-version KV716 takes output counts of the range row.
    QTest::newRow("CH0 at range low") << kv716 << 0 << "4" << true << 820 << "";
    QTest::newRow("CH0 at range high") << kv716 << 0 << "20" << true << 4100 << "";
    QTest::newRow("CH0 below") << kv716 << 0 << "3.9" << false << 0 << "Remote CH0 <4";
    QTest::newRow("CH0 above") << kv716 << 0 << "20.5" << false << 0 << "Remote CH0 >20";
    QTest::newRow("CH1 2.5 V") << kv716 << 1 << "2.5" << true << 1075 << "";
    QTest::newRow("CH1 below") << kv716 << 1 << "-0.1" << false << 0 << "Remote CH1 <0";
    QTest::newRow("empty") << kv716 << 0 << "" << false << 0 << "Remote CH0 not Numeric !!";
    QTest::newRow("comma") << kv716 << 1 << "12,5" << false << 0 << "Remote CH1 not Numeric !!";
    QTest::newRow("beyond a single")
        << kv716 << 0 << "1e39" << false << 0 << "Remote CH0 not Numeric !!";
    // Families without remote outputs.
    for (int map : {int(Kv714v2Map), int(Kv716v2Map), int(Kv718AMap), int(NoModuleMap)})
        QTest::addRow("map %d", map) << map << 0 << "12" << false << 0 << "Remote ? type";
}

void TestRemoteOutput::typedValue() {
    QFETCH(int, map);
    QFETCH(int, channel);
    QFETCH(QString, text);
    QFETCH(bool, accepted);
    QFETCH(int, count);
    QFETCH(QString, refusal);
    if (map == Kv720Map) {
        Kv720WithOutput();
    } else if (map == Kv716v1Map) {
        Kv716v1WithOutputs();
    } else {
        IdentifyLiveModule(map);
        RegVal.Out_Rng1 = 3;  // a usable range: only the family refuses
    }
    const RemoteRequest result = request(channel, text);
    QCOMPARE(result.accepted, accepted);
    QCOMPARE(result.refusal, refusal);
    QVERIFY(!result.outputUnusable);
    if (accepted) {
        QCOMPARE(result.count, count);
        QCOMPARE(result.address, channel == 0 ? RegAdd.Remote1 : RegAdd.Remote2);
    }
}

void TestRemoteOutput::kv760HasNoOutputCalibrationOfItsOwn() {
    IdentifyLiveModule(Kv760Map);
    CalibrateRow(Output1, 4, 300, 3300);  // 0..1 V
    RegVal.COUT_Z = 1;                    // not a register of this family: must not be used
    RegVal.COUT_F = 2;
    RegVal.Out_Rng1 = 4;
    RegVal.Usr_Out1_Z = 600;   // 0.1 V
    RegVal.Usr_Out1_F = 3000;  // 0.9 V
    const RemoteRequest result = request(0, "0.3");
    QVERIFY(result.accepted);
    QCOMPARE(result.count, 2500);
    QCOMPARE(result.address, RegAdd.Remote1);
}

void TestRemoteOutput::unusableOutputRange() {
    Kv720WithOutput();
    RegVal.Out_Rng1 = 15;
    RemoteRequest result = request(0, "12");
    QVERIFY(!result.accepted);
    QCOMPARE(result.refusal, QStringLiteral("Remote Invalid Output Range !!"));
    QVERIFY(result.outputUnusable);
    QCOMPARE(result.outputSummary, QStringLiteral(" = ?? F"));

    LiveView view;
    view.outputs[0].value = "12.00 mA";
    ShowRemoteRefusal(view, result);
    QCOMPARE(view.outputs[0].value, QStringLiteral("?? "));
    QCOMPARE(view.outputs[0].summary, QStringLiteral(" = ?? F"));

    Kv720WithOutput();
    RegVal.Usr_Out1_Z = 0;
    result = request(0, "12");
    QCOMPARE(result.refusal, QStringLiteral("Remote Out 1 Invalid User Cal"));
    QVERIFY(result.outputUnusable);
    QCOMPARE(result.outputSummary, QStringLiteral("3"));

    // A first-version output range that is no row of its table.
    Kv716v1WithOutputs();
    RegVal.Out_Rng2 = 20;
    result = request(1, "5");
    QVERIFY(!result.accepted);
    QCOMPARE(result.refusal, QStringLiteral("Remote Invalid Output Range !!"));
}

QTEST_APPLESS_MAIN(TestRemoteOutput)
#include "tst_remoteoutput.moc"
