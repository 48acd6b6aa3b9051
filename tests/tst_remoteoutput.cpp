// Remote forcing of an output: the typed value checked against the output's
// range and converted to what the module's remote register takes.
#include "model/module_ranges.h"
#include "model/register_map.h"
#include "ui/live/remote_output.h"

#include <QtTest>

using namespace kv;

namespace {

void identify(int map) {
    SetRegMap(RegAdd, NoModuleMap);
    SetRegMap(RegAdd, map);
    ModuleMap = map;
    BuildRangeTables(RegAdd, map);
}

// A KV720 whose output is calibrated 4.00..20.00 mA on its 0..20 mA row.
void kv720() {
    identify(Kv720Map);
    RegVal.Out_Rng1 = 3;
    RegVal.COUT_Z = 1000;
    RegVal.COUT_F = 21000;
    RegVal.Usr_Out1_Z = 5000;
    RegVal.Usr_Out1_F = 21000;
}

// A first-version KV716: output 1 on 4..20 mA, output 2 on 0..10 V.
void kv716v1() {
    identify(Kv716v1Map);
    ProgramRangeTable(Output1)[3].countMin = 820;
    ProgramRangeTable(Output1)[3].countMax = 4100;
    ProgramRangeTable(Output2)[8].countMin = 100;
    ProgramRangeTable(Output2)[8].countMax = 4000;
    RegVal.Out_Rng1 = 3;
    RegVal.Out_Rng2 = 8;
}

RemoteRequest request(int channel, const QString& text) {
    return RemoteOutputRequest(LiveSource::Program(), channel, text);
}

}  // namespace

class TestRemoteOutput : public QObject {
    Q_OBJECT
private slots:
    void kv720Span_data();
    void kv720Span();
    void kv760HasNoOutputCalibrationOfItsOwn();
    void firstVersionCounts_data();
    void firstVersionCounts();
    void notNumeric_data();
    void notNumeric();
    void familiesWithoutRemote_data();
    void familiesWithoutRemote();
    void unusableOutputRange();
};

void TestRemoteOutput::kv720Span_data() {
    QTest::addColumn<QString>("text");
    QTest::addColumn<bool>("accepted");
    QTest::addColumn<int>("count");
    QTest::addColumn<QString>("refusal");
    QTest::newRow("12") << "12" << true << 5000 << "";
    QTest::newRow("4") << "4" << true << 0 << "";
    QTest::newRow("20") << "20" << true << 10000 << "";
    QTest::newRow("blanks around") << " 8 " << true << 2500 << "";
    QTest::newRow("a half rounds down to even") << "4.5" << true << 312 << "";  // 312.5
    QTest::newRow("a half rounds up to even") << "5.5" << true << 938 << "";    // 937.5
    QTest::newRow("3.99") << "3.99" << false << 0 << "Remote <4";
    QTest::newRow("20.01") << "20.01" << false << 0 << "Remote  >20";
}

void TestRemoteOutput::kv720Span() {
    QFETCH(QString, text);
    QFETCH(bool, accepted);
    QFETCH(int, count);
    QFETCH(QString, refusal);
    kv720();
    const RemoteRequest result = request(0, text);
    QCOMPARE(result.accepted, accepted);
    QCOMPARE(result.refusal, refusal);
    QVERIFY(!result.outputUnusable);
    if (accepted) {
        QCOMPARE(result.count, count);
        QCOMPARE(result.address, RegAdd.Remote1);
    }
}

void TestRemoteOutput::kv760HasNoOutputCalibrationOfItsOwn() {
    identify(Kv760Map);
    ProgramRangeTable(Output1)[4].countMin = 300;  // 0..1 V
    ProgramRangeTable(Output1)[4].countMax = 3300;
    RegVal.COUT_Z = 1;  // not a register of this family: must not be used
    RegVal.COUT_F = 2;
    RegVal.Out_Rng1 = 4;
    RegVal.Usr_Out1_Z = 600;   // 0.1 V
    RegVal.Usr_Out1_F = 3000;  // 0.9 V
    const RemoteRequest result = request(0, "0.3");
    QVERIFY(result.accepted);
    QCOMPARE(result.count, 2500);
    QCOMPARE(result.address, RegAdd.Remote1);
}

