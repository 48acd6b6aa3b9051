#include "engine/diagnostics.h"
#include "model/module_ranges.h"
#include "model/module_types.h"
#include "model/register_map.h"
#include "tests/support/diagnostic_capture.h"

#include <QtTest>

using namespace kv;

namespace {

struct LayoutFormula {
    QList<int> maps;
    int channel;
    int firstReg;
    int lastReg;
    int (*range)(int reg);
};

// The documented numbering of the range registers, stated independently of the data table.
const LayoutFormula layoutFormulas[] = {
    {{1, 4}, Input1, 16, 45, [](int r) { return r / 2 - 7; }},
    {{7}, Input1, 26, 45, [](int r) { return r / 2 - 7; }},
    {{1, 4, 7}, Output1, 46, 67, [](int r) { return r / 2 - 22; }},
    {{2, 5}, Input1, 16, 21, [](int r) { return r / 2 - 7; }},
    {{2, 5}, Input1, 22, 35, [](int r) { return r / 2 - 6; }},
    {{2, 5}, Output1, 36, 55, [](int r) { return r / 2 - 17; }},
    {{2, 5}, Output2, 56, 75, [](int r) { return r / 2 - 27; }},
    {{3}, Input1, 72, 79, [](int r) { return r - 71; }},
    {{3}, Output1, 80, 87, [](int r) { return r - 79; }},
    {{6}, Output1, 20, 35, [](int r) { return r / 2 - 9; }},
};
}  // namespace

class TestModuleTypes : public QObject {
    Q_OBJECT
private slots:
    void init();

    void modelTexts_data();
    void modelTexts();
    void displayUsesReadSubType();
    void unknownTypeMarksModuleUnknown();
    void checkModType_data();
    void checkModType();

    void rangeRegisters_data();
    void rangeRegisters();
    void spansFollowTheDocumentedNumbering();
    void programTablesOfMap2();
    void outputEntriesInEveryMap();
    void map7OffersOnlyItsSpan();
    void rebuildForgetsOldModule();
    void rangeTableForSettingsLists();

private:
    DiagnosticCapture sink;
};

void TestModuleTypes::init() {
    sink.entries.clear();
    RegVal = RegMap();
    ModuleMap = NoModuleMap;
}

void TestModuleTypes::modelTexts_data() {
    QTest::addColumn<int>("code");
    QTest::addColumn<int>("subType");
    QTest::addColumn<QString>("text");
    QTest::newRow("1") << 1 << 7 << "KV714-20";
    QTest::newRow("3") << 3 << 0 << "KV716-20";
    QTest::newRow("5") << 5 << 0 << "KV720-10";
    QTest::newRow("6") << 6 << 0 << "KV716-10";
    QTest::newRow("7/-1") << 7 << -1 << "KV714_KV718";
    QTest::newRow("7/3") << 7 << 3 << "KV718-10";
    QTest::newRow("7/5") << 7 << 5 << "KV714/8-5";
    QTest::newRow("8/1") << 8 << 1 << "KV716-23";
    QTest::newRow("8/-1") << 8 << -1 << "KV716-v2--1";
    QTest::newRow("9/0") << 9 << 0 << "KV760-20";
    QTest::newRow("9/2") << 9 << 2 << "KV760v1-2";
    QTest::newRow("10/1") << 10 << 1 << "KV718-2A";
    QTest::newRow("10/2") << 10 << 2 << "KV718-?\?-2";
    QTest::newRow("10/3") << 10 << 3 << "KV718-1A";
    QTest::newRow("0") << 0 << 0 << "KV ?";
    QTest::newRow("11") << 11 << 0 << "KV ?";
}

void TestModuleTypes::modelTexts() {
    QFETCH(int, code);
    QFETCH(int, subType);
    QFETCH(QString, text);
    QCOMPARE(ModelText(code, qint16(subType)), text);
}

void TestModuleTypes::displayUsesReadSubType() {
    RegVal.TypInput = 5;
    ModuleMap = 4;
    QCOMPARE(DisplayModuleType(7), QString("KV714/8-5"));
    QCOMPARE(ModuleMap, 4);
    QVERIFY(sink.entries.isEmpty());
}

void TestModuleTypes::unknownTypeMarksModuleUnknown() {
    ModuleMap = 3;
    QCOMPARE(DisplayModuleType(42), QString("KV ?"));
    QCOMPARE(ModuleMap, int(UnknownModuleMap));
    QCOMPARE(sink.entries, QStringList{"DisplayModuleType:?"});
}

