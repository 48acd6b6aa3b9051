#include "engine/diagnostics.h"
#include "model/module_ranges.h"
#include "model/register_map.h"
#include "model/register_text.h"
#include "tests/support/diagnostic_capture.h"

#include <QtTest>

using namespace kv;

namespace {

// The program's state right after a module of the given type has been identified.
void identify(int map, qint32 typeCode) {
    RegVal = RegMap();
    SetRegMap(RegAdd, map);
    ModuleMap = map;
    BuildRangeTables(RegAdd, map);
    RegVal.Mod_Type = typeCode;
}
}  // namespace

class TestRegText : public QObject {
    Q_OBJECT
private slots:
    void init();

    void descriptions_data();
    void descriptions();
    void undefinedAddressInEveryMap();
    void unknownAddressIsLogged();
    void pulseRegistersNamedOnlyForPulseModules();
    void rangeDescriptionOutsideSpan();
    void everyRegisterDescribesByItsRow();

    void valueTexts_data();
    void valueTexts();

private:
    DiagnosticCapture sink;
};

void TestRegText::init() {
    sink.entries.clear();
}

void TestRegText::descriptions_data() {
    QTest::addColumn<int>("map");
    QTest::addColumn<int>("address");
    QTest::addColumn<int>("id");
    QTest::addColumn<QString>("text");
    QTest::newRow("3: name inside the range span") << 3 << 74 << 16 << "Gain Factor";
    QTest::newRow("3: range beside it") << 3 << 75 << 16 << "Input 1: 0--20mV";
    QTest::newRow("3: Orig_OS_PWM is also Highest") << 3 << 78 << 16 << "Original OS_PWM Value";
    QTest::newRow("3: CIN_Z is also Lowest") << 3 << 16 << 16 << "CIN_Z Cal  IN ZS";
    QTest::newRow("3: output range") << 3 << 87 << 16 << "Output 1: 0--20V";
    QTest::newRow("3: table 1 first part") << 3 << 49 << 16 << "Table 1 -1";
    QTest::newRow("3: table C last part") << 3 << 36 << 67 << "Table C -52";
    QTest::newRow("3: file name") << 3 << 35 << 20 << "File Name -20";
    QTest::newRow("3: calibration errors") << 3 << 55 << 24 << "Calibration Errors";
    QTest::newRow("3: 16-bit member") << 3 << 31 << 16 << "in_res  Input impeadence";
    QTest::newRow("1: name wins over Lowest") << 1 << 68 << 16 << "Internal reference";
    QTest::newRow("1: odd half of a pair") << 1 << 23 << 16 << "Input 1: 4--20mA";
    QTest::newRow("1: Mod_Type") << 1 << 255 << 16 << "Module Type";
    QTest::newRow("4: Mod_Type") << 4 << 127 << 16 << "Module Type";
    QTest::newRow("4: Com_Power") << 4 << 126 << 16 << "Communication Power";
    QTest::newRow("2: loop powered range") << 2 << 20 << 16 << "Input 1: 4--20mA";
    QTest::newRow("5: output 2") << 5 << 56 << 16 << "Output 2: 0--10mA";
    QTest::newRow("6: floating member") << 6 << 47 << 16 << "C Measure Unit Z 1";
    QTest::newRow("7: last input range") << 7 << 45 << 16 << "Input 1: 0--200V";
}

void TestRegText::descriptions() {
    QFETCH(int, map);
    QFETCH(int, address);
    QFETCH(int, id);
    QFETCH(QString, text);
    identify(map, 0);
    QCOMPARE(GetRegDescription(address, id), text);
    QCOMPARE(sink.entries, QStringList());
}

void TestRegText::undefinedAddressInEveryMap() {
    for (int map = 0; map <= MapCount; ++map) {
        identify(map, 0);
        QCOMPARE(GetRegDescription(-1, 16), QString("Address Not Defined"));
    }
}

void TestRegText::unknownAddressIsLogged() {
    identify(1, 1);
    QCOMPARE(GetRegDescription(200, 16), QString("Address200"));
    QCOMPARE(sink.entries, QStringList{"GetRegDescription: Address200"});
    identify(0, 0);
    sink.entries.clear();
    QCOMPARE(GetRegDescription(16, 16), QString("Address16"));  // no module: no range span
    QCOMPARE(sink.entries, QStringList{"GetRegDescription: Address16"});
}