void TestRemoteOutput::firstVersionCounts_data() {
    QTest::addColumn<int>("channel");
    QTest::addColumn<QString>("text");
    QTest::addColumn<bool>("accepted");
    QTest::addColumn<int>("count");
    QTest::addColumn<QString>("refusal");
    QTest::newRow("CH0 12 mA") << 0 << "12" << true << 2460 << "";
    QTest::newRow("CH0 at range low") << 0 << "4" << true << 820 << "";
    QTest::newRow("CH0 at range high") << 0 << "20" << true << 4100 << "";
    QTest::newRow("CH0 below") << 0 << "3.9" << false << 0 << "Remote CH0 <4";
    QTest::newRow("CH0 above") << 0 << "20.5" << false << 0 << "Remote CH0 >20";
    QTest::newRow("CH1 2.5 V") << 1 << "2.5" << true << 1075 << "";
    QTest::newRow("CH1 below") << 1 << "-0.1" << false << 0 << "Remote CH1 <0";
    QTest::newRow("CH1 above") << 1 << "10.01" << false << 0 << "Remote CH1 >10";
}

void TestRemoteOutput::firstVersionCounts() {
    QFETCH(int, channel);
    QFETCH(QString, text);
    QFETCH(bool, accepted);
    QFETCH(int, count);
    QFETCH(QString, refusal);
    kv716v1();
    const RemoteRequest result = request(channel, text);
    QCOMPARE(result.accepted, accepted);
    QCOMPARE(result.refusal, refusal);
    if (accepted) {
        QCOMPARE(result.count, count);
        QCOMPARE(result.address, channel == 0 ? RegAdd.Remote1 : RegAdd.Remote2);
    }
}

void TestRemoteOutput::notNumeric_data() {
    QTest::addColumn<int>("channel");
    QTest::addColumn<QString>("text");
    QTest::addColumn<QString>("refusal");
    QTest::newRow("empty") << 0 << ""
                           << "Remote CH0 not Numeric !!";
    QTest::newRow("abc") << 0 << "abc"
                         << "Remote CH0 not Numeric !!";
    QTest::newRow("comma") << 1 << "12,5"
                           << "Remote CH1 not Numeric !!";
    QTest::newRow("beyond a single") << 0 << "1e39"
                                     << "Remote CH0 not Numeric !!";
}

void TestRemoteOutput::notNumeric() {
    QFETCH(int, channel);
    QFETCH(QString, text);
    QFETCH(QString, refusal);
    kv716v1();
    const RemoteRequest result = request(channel, text);
    QVERIFY(!result.accepted);
    QCOMPARE(result.refusal, refusal);
}

void TestRemoteOutput::familiesWithoutRemote_data() {
    QTest::addColumn<int>("map");
    QTest::newRow("KV714 v2") << int(Kv714v2Map);
    QTest::newRow("KV716 v2") << int(Kv716v2Map);
    QTest::newRow("KV718") << int(Kv718AMap);
    QTest::newRow("no module") << int(NoModuleMap);
}

void TestRemoteOutput::familiesWithoutRemote() {
    QFETCH(int, map);
    kv720();
    identify(map);
    RegVal.Out_Rng1 = 3;
    const RemoteRequest result = request(0, "12");
    QVERIFY(!result.accepted);
    QCOMPARE(result.refusal, QStringLiteral("Remote ? type"));
}

void TestRemoteOutput::unusableOutputRange() {
    kv720();
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

    kv720();
    RegVal.Usr_Out1_Z = 0;
    result = request(0, "12");
    QCOMPARE(result.refusal, QStringLiteral("Remote Out 1 Invalid User Cal"));
    QVERIFY(result.outputUnusable);
    QCOMPARE(result.outputSummary, QStringLiteral("3"));

    // A first-version output range that is no row of its table.
    kv716v1();
    RegVal.Out_Rng2 = 20;
    result = request(1, "5");
    QVERIFY(!result.accepted);
    QCOMPARE(result.refusal, QStringLiteral("Remote Invalid Output Range !!"));
}

QTEST_APPLESS_MAIN(TestRemoteOutput)
#include "tst_remoteoutput.moc"
