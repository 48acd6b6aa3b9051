#include "model/linearisation.h"
#include "model/table_transfer.h"

#include <QtTest>

using namespace kv;

namespace {

Table1Data Filled(qint32 value) {
    Table1Data table;
    table.fill(value);
    return table;
}

struct Built {
    bool ok = false;
    Table1Data table = Filled(-7);
    double inputZero = -1;
    double inputFull = -1;
    QString message;
};

Built Build(double engZero, double engFull, const QString& sensor, const QString& unit) {
    Built b;
    b.ok = BuildSensorTable(b.table, b.inputZero, b.inputFull, engZero, engFull, sensor, unit,
                            b.message);
    return b;
}

}  // namespace

class TestTables : public QObject {
    Q_OBJECT
private slots:
    void checksumExamples();
    void checksumIgnoresPointsAfterLastUsed();
    void sensorTableEnds_data();
    void sensorTableEnds();
    void sensorTableMidpoints();
    void minimumSpan_data();
    void minimumSpan();
    void sensorRangeLimits_data();
    void sensorRangeLimits();
    void refusedRequests_data();
    void refusedRequests();
    void tableC();
    void tableCRefusals_data();
    void tableCRefusals();
    void transferSteps();
    void stepIndex_data();
    void stepIndex();
    void readBack();
    void returnIds();
};

void TestTables::checksumExamples() {
    Table1Data table = Filled(0);
    TableChecksum(table.data(), Table1LastUsed);
    QCOMPARE(table[101], 65535);

    // Equal pairs cancel: used points that XOR to zero.
    table[3] = table[40] = 0x1234;
    TableChecksum(table.data(), Table1LastUsed);
    QCOMPARE(table[101], 65535);

    table[0] = 1;
    table[1] = 2;
    table[2] = 4;
    TableChecksum(table.data(), Table1LastUsed);
    QCOMPARE(table[101], 65528);  // ~7

    // Only the low 16 bits are kept.
    table = Filled(0);
    table[7] = 0x12345;
    QCOMPARE(TableChecksumOf(table.data(), Table1LastUsed), 0xDCBA);

    // The straight line 0, 100, ..., 10000 of a linear input.
    for (int i = 0; i <= Table1LastUsed; ++i)
        table[i] = 100 * i;
    TableChecksum(table.data(), Table1LastUsed);
    QCOMPARE(table[101], 52847);
    QCOMPARE(table[100], 10000);
}

void TestTables::checksumIgnoresPointsAfterLastUsed() {
    Table1Data one = Filled(3);
    TableChecksum(one.data(), Table1LastUsed);
    const qint32 sum1 = one[101];
    one[101] = 999;
    QCOMPARE(TableChecksumOf(one.data(), Table1LastUsed), sum1);

    TableCData c;
    c.fill(5);
    TableChecksum(c.data(), TableCLastUsed);
    const qint32 sumC = c[51];
    QCOMPARE(c[52], 5);
    c[51] = 1;
    c[52] = 2;
    QCOMPARE(TableChecksumOf(c.data(), TableCLastUsed), sumC);
}

void TestTables::sensorTableEnds_data() {
    QTest::addColumn<QString>("sensor");
    QTest::addColumn<QString>("unit");
    QTest::addColumn<double>("engZero");
    QTest::addColumn<double>("engFull");
    QTest::addColumn<double>("inputZero");
    QTest::addColumn<double>("inputFull");
    QTest::addColumn<double>("tolerance");
    QTest::newRow("K 0..100 C") << "TYPE K"
                                << "degC" << 0.0 << 100.0 << 0.0 << 4.096 << 0.0005;
    QTest::newRow("K 0..30 C") << "TYPE K"
                               << "degC" << 0.0 << 30.0 << 0.0 << 1.203 << 0.0005;
    QTest::newRow("J in F") << "TYPE J"
                            << "degF" << 32.0 << 1832.0 << 0.0 << 57.953 << 0.0005;
    QTest::newRow("T cryogenic") << "TYPE T"
                                 << "degC" << -270.0 << -200.0 << -6.258 << -5.603 << 0.0005;
    QTest::newRow("E cryogenic") << "TYPE E"
                                 << "degC" << -270.0 << -240.0 << -9.835 << -9.604 << 0.0005;
    QTest::newRow("B") << "TYPE B"
                       << "C" << 200.0 << 1820.0 << 0.178 << 13.820 << 0.0005;
    QTest::newRow("R top") << "TYPE R"
                           << "C" << 1600.0 << 1768.0 << 18.849 << 21.101 << 0.0005;
    QTest::newRow("PT100 full range") << "PT100"
                                      << "degC" << -200.0 << 850.0 << 18.52 << 390.48 << 0.005;
    QTest::newRow("PT1000 in K") << "PT1000."
                                 << "K" << 273.15 << 373.15 << 1000.0 << 1385.06 << 0.01;
}

