#include "model/sensors.h"
#include "model/temperature_units.h"

#include <QtTest>

using namespace kv;

class TestSensors : public QObject {
    Q_OBJECT
private slots:
    void publishedEmf_data();
    void publishedEmf();
    void piecesJoinAtBreakPoints_data();
    void piecesJoinAtBreakPoints();
    void emfRisesOverValidRange_data();
    void emfRisesOverValidRange();
    void typeBLinearBelowFirstBreak();
    void unknownType();
    void publishedResistance_data();
    void publishedResistance();
    void sensorFromText_data();
    void sensorFromText();
    void unitConversions_data();
    void unitConversions();
    void spanConversions();
    void refusedUnits();
};

// Values of the IEC 60584-1 / NIST ITS-90 reference tables, rounded there to 1 µV.
void TestSensors::publishedEmf_data() {
    QTest::addColumn<QChar>("type");
    QTest::addColumn<double>("celsius");
    QTest::addColumn<double>("mV");
    struct Row {
        char type;
        double celsius;
        double mV;
    };
    const Row rows[] = {
        {'B', 250, 0.291},   {'B', 600, 1.792},   {'B', 1000, 4.834},  {'B', 1820, 13.820},
        {'E', -270, -9.835}, {'E', -200, -8.825}, {'E', -100, -5.237}, {'E', 100, 6.319},
        {'E', 500, 37.005},  {'E', 1000, 76.373}, {'J', -210, -8.095}, {'J', -100, -4.633},
        {'J', 100, 5.269},   {'J', 760, 42.919},  {'J', 1000, 57.953}, {'J', 1200, 69.553},
        {'K', -270, -6.458}, {'K', -200, -5.891}, {'K', -100, -3.554}, {'K', 0, 0.000},
        {'K', 100, 4.096},   {'K', 500, 20.644},  {'K', 1000, 41.276}, {'K', 1372, 54.886},
        {'N', -270, -4.345}, {'N', -100, -2.407}, {'N', 100, 2.774},   {'N', 500, 16.748},
        {'N', 1000, 36.256}, {'N', 1300, 47.513}, {'R', -50, -0.226},  {'R', 100, 0.647},
        {'R', 1000, 10.506}, {'R', 1500, 17.451}, {'R', 1700, 20.222}, {'R', 1768, 21.101},
        {'S', -50, -0.236},  {'S', 100, 0.646},   {'S', 1000, 9.587},  {'S', 1500, 15.582},
        {'S', 1700, 17.947}, {'S', 1768, 18.693}, {'T', -270, -6.258}, {'T', -266, -6.251},
        {'T', -200, -5.603}, {'T', -100, -3.379}, {'T', 100, 4.279},   {'T', 400, 20.872},
        {'B', 350, 0.596},   {'E', 350, 24.964},  {'J', 350, 19.090},  {'K', 350, 14.293},
        {'N', 350, 11.136},  {'R', 350, 2.896},   {'S', 350, 2.786},   {'T', 350, 17.819},
    };
    for (const Row& r : rows)
        QTest::addRow("%c %g", r.type, r.celsius) << QChar(r.type) << r.celsius << r.mV;
}

void TestSensors::publishedEmf() {
    QFETCH(QChar, type);
    QFETCH(double, celsius);
    QFETCH(double, mV);
    double minimum = 0, maximum = 0;
    QString message = "stale";
    const double emf = ThermocoupleEmf(celsius, type, minimum, maximum, message);
    QVERIFY2(qAbs(emf - mV) <= 0.0005, qPrintable(QString::number(emf, 'f', 6)));
    QVERIFY(message.isEmpty());
}

// A mistyped coefficient shows as a step where two pieces meet.
void TestSensors::piecesJoinAtBreakPoints_data() {
    QTest::addColumn<QChar>("type");
    QTest::addColumn<double>("breakPoint");
    QTest::newRow("B") << QChar('B') << 630.615;
    QTest::newRow("J") << QChar('J') << 760.0;
    QTest::newRow("R low") << QChar('R') << 1064.18;
    QTest::newRow("R high") << QChar('R') << 1664.5;
    QTest::newRow("S low") << QChar('S') << 1064.18;
    QTest::newRow("S high") << QChar('S') << 1664.5;
    for (char t : {'E', 'K', 'N', 'T'})
        QTest::addRow("%c", t) << QChar(t) << 0.0;
}

