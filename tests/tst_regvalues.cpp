#include "engine/diagnostics.h"
#include "model/codec.h"
#include "model/register_map.h"
#include "model/register_values.h"
#include "tests/support/diagnostic_capture.h"

#include <QtTest>

using namespace kv;

class TestRegValues : public QObject {
    Q_OBJECT
private slots:
    void init();
    void cleanup();

    void ordinaryMembers();
    void statusOtherThanZeroStoresNothing();
    void malformedDataStoresNothing();
    void inputReadingIsSixteenBits();
    void overflowLeavesMemberUnchanged();
    void tableParts_data();
    void tableParts();
    void tablePartIdsOutsideTheTable_data();
    void tablePartIdsOutsideTheTable();
    void fileNameParts();
    void fileNameWrongId();
    void calibrationErrorBytes();
    void unknownAddressKeepsRawData();
    void subTypeRefreshesCaption();
    void engineeringUnitText();

private:
    DiagnosticCapture sink;
};

void TestRegValues::init() {
    sink.entries.clear();
    SetRegMap(RegAdd, 0);
    SetRegMap(RegAdd, 3);
}

void TestRegValues::cleanup() {
    SetModuleCaptionHandler(nullptr);
}

void TestRegValues::ordinaryMembers() {
    QVERIFY(!UpdateRegValue(RegAdd.Serial_No, "00007:;<", 16, 0));
    QCOMPARE(RegVal.Serial_No, 31420);
    QVERIFY(!UpdateRegValue(RegAdd.Usr_Out1_Z, "0000????", 16, 0));
    QCOMPARE(RegVal.Usr_Out1_Z, 65535);
    QVERIFY(!UpdateRegValue(qRound(RegAdd.Eng_In_Z), "<0200000", 16, 0));
    QCOMPARE(RegVal.Eng_In_Z, -2.5f);
    QVERIFY(!UpdateRegValue(RegAdd.Flag_A, "????????", 16, 0));
    QCOMPARE(RegVal.Flag_A, qint16(-1));
    QVERIFY(!UpdateRegValue(RegAdd.in_ch, "00000102", 16, 0));
    QCOMPARE(RegVal.in_ch, qint16(0x102));
    QVERIFY(!UpdateRegValue(RegAdd.Mod_Type, "00000004", 16, 0));
    QCOMPARE(RegVal.Mod_Type, 4);
    QVERIFY(sink.entries.isEmpty());
}

void TestRegValues::statusOtherThanZeroStoresNothing() {
    QVERIFY(UpdateRegValue(RegAdd.Serial_No, "00000001", 16, 1));
    QCOMPARE(RegVal.Serial_No, -1);
}

void TestRegValues::malformedDataStoresNothing() {
    QVERIFY(UpdateRegValue(RegAdd.Table1, "0001", 16, 0));
    QCOMPARE(RegVal.Table1, -1);
    QCOMPARE(RegVal.Table1_Pts[0], -1);
    QCOMPARE(sink.entries.size(), 1);
}

void TestRegValues::inputReadingIsSixteenBits() {
    QVERIFY(!UpdateRegValue(RegAdd.Input_Reading, LongToWire(-13108), 16, 0));
    QCOMPARE(RegVal.Input_Reading, -13108);
    QVERIFY(!UpdateRegValue(RegAdd.Input_Reading, "00002904", 16, 0));
    QCOMPARE(RegVal.Input_Reading, 10500);
}

void TestRegValues::overflowLeavesMemberUnchanged() {
    UpdateRegValue(RegAdd.Input_Reading, "00000010", 16, 0);
    QVERIFY(UpdateRegValue(RegAdd.Input_Reading, "0000????", 16, 0));
    QCOMPARE(RegVal.Input_Reading, 16);
    UpdateRegValue(RegAdd.TypInput, "00000002", 16, 0);
    QVERIFY(UpdateRegValue(RegAdd.TypInput, "00010000", 16, 0));
    QCOMPARE(RegVal.TypInput, qint16(2));
    QCOMPARE(sink.entries.size(), 2);
    QVERIFY(sink.entries.at(0).startsWith("UpdateRegValue:"));
}

void TestRegValues::tableParts_data() {
    QTest::addColumn<bool>("tableC");
    QTest::addColumn<int>("id");
    QTest::addColumn<int>("firstPoint");
    QTest::newRow("table 1 first part") << false << 16 << 0;
    QTest::newRow("table 1 checksum part") << false << 116 << 100;
    QTest::newRow("table 1 odd id") << false << 17 << 1;
    QTest::newRow("table C first part") << true << 16 << 0;
    QTest::newRow("table C last points") << true << 67 << 51;
}

