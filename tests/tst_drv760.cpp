#include "drivers/kv760_input.h"

#include <QtTest>

using namespace kv;

namespace {

// The excitation calibration a KV760 reports at identification.
RegMap factory() {
    RegMap values;
    values.IS_ZS1 = 1800;
    values.IS_FS1 = 61000;
    values.VS_ZS1 = 1700;
    values.VS_FS1 = 60500;
    return values;
}

SettingsSet record(qint32 sensor, float level) {
    SettingsSet s;
    s.Inp1RngTyp = sensor;
    s.TrigLevel = level;
    s.Inp1MeUnit = QStringLiteral("Hz");
    s.Inp1Shape = QStringLiteral("Linear");
    s.Inp1mU_Zro = 0;
    s.Inp1mU_Ful = 1000;
    s.AuxImA = 20;
    s.AuxVmA = 12;
    return s;
}

// The registers a programming run leaves, as a read gives them back.
RegMap programmed(const KV760Input& input) {
    RegMap values = factory();
    values.Type_In_Unit = input.typeInUnit;
    values.Flag_A = input.flagA;
    values.Trig_Level = input.trigLevel;
    values.Meas_Unit_Z = input.lowHz;
    values.Meas_Unit_F = input.highHz;
    values.Aux_C = input.auxCurrent;
    values.Aux_V = input.auxVoltage;
    return values;
}

}  // namespace

class TestDrv760 : public QObject {
    Q_OBJECT
private slots:
    void typeAndUnit_data();
    void typeAndUnit();
    void refusedInput_data();
    void refusedInput();
    void triggerBand_data();
    void triggerBand();
    void loadingBit_data();
    void loadingBit();
    void optionBits_data();
    void optionBits();
    void excitationCounts_data();
    void excitationCounts();
    void readBackGivesTheRecord_data();
    void readBackGivesTheRecord();
    void readBackWithoutSourceCalibrationWarns();
};

void TestDrv760::typeAndUnit_data() {
    QTest::addColumn<int>("sensor");
    QTest::addColumn<QString>("unit");
    QTest::addColumn<QString>("shape");
    QTest::addColumn<int>("typeInUnit");
    QTest::addColumn<float>("lowHz");
    QTest::addColumn<float>("highHz");

    QTest::newRow("type 3 Hz linear") << 3 << "Hz"
                                      << "Linear" << 0x30 << 10.0f << 250.0f;
    QTest::newRow("type 1 kHz") << 1 << "kHz"
                                << "Linear" << 0x90 << 10000.0f << 250000.0f;
    QTest::newRow("type 6 table") << 6 << "Hz"
                                  << "Table" << 0x61 << 10.0f << 250.0f;
    QTest::newRow("type 7 kHz table") << 7 << "kHz"
                                      << "Table" << 0xF1 << 10000.0f << 250000.0f;
}

void TestDrv760::typeAndUnit() {
    QFETCH(int, sensor);
    SettingsSet s = record(sensor, 5);
    QFETCH(QString, unit);
    QFETCH(QString, shape);
    s.Inp1MeUnit = unit;
    s.Inp1Shape = shape;
    s.Inp1mU_Zro = 10;
    s.Inp1mU_Ful = 250;
    KV760Input input;
    QString message;
    QVERIFY2(KV760StartValues(s, factory(), input, message), qPrintable(message));
    QTEST(int(input.typeInUnit), "typeInUnit");
    QTEST(input.lowHz, "lowHz");
    QTEST(input.highHz, "highHz");
}

void TestDrv760::refusedInput_data() {
    QTest::addColumn<int>("sensor");
    QTest::addColumn<QString>("unit");
    QTest::addColumn<QString>("shape");
    QTest::addColumn<QString>("message");
    QTest::newRow("MHz") << 1 << "MHz"
                         << "Linear"
                         << "Input Unit ? :MHz";
    QTest::newRow("lower-case hz") << 1 << "hz"
                                   << "Linear"
                                   << "Input Unit ? :hz";
    QTest::newRow("shape") << 1 << "Hz"
                           << "Curve"
                           << "Input Shape ? :Curve";
    QTest::newRow("sensor 8") << 8 << "Hz"
                              << "Linear"
                              << "Input ? Sensor ? :8";
    QTest::newRow("sensor 0") << 0 << "Hz"
                              << "Linear"
                              << "Input ? Sensor ? :0";
}