void TestSensors::piecesJoinAtBreakPoints() {
    QFETCH(QChar, type);
    QFETCH(double, breakPoint);
    double minimum = 0, maximum = 0;
    QString message;
    const double below = ThermocoupleEmf(breakPoint - 1e-6, type, minimum, maximum, message);
    const double at = ThermocoupleEmf(breakPoint, type, minimum, maximum, message);
    QVERIFY2(qAbs(at - below) < 2e-6, qPrintable(QString::number(at - below)));
}

void TestSensors::emfRisesOverValidRange_data() {
    QTest::addColumn<QChar>("type");
    for (char t : {'B', 'E', 'J', 'K', 'N', 'R', 'S', 'T'})
        QTest::addRow("%c", t) << QChar(t);
}

void TestSensors::emfRisesOverValidRange() {
    QFETCH(QChar, type);
    double minimum = 0, maximum = 0;
    QString message;
    ThermocoupleEmf(0, type, minimum, maximum, message);
    double previous = ThermocoupleEmf(minimum, type, minimum, maximum, message);
    for (double t = minimum + 0.1; t <= maximum; t += 0.1) {
        const double emf = ThermocoupleEmf(t, type, minimum, maximum, message);
        QVERIFY2(emf > previous, qPrintable(QString::number(t)));
        previous = emf;
    }
}

void TestSensors::typeBLinearBelowFirstBreak() {
    double minimum = 0, maximum = 0;
    QString message;
    QCOMPARE(ThermocoupleEmf(25, 'B', minimum, maximum, message), 0.0015);
    QCOMPARE(ThermocoupleEmf(0, 'B', minimum, maximum, message), 0.0);
    QVERIFY(qAbs(ThermocoupleEmf(50, 'B', minimum, maximum, message) - 0.003) < 1e-12);
    // From 51 °C on, the reference polynomial.
    QVERIFY(qAbs(ThermocoupleEmf(100, 'B', minimum, maximum, message) - 0.033) <= 0.0005);
}

void TestSensors::unknownType() {
    double minimum = -1, maximum = -1;
    QString message;
    QCOMPARE(ThermocoupleEmf(100, 'X', minimum, maximum, message), SensorFailValue);
    QCOMPARE(message, QStringLiteral("? Type:X"));
    QCOMPARE(minimum, -1.0);
    QCOMPARE(maximum, -1.0);

    // A lower-case letter names the same type, and the type's range is reported.
    QVERIFY(qAbs(ThermocoupleEmf(100, 'k', minimum, maximum, message) - 4.096) <= 0.0005);
    QVERIFY(message.isEmpty());
    QCOMPARE(minimum, -270.0);
    QCOMPARE(maximum, 1372.0);
}

// IEC 60751 table values, rounded there to 0.01 Ω.
void TestSensors::publishedResistance_data() {
    QTest::addColumn<double>("celsius");
    QTest::addColumn<int>("nominal");
    QTest::addColumn<double>("ohms");
    QTest::addColumn<double>("tolerance");
    QTest::newRow("Pt100 -200") << -200.0 << 100 << 18.52 << 0.005;
    QTest::newRow("Pt100 -100") << -100.0 << 100 << 60.26 << 0.005;
    QTest::newRow("Pt100 0") << 0.0 << 100 << 100.0 << 1e-12;
    QTest::newRow("Pt100 100") << 100.0 << 100 << 138.51 << 0.005;
    QTest::newRow("Pt100 850") << 850.0 << 100 << 390.48 << 0.005;
    QTest::newRow("Pt1000 100") << 100.0 << 1000 << 1385.06 << 0.01;
    QTest::newRow("Pt1000 -100") << -100.0 << 1000 << 602.56 << 0.005;
    QTest::newRow("other nominal is Pt100") << 100.0 << 500 << 138.51 << 0.005;
}

void TestSensors::publishedResistance() {
    QFETCH(double, celsius);
    QFETCH(int, nominal);
    QFETCH(double, ohms);
    QFETCH(double, tolerance);
    double minimum = 0, maximum = 0;
    const double r = RtdResistance(celsius, nominal, minimum, maximum);
    QVERIFY2(qAbs(r - ohms) <= tolerance, qPrintable(QString::number(r, 'f', 5)));
    QCOMPARE(minimum, -200.0);
    QCOMPARE(maximum, 850.0);
}