void TestModuleTypes::checkModType_data() {
    QTest::addColumn<int>("code");
    QTest::addColumn<int>("subType");
    QTest::addColumn<int>("family");
    QTest::addColumn<bool>("ok");
    QTest::addColumn<QString>("message");
    QTest::newRow("KV718-10 passes as KV714 v2") << 7 << 3 << 4 << true << "";
    QTest::newRow("KV718-1A") << 10 << 3 << 7 << true << "";
    QTest::newRow("KV716-10 is a KV716") << 6 << 0 << 2 << true << "";
    QTest::newRow("KV718-1A not v2") << 10 << 3 << 4 << false << "KV718-1A is not KV714 v2!";
    QTest::newRow("KV714 not KV716") << 1 << 0 << 2 << false << "KV714-20 is not KV716!";
    QTest::newRow("KV720 not KV760") << 4 << 0 << 6 << false << "KV720-20 is not KV760 v1!";
    QTest::newRow("unknown not KV720") << 0 << 0 << 3 << false << "KV ? is not KV720!";
    QTest::newRow("KV760 not KV718-xA") << 9 << 1 << 7 << false << "KV760-10 is not KV718-xA!";
    QTest::newRow("KV716 v2 not v1") << 8 << 0 << 2 << false << "KV716-22 is not KV716!";
    QTest::newRow("family 0") << 1 << 0 << 0 << false << "CheckModType: ? !";
    QTest::newRow("family 8") << 10 << 0 << 8 << false << "CheckModType: ? !";
}

void TestModuleTypes::checkModType() {
    QFETCH(int, code);
    QFETCH(int, subType);
    QFETCH(int, family);
    QFETCH(bool, ok);
    QFETCH(QString, message);
    RegVal.TypInput = qint16(subType);
    ModuleMap = 5;
    QString text;
    QCOMPARE(CheckModType(code, family, text), ok);
    QCOMPARE(text, message);
    QCOMPARE(ModuleMap, 5);  // a check never changes the identified module
}

void TestModuleTypes::rangeRegisters_data() {
    QTest::addColumn<int>("map");
    QTest::addColumn<int>("reg");
    QTest::addColumn<int>("channel");
    QTest::addColumn<int>("range");
    QTest::addColumn<bool>("odd");
    QTest::addColumn<QString>("description");
    QTest::newRow("1 first") << 1 << 16 << 1 << 1 << false << "0--1mA";
    QTest::newRow("1 odd half") << 1 << 23 << 1 << 4 << true << "4--20mA";
    QTest::newRow("4 last input") << 4 << 44 << 1 << 15 << false << "0--200V";
    QTest::newRow("7 output") << 7 << 60 << 2 << 8 << false << "1--5V";
    QTest::newRow("2 skips range 4") << 2 << 22 << 1 << 5 << false << "0--1V";
    QTest::newRow("5 output 2 last") << 5 << 75 << 4 << 10 << true << "0--20V";
    QTest::newRow("3 no pairs") << 3 << 75 << 1 << 4 << false << "0--20mV";
    QTest::newRow("3 output") << 3 << 83 << 2 << 4 << false << "0--1V";
    QTest::newRow("6 output") << 6 << 21 << 2 << 1 << true << "0--1mA";
    QTest::newRow("3 beyond") << 3 << 88 << 0 << 0 << false << "No Function";
    QTest::newRow("6 input registers absent") << 6 << 16 << 0 << 0 << false << "No Function";
    QTest::newRow("map 0") << 0 << 16 << 0 << 0 << false << "No Function";
}

void TestModuleTypes::rangeRegisters() {
    QFETCH(int, map);
    QFETCH(int, reg);
    QFETCH(int, channel);
    QFETCH(int, range);
    QFETCH(bool, odd);
    QFETCH(QString, description);
    const RangeRegister info = GetRangeInfo(reg, map);
    QCOMPARE(info.channel, channel);
    QCOMPARE(info.range, range);
    QCOMPARE(info.oddHalf, odd);
    QCOMPARE(info.descriptor.description, description);
}

void TestModuleTypes::spansFollowTheDocumentedNumbering() {
    for (int map = 1; map <= MapCount; ++map) {
        const RegMap addresses = RegMapFor(map);
        for (int reg = addresses.Rng_First; reg <= addresses.Rng_Last; ++reg) {
            const LayoutFormula* formula = nullptr;
            for (const LayoutFormula& f : layoutFormulas)
                if (f.maps.contains(map) && reg >= f.firstReg && reg <= f.lastReg)
                    formula = &f;
            const QByteArray where = QStringLiteral("map %1 reg %2").arg(map).arg(reg).toLatin1();
            QVERIFY2(formula, where);  // the span holds range registers only
            const RangeRegister info = GetRangeInfo(reg, map);
            QVERIFY2(info.channel == formula->channel, where);
            QVERIFY2(info.range == formula->range(reg), where);
            QVERIFY2(info.oddHalf == (map != 3 && reg % 2 == 1), where);
        }
        // Nothing in the span's neighbourhood is a range register.
        QCOMPARE(GetRangeInfo(addresses.Rng_Last + 1, map).channel, 0);
    }
}