void TestDrv760::refusedInput() {
    QFETCH(int, sensor);
    SettingsSet s = record(sensor, 5);
    QFETCH(QString, unit);
    QFETCH(QString, shape);
    s.Inp1MeUnit = unit;
    s.Inp1Shape = shape;
    KV760Input input;
    input.trigLevel = -5;
    QString message;
    QVERIFY(!KV760StartValues(s, factory(), input, message));
    QTEST(message, "message");
    QCOMPARE(input.trigLevel, -5);
}

void TestDrv760::triggerBand_data() {
    QTest::addColumn<int>("sensor");
    QTest::addColumn<float>("level");
    QTest::addColumn<int>("bandBits");
    QTest::addColumn<int>("count");

    QTest::newRow("0.2 V is sensitive") << 1 << 0.2f << 3 << 19860;
    QTest::newRow("0.05 V") << 6 << 0.05f << 3 << 4965;
    QTest::newRow("0.3 V middle") << 1 << 0.3f << 1 << 14895;
    QTest::newRow("0.4 V plain") << 1 << 0.4f << 0 << 3972;
    QTest::newRow("5.5 V") << 2 << 5.5f << 0 << 54615;
    // Type 7 divides its input: 50 V is 0.34 V at the comparator.
    QTest::newRow("HI 50 V") << 7 << 50.0f << 1 << 16881;
    QTest::newRow("HI 8 V") << 7 << 8.0f << 3 << 5402;
    QTest::newRow("HI 250 V") << 7 << 250.0f << 0 << 16881;
}

void TestDrv760::triggerBand() {
    QFETCH(int, sensor);
    QFETCH(float, level);
    KV760Input input;
    QString message;
    QVERIFY2(KV760StartValues(record(sensor, level), factory(), input, message),
             qPrintable(message));
    QTEST(int(input.flagA & 3), "bandBits");
    QTEST(input.trigLevel, "count");
}

void TestDrv760::loadingBit_data() {
    QTest::addColumn<int>("sensor");
    QTest::addColumn<int>("loading");
    QTest::addColumn<bool>("bit");
    QTest::newRow("NPN") << 1 << 1 << false;
    QTest::newRow("PNP") << 2 << 0 << true;
    QTest::newRow("NAMUR") << 3 << 0 << true;
    QTest::newRow("2 wire") << 4 << 0 << true;
    QTest::newRow("inductive, no load") << 5 << 0 << false;
    QTest::newRow("inductive, loaded") << 5 << 1 << true;
    QTest::newRow("any pulse") << 6 << 1 << false;
    QTest::newRow("HI pulse") << 7 << 0 << true;
}

void TestDrv760::loadingBit() {
    QFETCH(int, sensor);
    QFETCH(int, loading);
    SettingsSet s = record(sensor, 5);
    s.Typ1InRes = loading;
    KV760Input input;
    QString message;
    QVERIFY(KV760StartValues(s, factory(), input, message));
    QTEST(bool(input.flagA & 0x4), "bit");
}

void TestDrv760::optionBits_data() {
    QTest::addColumn<QString>("field");
    QTest::addColumn<int>("bit");
    QTest::newRow("response") << "Inp1Respon" << 3;
    QTest::newRow("remote") << "RemoteCont" << 4;
    QTest::newRow("reverse") << "DirecrReve" << 5;
    QTest::newRow("limits") << "UserLmtEna" << 6;
    QTest::newRow("track") << "TrigMode" << 7;
}

void TestDrv760::optionBits() {
    QFETCH(QString, field);
    QFETCH(int, bit);
    const struct {
        const char* name;
        qint32 SettingsSet::*member;
    } fields[] = {{"Inp1Respon", &SettingsSet::Inp1Respon},
                  {"RemoteCont", &SettingsSet::RemoteCont},
                  {"DirecrReve", &SettingsSet::DirecrReve},
                  {"UserLmtEna", &SettingsSet::UserLmtEna},
                  {"TrigMode", &SettingsSet::TrigMode}};
    SettingsSet s = record(1, 5);  // plain band, no load: no other bit
    for (const auto& f : fields)
        if (field == QLatin1String(f.name))
            s.*f.member = 1;
    KV760Input input;
    QString message;
    QVERIFY(KV760StartValues(s, factory(), input, message));
    QCOMPARE(int(quint16(input.flagA)), 1 << bit);
}

void TestDrv760::excitationCounts_data() {
    QTest::addColumn<float>("current");
    QTest::addColumn<float>("voltage");
    QTest::addColumn<int>("currentCount");
    QTest::addColumn<int>("voltageCount");
    // Counts are rounded after adding a half, an exact half going to the even neighbour.
    QTest::newRow("full scale") << 20.0f << 15.0f << 61000 << 60500;
    QTest::newRow("low end") << 0.5f << 1.0f << 2697 << 5066;
    QTest::newRow("inside") << 4.0f << 12.0f << 13162 << 48622;
}