void TestSensors::sensorFromText_data() {
    QTest::addColumn<QString>("text");
    QTest::addColumn<bool>("known");
    QTest::addColumn<int>("kind");
    QTest::addColumn<QChar>("type");
    QTest::addColumn<int>("nominal");
    QTest::addColumn<QString>("unit");
    const int tc = int(SensorKind::Thermocouple);
    const int rtd = int(SensorKind::ResistanceThermometer);
    QTest::newRow("type K") << "TYPE K" << true << tc << QChar('K') << 0 << "mV";
    QTest::newRow("trailing blank") << "TYPE J " << true << tc << QChar('J') << 0 << "mV";
    QTest::newRow("lower case") << "type t" << true << tc << QChar('T') << 0 << "mV";
    QTest::newRow("PT100") << "PT100." << true << rtd << QChar() << 100 << "ohms";
    QTest::newRow("PT1000") << "PT1000." << true << rtd << QChar() << 1000 << "ohms";
    QTest::newRow("linear") << "Linear" << false << 0 << QChar() << 0 << "";
    QTest::newRow("empty") << "" << false << 0 << QChar() << 0 << "";
}

void TestSensors::sensorFromText() {
    QFETCH(QString, text);
    QFETCH(bool, known);
    Sensor sensor;
    QCOMPARE(SensorFromText(text, sensor), known);
    if (!known)
        return;
    QFETCH(int, kind);
    QFETCH(QChar, type);
    QFETCH(int, nominal);
    QFETCH(QString, unit);
    QCOMPARE(int(sensor.kind), kind);
    QCOMPARE(sensor.measuredUnit, unit);
    if (sensor.kind == SensorKind::Thermocouple)
        QCOMPARE(sensor.type, type);
    else
        QCOMPARE(sensor.nominal, nominal);
}

void TestSensors::unitConversions_data() {
    QTest::addColumn<QString>("unit");
    QTest::addColumn<double>("celsius");
    QTest::addColumn<double>("engineering");
    QTest::newRow("degC") << "degC" << 37.5 << 37.5;
    QTest::newRow("degree sign") << QString::fromUtf8("°C") << -40.0 << -40.0;
    QTest::newRow("degF boiling") << "degF" << 100.0 << 212.0;
    QTest::newRow("F meets C") << "F" << -40.0 << -40.0;
    QTest::newRow("K") << "K" << 26.85 << 300.0;
    QTest::newRow("padded K") << " degK " << -273.15 << 0.0;
}

void TestSensors::unitConversions() {
    QFETCH(QString, unit);
    QFETCH(double, celsius);
    QFETCH(double, engineering);
    double value = 0;
    QString message = "stale";
    QVERIFY(DegC_ToDegEng(value, unit, celsius, message));
    QVERIFY(message.isEmpty());
    QVERIFY(qAbs(value - engineering) < 1e-9);
    double back = 0;
    QVERIFY(DegEngToDegC(engineering, unit, back, message));
    QVERIFY(qAbs(back - celsius) < 1e-9);
}

void TestSensors::spanConversions() {
    QString message;
    double span = 0;
    QVERIFY(DegC_SpanToDegEng(span, "degF", 30, message));
    QCOMPARE(span, 54.0);
    QVERIFY(DegC_SpanToDegEng(span, "K", 30, message));
    QCOMPARE(span, 30.0);
}

void TestSensors::refusedUnits() {
    double value = 123, celsius = 456;
    QString message;
    QVERIFY(!DegEngToDegC(10, "mV", celsius, message));
    QCOMPARE(message, QStringLiteral("DegEngToDegC ? EngUnt mV"));
    QVERIFY(!DegC_ToDegEng(value, "degc", 10, message));
    QCOMPARE(message, QStringLiteral("DegC_ToDegEng: ? EngUnt degc"));
    QVERIFY(!DegC_ToDegEng(value, "", 10, message));
    QCOMPARE(message, QStringLiteral("DegC_ToDegEng: ? EngUnt "));
    QVERIFY(!DegC_SpanToDegEng(value, "ohm", 30, message));
    QCOMPARE(value, 123.0);
    QCOMPARE(celsius, 456.0);
}

QTEST_APPLESS_MAIN(TestSensors)
#include "tst_sensors.moc"