void TestTables::sensorTableEnds() {
    QFETCH(QString, sensor);
    QFETCH(QString, unit);
    QFETCH(double, engZero);
    QFETCH(double, engFull);
    QFETCH(double, inputZero);
    QFETCH(double, inputFull);
    QFETCH(double, tolerance);
    const Built b = Build(engZero, engFull, sensor, unit);
    QVERIFY2(b.ok, qPrintable(b.message));
    QCOMPARE(b.table[0], 0);
    QCOMPARE(b.table[100], Table1FullScale);
    for (int i = 1; i <= Table1LastUsed; ++i)
        QVERIFY2(b.table[i] >= b.table[i - 1], qPrintable(QString::number(i)));
    QCOMPARE(b.table[101], TableChecksumOf(b.table.data(), Table1LastUsed));
    QVERIFY2(qAbs(b.inputZero - inputZero) <= tolerance, qPrintable(QString::number(b.inputZero)));
    QVERIFY2(qAbs(b.inputFull - inputFull) <= tolerance, qPrintable(QString::number(b.inputFull)));
}

void TestTables::sensorTableMidpoints() {
    // (R(50) - R(0)) / (R(100) - R(0)) of a Pt100 is 0.503749.
    Built b = Build(0, 100, "PT100", "degC");
    QVERIFY(b.ok);
    QCOMPARE(b.table[50], 5037);
    // (E(50) - E(0)) / (E(100) - E(0)) of type K: 2.023 mV of 4.096 mV.
    b = Build(0, 100, "TYPE K", "degC");
    QVERIFY(b.ok);
    QCOMPARE(b.table[50], 4939);
    // Point i lies at zero + i * span / 100, whatever the unit: 100..1000 °C in kelvin.
    b = Build(373.15, 1273.15, "TYPE K", "K");
    QVERIFY(b.ok);
    QCOMPARE(b.table[50], 5024);
}

void TestTables::minimumSpan_data() {
    QTest::addColumn<QString>("unit");
    QTest::addColumn<double>("engZero");
    QTest::addColumn<double>("engFull");
    QTest::addColumn<QString>("refusal");  // empty when accepted
    QTest::newRow("30 C") << "degC" << 0.0 << 30.0 << "";
    QTest::newRow("29.9 C") << "degC" << 0.0 << 29.9 << "FAIL minimum span is 30 degC";
    QTest::newRow("54 F") << "degF" << 32.0 << 86.0 << "";
    QTest::newRow("53 F") << "degF" << 32.0 << 85.0 << "FAIL minimum span is 54 degF";
    QTest::newRow("29 K") << "K" << 300.0 << 329.0 << "FAIL minimum span is 30 K";
    // Exactly 30 °C as typed, though the two 32-bit values differ by slightly less.
    QTest::newRow("float entry") << "degC" << double(10.3f) << double(40.3f) << "";
}

void TestTables::minimumSpan() {
    QFETCH(QString, unit);
    QFETCH(double, engZero);
    QFETCH(double, engFull);
    QFETCH(QString, refusal);
    const Built b = Build(engZero, engFull, "TYPE K", unit);
    QCOMPARE(b.ok, refusal.isEmpty());
    if (!b.ok) {
        QCOMPARE(b.message, refusal);
        QCOMPARE(b.table, Filled(-7));
        QCOMPARE(b.inputZero, -1.0);
    }
}