void TestDrv760::excitationCounts() {
    SettingsSet s = record(1, 5);
    QFETCH(float, current);
    QFETCH(float, voltage);
    s.AuxImA = current;
    s.AuxVmA = voltage;
    KV760Input input;
    QString message;
    QVERIFY(KV760StartValues(s, factory(), input, message));
    QTEST(input.auxCurrent, "currentCount");
    QTEST(input.auxVoltage, "voltageCount");
}

void TestDrv760::readBackGivesTheRecord_data() {
    QTest::addColumn<int>("sensor");
    QTest::addColumn<QString>("unit");
    QTest::addColumn<QString>("shape");
    QTest::addColumn<float>("level");
    QTest::addColumn<int>("loading");
    QTest::addColumn<int>("options");  // bits: response, remote, reverse, limits, track

    QTest::newRow("NPN Hz") << 1 << "Hz"
                            << "Linear" << 5.5f << 0 << 0;
    QTest::newRow("NAMUR kHz table") << 3 << "kHz"
                                     << "Table" << 2.4f << 0 << 0x1F;
    QTest::newRow("inductive loaded") << 5 << "Hz"
                                      << "Linear" << 0.15f << 1 << 0x05;
    QTest::newRow("inductive unloaded") << 5 << "kHz"
                                        << "Linear" << 0.3f << 0 << 0x0A;
    QTest::newRow("HI pulse") << 7 << "Hz"
                              << "Table" << 50.0f << 0 << 0x10;
}

void TestDrv760::readBackGivesTheRecord() {
    QFETCH(int, sensor);
    QFETCH(QString, unit);
    QFETCH(QString, shape);
    QFETCH(float, level);
    QFETCH(int, loading);
    QFETCH(int, options);
    SettingsSet s = record(sensor, level);
    s.Inp1MeUnit = unit;
    s.Inp1Shape = shape;
    s.Inp1mU_Zro = 1.5f;
    s.Inp1mU_Ful = 12.25f;
    s.Typ1InRes = loading;
    s.Inp1Respon = options & 1;
    s.RemoteCont = (options >> 1) & 1;
    s.DirecrReve = (options >> 2) & 1;
    s.UserLmtEna = (options >> 3) & 1;
    s.TrigMode = (options >> 4) & 1;
    s.AuxImA = 4.2f;
    s.AuxVmA = 12.35f;
    KV760Input input;
    QString message;
    QVERIFY(KV760StartValues(s, factory(), input, message));

    SettingsSet back;
    QString warning;
    KV760ReadInput(programmed(input), back, warning);
    QCOMPARE(warning, QString());
    QCOMPARE(back.Inp1RngTyp, s.Inp1RngTyp);
    QCOMPARE(back.Inp1MeUnit, s.Inp1MeUnit);
    QCOMPARE(back.Inp1Shape, s.Inp1Shape);
    QCOMPARE(back.Inp1mU_Zro, s.Inp1mU_Zro);
    QCOMPARE(back.Inp1mU_Ful, s.Inp1mU_Ful);
    QCOMPARE(back.TrigLevel, s.TrigLevel);
    QCOMPARE(back.Typ1InRes, s.Typ1InRes);
    QCOMPARE(back.Inp1Respon, s.Inp1Respon);
    QCOMPARE(back.RemoteCont, s.RemoteCont);
    QCOMPARE(back.DirecrReve, s.DirecrReve);
    QCOMPARE(back.UserLmtEna, s.UserLmtEna);
    QCOMPARE(back.TrigMode, s.TrigMode);
    QCOMPARE(back.AuxImA, s.AuxImA);
    QCOMPARE(back.AuxVmA, s.AuxVmA);
}

void TestDrv760::readBackWithoutSourceCalibrationWarns() {
    KV760Input input;
    QString message;
    QVERIFY(KV760StartValues(record(1, 5), factory(), input, message));
    RegMap values = programmed(input);
    values.VS_FS1 = values.VS_ZS1;
    SettingsSet back;
    QString warning = QStringLiteral("before, ");
    KV760ReadInput(values, back, warning);
    QCOMPARE(warning, QStringLiteral("before, kv760AuxRead failed , "));
    QCOMPARE(back.AuxImA, 20.0f);
}

QTEST_GUILESS_MAIN(TestDrv760)
#include "tst_drv760.moc"