void TestRegText::pulseRegistersNamedOnlyForPulseModules() {
    identify(6, 9);
    QCOMPARE(GetRegDescription(71, 16), QString("Input frequency"));
    QCOMPARE(GetRegDescription(74, 16), QString("Pulse vally before correction"));
    RegVal.Mod_Type = 4;
    QCOMPARE(GetRegDescription(71, 16), QString("Address71"));
    QCOMPARE(GetRegDescription(77, 16), QString("Internal temperature"));
}

void TestRegText::rangeDescriptionOutsideSpan() {
    identify(3, 4);
    QCOMPARE(GetRangeDescription(80), QString("Output 1: 0--1mA"));
    QVERIFY(sink.entries.isEmpty());
    QCOMPARE(GetRangeDescription(71), QString("Unknown Range at 71"));
    QCOMPARE(sink.entries, QStringList{"GetRangeDescription: Address71"});
    sink.entries.clear();
    ModuleMap = 6;  // the addresses of map 3 read with the range layout of map 6
    QCOMPARE(GetRangeDescription(80), QString("Unknown Range at 80"));
    QVERIFY(sink.entries.isEmpty());
}

void TestRegText::everyRegisterDescribesByItsRow() {
    // Guards the lookup order: no register is shadowed by another name or a range.
    for (int map = 1; map <= MapCount; ++map) {
        identify(map, map == 6 ? 9 : 1);
        for (const RegisterRow& row : AllRegisters()) {
            const int address = row.addressIn(map);
            if (!row.isRegister() || address < 0)
                continue;
            QString expected = row.description;
            if (row.role == RegRole::TablePart)
                expected += "5";
            if (row.role == RegRole::FileNamePart)
                expected += "20";
            QCOMPARE(GetRegDescription(address, 20), expected);
        }
    }
    QVERIFY(sink.entries.isEmpty());
}

void TestRegText::valueTexts_data() {
    QTest::addColumn<int>("map");
    QTest::addColumn<int>("address");
    QTest::addColumn<QString>("text");
    QTest::addColumn<bool>("writable");
    QTest::addColumn<int>("kind");
    QTest::newRow("serial number") << 3 << 50 << "31420" << true << 1;
    QTest::newRow("floating") << 3 << 51 << "2.5" << true << 2;
    QTest::newRow("floating 0.1") << 3 << 52 << "0.1" << true << 2;
    QTest::newRow("16 bit") << 3 << 33 << "-3" << true << 1;
    QTest::newRow("read only reference") << 3 << 69 << "-1" << false << 1;
    QTest::newRow("switch read only") << 2 << 97 << "-1" << false << 1;
    QTest::newRow("module type") << 3 << 255 << "4" << false << 1;
    QTest::newRow("table shows its last ID") << 3 << 49 << "116" << true << 1;
    QTest::newRow("Input_B4_Table hidden") << 3 << 23 << "23??" << false << 1;
    QTest::newRow("Cal_Errors hidden") << 3 << 55 << "55??" << false << 1;
    QTest::newRow("range register") << 3 << 75 << "75??" << false << 1;
    QTest::newRow("register wins over Lowest") << 1 << 68 << "-1" << false << 1;
    QTest::newRow("no member") << 1 << 200 << "200??" << false << 1;
}

void TestRegText::valueTexts() {
    QFETCH(int, map);
    QFETCH(int, address);
    QFETCH(QString, text);
    QFETCH(bool, writable);
    QFETCH(int, kind);
    identify(map, 4);
    RegVal.Serial_No = 31420;
    RegVal.Eng_In_Z = 2.5f;
    RegVal.Eng_In_F = 0.1f;
    RegVal.Flag_A = -3;
    RegVal.Table1 = 116;
    const RegisterValueText value = RegValueText(address);
    QCOMPARE(value.text, text);
    QCOMPARE(value.writable, writable);
    QCOMPARE(value.kind, kind);
}

QTEST_APPLESS_MAIN(TestRegText)
#include "tst_regtext.moc"