void TestTables::sensorRangeLimits_data() {
    QTest::addColumn<QString>("sensor");
    QTest::addColumn<QString>("unit");
    QTest::addColumn<double>("engZero");
    QTest::addColumn<double>("engFull");
    QTest::addColumn<QString>("refusal");
    QTest::newRow("PT100 below") << "PT100"
                                 << "degC" << -250.0 << 0.0 << "FAIL PT100 minimum is:-200 degC";
    QTest::newRow("PT100 below in F")
        << "PT100"
        << "degF" << -400.0 << 0.0 << "FAIL PT100 minimum is:-328 degF";
    QTest::newRow("PT1000 above") << "PT1000"
                                  << "degC" << 0.0 << 851.0 << "FAIL PT1000 maximum is:850 degC";
    QTest::newRow("K above") << "TYPE K"
                             << "degC" << 1000.0 << 1400.0 << "FAIL TYPE K maximum is:1372 degC";
    QTest::newRow("B below") << "TYPE B"
                             << "degC" << 100.0 << 500.0 << "FAIL TYPE B minimum is:200 degC";
    QTest::newRow("S below in K") << "TYPE S"
                                  << "K" << 200.0 << 300.0 << "FAIL TYPE S minimum is:223.15 K";
    QTest::newRow("PT100 top in K, typed") << "PT100"
                                           << "K" << double(1093.15f) << double(1123.15f) << "";
    QTest::newRow("T bottom") << "TYPE T"
                              << "degC" << -270.0 << -240.0 << "";
}

void TestTables::sensorRangeLimits() {
    QFETCH(QString, sensor);
    QFETCH(QString, unit);
    QFETCH(double, engZero);
    QFETCH(double, engFull);
    QFETCH(QString, refusal);
    const Built b = Build(engZero, engFull, sensor, unit);
    QCOMPARE(b.message, refusal);
    QCOMPARE(b.ok, refusal.isEmpty());
}

void TestTables::refusedRequests_data() {
    QTest::addColumn<QString>("sensor");
    QTest::addColumn<QString>("unit");
    QTest::addColumn<double>("engZero");
    QTest::addColumn<double>("engFull");
    QTest::addColumn<QString>("refusal");
    QTest::newRow("no sensor") << "Linear"
                               << "degC" << 0.0 << 100.0 << "FAIL engineering unit not found";
    QTest::newRow("falling") << "TYPE K"
                             << "degC" << 100.0 << 0.0 << "FAIL input must be rising";
    QTest::newRow("not a temperature unit") << "TYPE K"
                                            << "mV" << 0.0 << 100.0 << "DegEngToDegC ? EngUnt mV";
    QTest::newRow("unknown type") << "TYPE X"
                                  << "degC" << 0.0 << 100.0 << "? Type:X";
}

void TestTables::refusedRequests() {
    QFETCH(QString, sensor);
    QFETCH(QString, unit);
    QFETCH(double, engZero);
    QFETCH(double, engFull);
    QFETCH(QString, refusal);
    const Built b = Build(engZero, engFull, sensor, unit);
    QVERIFY(!b.ok);
    QCOMPARE(b.message, refusal);
    QCOMPARE(b.table, Filled(-7));
}

void TestTables::tableC() {
    TableCData c;
    c.fill(-3);
    QString message;
    // 10 mV input span over 20000 counts: 2000 tenths of a count per millivolt.
    QVERIFY2(BuildTableC(c, 0, 10, "TYPE K", message, 20500, 500), qPrintable(message));
    QCOMPARE(c[0], 0);
    QCOMPARE(c[1], 789);     // 0.039 mV
    QCOMPARE(c[25], 20005);  // 1.000 mV
    QCOMPARE(c[50], 40462);  // 2.023 mV
    QCOMPARE(c[51], TableChecksumOf(c.data(), TableCLastUsed));
    QCOMPARE(c[52], -3);

    // Type B below 51 °C follows its straight line: 0.003 mV at 50 °C.
    QVERIFY(BuildTableC(c, 0, 1, "TYPE B", message, 1000, 0));
    QCOMPARE(c[25], 15);
    QCOMPARE(c[50], 30);
}

void TestTables::tableCRefusals_data() {
    QTest::addColumn<QString>("sensor");
    QTest::addColumn<double>("inputFull");
    QTest::addColumn<int>("countA");
    QTest::addColumn<int>("countB");
    QTest::addColumn<QString>("refusal");
    QTest::newRow("resistance thermometer")
        << "PT100." << 10.0 << 1000 << 0 << "FAIL PT100. not found";
    QTest::newRow("falling counts")
        << "TYPE K" << 10.0 << 0 << 1000 << "FAIL TableC output MUST always increase in value";
    QTest::newRow("unknown type") << "TYPE Q" << 10.0 << 1000 << 0 << "? Type:Q";
    QTest::newRow("no input range")
        << "TYPE K" << 0.0 << 1000 << 0 << "FAIL TableC input range is zero";
    QTest::newRow("beyond 16 bits")
        << "TYPE E" << 1.0 << 30000 << 0 << "FAIL TableC output MUST be below 65536";
}