void TestRegValues::tableParts() {
    QFETCH(bool, tableC);
    QFETCH(int, id);
    QFETCH(int, firstPoint);
    const int address = tableC ? RegAdd.TableC : RegAdd.Table1;
    QVERIFY(!UpdateRegValue(address, "27102904", id, 0));
    const qint32* points = tableC ? RegVal.TableC_Pts.data() : RegVal.Table1_Pts.data();
    const int size = tableC ? TableCPoints : Table1Points;
    QCOMPARE(tableC ? RegVal.TableC : RegVal.Table1, id);
    for (int point = 0; point < size; ++point) {
        const int expected = point == firstPoint ? 10000 : point == firstPoint + 1 ? 10500 : -1;
        QCOMPARE(points[point], expected);
    }
}

void TestRegValues::tablePartIdsOutsideTheTable_data() {
    QTest::addColumn<bool>("tableC");
    QTest::addColumn<int>("id");
    QTest::newRow("table 1 below") << false << 15;
    QTest::newRow("table 1 beyond the checksum") << false << 117;
    QTest::newRow("table C beyond point 52") << true << 68;
}

void TestRegValues::tablePartIdsOutsideTheTable() {
    QFETCH(bool, tableC);
    QFETCH(int, id);
    QVERIFY(UpdateRegValue(tableC ? RegAdd.TableC : RegAdd.Table1, "27102904", id, 0));
    QCOMPARE(tableC ? RegVal.TableC : RegVal.Table1, -1);
    QCOMPARE(sink.entries.size(), 1);
}

void TestRegValues::fileNameParts() {
    RegVal.File_Text = "short";
    QVERIFY(!UpdateRegValue(RegAdd.File_Name, "41424344", 20, 0));  // "ABCD"
    QCOMPARE(RegVal.File_Text, QString("    ABCD            "));
    QCOMPARE(RegVal.File_Name, 20);
    QVERIFY(!UpdateRegValue(RegAdd.File_Name, "31323334", 32, 0));
    QCOMPARE(RegVal.File_Text, QString("    ABCD        1234"));
    QVERIFY(!UpdateRegValue(RegAdd.File_Name, "3<3=3>3?", 16, 0));
    QCOMPARE(RegVal.File_Text, QString("<=>?ABCD        1234"));
}

void TestRegValues::fileNameWrongId() {
    UpdateRegValue(RegAdd.File_Name, "41424344", 20, 0);
    QVERIFY(UpdateRegValue(RegAdd.File_Name, "31323334", 18, 0));
    QVERIFY(UpdateRegValue(RegAdd.File_Name, "31323334", 36, 0));
    QCOMPARE(RegVal.File_Text, QString("    ABCD            "));
    QCOMPARE(RegVal.File_Name, 20);
    QCOMPARE(sink.entries, (QStringList{"UpdateRegValue:Update File name wrong ID:18",
                                        "UpdateRegValue:Update File name wrong ID:36"}));
}

void TestRegValues::calibrationErrorBytes() {
    QVERIFY(!UpdateRegValue(RegAdd.Cal_Errors, "01?0>>00", 24, 0));
    QCOMPARE(RegVal.Cal_Errors, 24);
    QCOMPARE(CalErrors, (std::array<qint16, 4>{1, 240, 238, 0}));
}

void TestRegValues::unknownAddressKeepsRawData() {
    const RegMap before = RegVal;
    QVERIFY(!UpdateRegValue(200, "12345678", 16, 0));
    QCOMPARE(LastUnknownData, QByteArray("12345678"));
    QVERIFY(!UpdateRegValue(75, "00000010", 16, 0));  // a range register of map 3
    QCOMPARE(LastUnknownData, QByteArray("00000010"));
    QCOMPARE(RegVal.Gain_Factor, before.Gain_Factor);
}

void TestRegValues::subTypeRefreshesCaption() {
    SetRegMap(RegAdd, 4);
    QStringList captions;
    SetModuleCaptionHandler([&captions](const QString& text) { captions << text; });
    UpdateRegValue(RegAdd.Mod_Type, "00000007", 16, 0);
    UpdateRegValue(RegAdd.TypInput, "00000005", 16, 0);
    UpdateRegValue(RegAdd.Flag_A, "00000005", 16, 0);
    QCOMPARE(captions, QStringList{"KV714/8-5 "});
}

void TestRegValues::engineeringUnitText() {
    RegMap values;
    values.Eng_Unit1 = 'd';
    values.Eng_Unit2 = 'e';
    values.Eng_Unit3 = 'g';
    values.Eng_Unit4 = 'C';
    QCOMPARE(EngUnitText(values), QString("degC"));
    values.Eng_Unit1 = 31;
    values.Eng_Unit2 = 254;
    values.Eng_Unit3 = 255;
    values.Eng_Unit4 = 32;
    QCOMPARE(EngUnitText(values), QString("?") + QChar(254) + "? ");
    QCOMPARE(EngUnitText(RegMap()), QString("????"));
}

QTEST_APPLESS_MAIN(TestRegValues)
#include "tst_regvalues.moc"