void TestModuleTypes::programTablesOfMap2() {
    BuildRangeTables(RegMapFor(2), 2);
    const RangeTable& input1 = ProgramRangeTable(Input1);
    QCOMPARE(input1[3].description, QString("4--20mA"));
    QCOMPARE(input1[4].description, QString("4--20mA LP"));
    QCOMPARE(input1[4].unit, QString("mA LP"));
    QCOMPARE(input1[4].minimum, 4.0f);
    QCOMPARE(input1[11].description, QString("0--20V"));
    QCOMPARE(input1[12].description, QString("0--20??"));  // described but never filled
    QCOMPARE(input1[0].unit, QString("Cal Mode"));
    QCOMPARE(input1[0].description, QString("Cal Mode"));
    QCOMPARE(input1[16].description, QString("Custom"));
    QCOMPARE(ProgramRangeTable(Input2)[4].description, QString("0--20??"));
    QCOMPARE(ProgramRangeTable(Input2)[16].unit, QString("Custom"));
    QCOMPARE(ProgramRangeTable(Output2)[10].description, QString("0--20V"));
    QCOMPARE(ProgramRangeTable(Output2)[11].description, QString("0--20??"));
    QCOMPARE(ProgramRangeTable(Output1)[12].description, QString("No Function"));
}

void TestModuleTypes::outputEntriesInEveryMap() {
    for (int map = 1; map <= MapCount; ++map) {
        BuildRangeTables(RegMapFor(map), map);
        for (int channel : {Output1, Output2}) {
            const RangeTable& table = ProgramRangeTable(channel);
            QCOMPARE(table[0].description, QString("Cal Mode"));
            QCOMPARE(table[13].description, QString("Remote Control"));
            QCOMPARE(table[16].description, QString("Custom"));
            for (int entry : {12, 14, 15})
                QCOMPARE(table[entry].description, QString("No Function"));
        }
        if (map != 2 && map != 5)
            QCOMPARE(ProgramRangeTable(Input1)[4].unit.endsWith(" LP"), false);
    }
}

void TestModuleTypes::map7OffersOnlyItsSpan() {
    BuildRangeTables(RegMapFor(7), 7);
    const RangeTable& input1 = ProgramRangeTable(Input1);
    QCOMPARE(input1[5].description, QString("0--20??"));
    QCOMPARE(input1[6].description, QString("0--1V"));
    QCOMPARE(input1[15].description, QString("0--200V"));
    BuildRangeTables(RegMapFor(3), 3);
    QCOMPARE(ProgramRangeTable(Input1)[8].description, QString("0--500mV"));
    QCOMPARE(ProgramRangeTable(Output1)[8].description, QString("0--20V"));
}

void TestModuleTypes::rebuildForgetsOldModule() {
    BuildRangeTables(RegMapFor(1), 1);
    ProgramRangeTable(Input1)[4].countMin = 1234;
    ProgramRangeTable(Input1)[4].countMax = 9876;
    BuildRangeTables(RegMapFor(6), 6);
    QCOMPARE(ProgramRangeTable(Input1)[4].countMin, 0);
    QCOMPARE(ProgramRangeTable(Input1)[4].countMax, 0);
    QCOMPARE(ProgramRangeTable(Input1)[4].description,
             QString("0--20??"));  // KV760: no input ranges
    QCOMPARE(ProgramRangeTable(Output1)[8].description, QString("0--20V"));
}

void TestModuleTypes::rangeTableForSettingsLists() {
    BuildRangeTables(RegMapFor(3), 3);  // another module on the adapter
    RangeTable table;
    QVERIFY(GetRangeTable(2, Input1, table));
    QCOMPARE(table[4].description, QString("4--20mA LP"));
    QCOMPARE(table[0].description, QString("No Function"));
    QCOMPARE(table[16].description, QString("No Function"));
    QCOMPARE(table[12].unit, QString("??"));

    QVERIFY(GetRangeTable(7, Input1, table));
    QCOMPARE(table[1].description, QString("0--1mA"));  // scanned whatever the span

    QVERIFY(GetRangeTable(2, Output2, table));
    QCOMPARE(table[10].description, QString("0--20V"));
    QCOMPARE(table[13].description, QString("0--20??"));
    QCOMPARE(table[4].unit, QString("V"));
}

QTEST_APPLESS_MAIN(TestModuleTypes)
#include "tst_moduletypes.moc"