void TestTables::tableCRefusals() {
    QFETCH(QString, sensor);
    QFETCH(double, inputFull);
    QFETCH(int, countA);
    QFETCH(int, countB);
    QFETCH(QString, refusal);
    TableCData c;
    c.fill(9);
    QString message;
    QVERIFY(!BuildTableC(c, 0, inputFull, sensor, message, countA, countB));
    QCOMPARE(message, refusal);
    TableCData untouched;
    untouched.fill(9);
    QCOMPARE(c, untouched);
}

void TestTables::transferSteps() {
    Table1Data table;
    for (int i = 0; i < Table1Points; ++i)
        table[i] = 1000 + i;
    const QVector<TableStep> steps = TableTransferSteps(table.data(), Table1LastUsed);
    QCOMPARE(steps.size(), 51);
    for (int s = 0; s < steps.size(); ++s) {
        QCOMPARE(steps[s].busId, 16 + 2 * s);
        QCOMPARE(steps[s].first, 1000 + 2 * s);
        QCOMPARE(steps[s].second, 1001 + 2 * s);
    }
    QCOMPARE(steps.last().busId, 116);
    QCOMPARE(steps.last().second, 1101);  // the checksum position

    TableCData c{};
    c[50] = 10000;
    c[51] = 65535;
    c[52] = 77;
    const QVector<TableStep> cSteps = TableTransferSteps(c.data(), TableCLastUsed);
    QCOMPARE(cSteps.size(), 26);
    QCOMPARE(cSteps.last().busId, 66);
    QCOMPARE(cSteps.last().WireData(), QByteArray("2710????"));
    QCOMPARE(cSteps.first().WireData(), QByteArray("00000000"));
    // A negative point travels as its low 16 bits.
    QCOMPARE((TableStep{16, -1, 0x1ABCD}.WireData()), QByteArray("????:;<="));
}

void TestTables::stepIndex_data() {
    QTest::addColumn<int>("busId");
    QTest::addColumn<int>("lastUsed");
    QTest::addColumn<int>("index");
    QTest::newRow("first") << 16 << 100 << 0;
    QTest::newRow("second") << 18 << 100 << 1;
    QTest::newRow("table 1 last") << 116 << 100 << 50;
    QTest::newRow("table C last") << 66 << 50 << 25;
    QTest::newRow("odd") << 17 << 100 << -1;
    QTest::newRow("below") << 14 << 100 << -1;
    QTest::newRow("past table 1") << 118 << 100 << -1;
    QTest::newRow("past table C") << 68 << 50 << -1;
}

void TestTables::stepIndex() {
    QFETCH(int, busId);
    QFETCH(int, lastUsed);
    QFETCH(int, index);
    QCOMPARE(TableStepIndex(busId, lastUsed), index);
}

void TestTables::readBack() {
    Built b = Build(0, 400, "TYPE K", "degC");
    QVERIFY(b.ok);
    QString message;
    QVERIFY(CheckTableReadBack(b.table.data(), Table1LastUsed, message));
    QVERIFY(message.isEmpty());

    Table1Data corrupted = b.table;
    corrupted[37] ^= 0x0004;
    QVERIFY(!CheckTableReadBack(corrupted.data(), Table1LastUsed, message));
    QCOMPARE(message,
             QStringLiteral("Table Check Sum Fail  10000,") + QString::number(b.table[101]));

    // A checksum whose top bit is set may come back sign-extended.
    Table1Data zeros = Filled(0);
    zeros[101] = -1;
    QVERIFY(CheckTableReadBack(zeros.data(), Table1LastUsed, message));
}

void TestTables::returnIds() {
    QString message;
    QVERIFY(CheckTableReturnId(40, 40, true, message));
    QVERIFY(message.isEmpty());
    QVERIFY(!CheckTableReturnId(40, 42, false, message));
    QCOMPARE(message, QStringLiteral("Send ID:40 <> Return ID:42"));
    QVERIFY(!CheckTableReturnId(40, 16, true, message));
    QCOMPARE(message, QStringLiteral("? table Send_ID:40 Return_ID:16"));
}

QTEST_APPLESS_MAIN(TestTables)
#include "tst_tables.moc"
