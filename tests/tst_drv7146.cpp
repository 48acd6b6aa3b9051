#include "drivers/kv7146_flags.h"
#include "drivers/kv7146v1_driver.h"
#include "drivers/kv7146v2_driver.h"
#include "tests/support/driver_bench.h"

#include <QtTest>

using namespace kv;
using drvbench::Expect;
using drvbench::Frame;

namespace {

// --- records as the settings windows hand them over ---

SettingsSet kv714v1Record() {
    SettingsSet s;
    s.BussIdenti = 12;
    s.Inp1RngTyp = 4;  // 4-20 mA
    s.Inp1EngZro = 4;
    s.Inp1EngFul = 20;
    s.Inp1Respon = 1;
    s.UserLmtEna = 1;
    s.Out1RngTyp = 8;  // 1-5 V
    s.Out1EngZro = 1;
    s.Out1EngFul = 5;
    s.Out1SigLmZ = 1.2f;
    s.Out1SigLmF = 4.8f;
    return s;
}

SettingsSet kv716v1Record() {
    SettingsSet s = kv714v1Record();
    s.Inp1RngTyp = 9;  // 0-10 V
    s.Inp1EngZro = 0.5f;
    s.Inp1EngFul = 10;
    s.Out1RngTyp = 8;  // 0-10 V
    s.Out1EngZro = 0;
    s.Out1EngFul = 10;
    s.Out1SigLmZ = 0;
    s.Out1SigLmF = 10.3f;
    s.Out2RngTyp = 3;  // 4-20 mA
    s.Out2EngZro = 20;
    s.Out2EngFul = 4;
    s.Out2SigLmZ = 3.9f;
    s.Out2SigLmF = 20.2f;
    s.DirecrReve = 1;
    s.Inp1Respon = 0;
    return s;
}

SettingsSet kv714v2Record() {
    SettingsSet s;
    s.BussIdenti = 21;
    s.SetFileName(QStringLiteral("TANK LEVEL 3"));
    s.Inp1EngUnt = QStringLiteral("m   ");
    s.Inp1EngZro = 0;
    s.Inp1EngFul = 5.5f;
    s.Inp1RngSet = 4;  // 4-20 mA
    s.Inp1mU_Zro = 4;
    s.Inp1mU_Ful = 20;
    s.Out1RngTyp = 9;  // 0-10 V
    s.Out1EngZro = 0;
    s.Out1EngFul = 10;
    s.Out1SigLmZ = 0.2f;
    s.Out1SigLmF = 10.2f;
    s.Inp1Respon = 1;
    s.UserLmtEna = 1;
    s.RemoteCont = 1;
    s.Inp1Shape = QStringLiteral("Table");
    drvbench::curveTable(s);
    return s;
}

SettingsSet kv716v2Record() {
    SettingsSet s = kv714v2Record();
    s.Inp1RngSet = 9;  // 0-10 V
    s.Inp1mU_Zro = 0;
    s.Inp1mU_Ful = 10;
    s.Out1RngTyp = 2;  // 0-20 mA
    s.Out1EngZro = 0;
    s.Out1EngFul = 20;
    s.Out1SigLmZ = 0;
    s.Out1SigLmF = 20;
    s.Out2RngTyp = 8;  // 0-10 V
    s.Out2EngZro = 2;
    s.Out2EngFul = 10;
    s.Out2SigLmZ = 2;
    s.Out2SigLmF = 9.5f;
    s.Inp1Respon = 0;
    s.UserLmtEna = 3;
    s.DirecrReve = 1;
    s.RemoteCont = 2;
    s.Inp1Shape = QStringLiteral("Linear");
    return s;
}

// --- the orders, row by row ---

std::vector<Frame> kv714v1Programming() {
    Expect e(1);
    e.read("Mod_Type")
        .writes({"In_Rng1", "Usr_In1_F", "Usr_In1_Z", "Resp1", "Sig_Lmt_On", "Out_Rng1",
                 "Usr_Out1_F", "Usr_Out1_Z", "Sig_Lmt1_F", "Sig_Lmt1_Z", "Buss_ID"})
        .moduleConfirmed();
    return e.frames();
}

std::vector<Frame> kv716v1Programming() {
    Expect e(2);
    e.read("Mod_Type")
        .writes({"In_Rng1", "Usr_In1_F", "Usr_In1_Z", "Resp1", "Sig_Lmt_On", "Out_Rng2",
                 "Usr_Out2_F", "Usr_Out2_Z", "Sig_Lmt2_F", "Sig_Lmt2_Z", "Out_Rng1", "Usr_Out1_F",
                 "Usr_Out1_Z", "Sig_Lmt1_F", "Sig_Lmt1_Z", "IO_Dir", "Buss_ID"})
        .moduleConfirmed();
    return e.frames();
}

std::vector<Frame> kv714v1Reading() {
    Expect e(1);
    e.read("Mod_Type")
        .reads({"Buss_ID", "Sig_Lmt_On", "In_Rng1", "Out_Rng1", "Int_Temp"})
        .moduleConfirmed();
    return e.frames();
}

std::vector<Frame> kv716v1Reading() {
    Expect e(2);
    e.read("Mod_Type")
        .reads({"Buss_ID", "Sig_Lmt_On", "IO_Dir", "In_Rng1", "Out_Rng2", "Out_Rng1", "Int_Temp"})
        .moduleConfirmed();
    return e.frames();
}

std::vector<Frame> v2Programming(int map, bool kv716) {
    Expect e(map);
    e.read("Mod_Type")
        .fileName()
        .writes({"Eng_Unit1", "Eng_Unit2", "Eng_Unit3", "Eng_Unit4", "Eng_In_Z", "Eng_In_F",
                 "Meas_Unit_Z", "Meas_Unit_F", "In_Rng1", "Usr_In1_Z", "Usr_In1_F", "Out_Rng1",
                 "Usr_Out1_Z", "Usr_Out1_F", "Sig_Lmt1_Z", "Sig_Lmt1_F"});
    if (kv716)
        e.write("Out_Rng2").writes({"Usr_Out2_Z", "Usr_Out2_F", "Sig_Lmt2_Z", "Sig_Lmt2_F"});
    e.write("Flag_A").table1().read("Input_B4_Table").write("Buss_ID").moduleConfirmed();
    return e.frames();
}

std::vector<Frame> kv714v2Programming() {
    return v2Programming(4, false);
}
std::vector<Frame> kv716v2Programming() {
    return v2Programming(5, true);
}

std::vector<Frame> v2Reading(int map, bool kv716) {
    Expect e(map);
    e.read("Mod_Type")
        .read("Buss_ID")
        .fileName(true)
        .reads({"TypInput", "Meas_Unit_Z", "Meas_Unit_F", "Eng_In_F", "Eng_In_Z", "Flag_A",
                "Out_Rng1", "Usr_Out1_Z", "Usr_Out1_F", "Sig_Lmt1_Z", "Sig_Lmt1_F", "Eng_Unit1",
                "Eng_Unit2", "Eng_Unit3", "Eng_Unit4", "Usr_In1_Z", "Usr_In1_F"});
    if (kv716)
        e.read("Out_Rng2").reads({"Usr_Out2_Z", "Usr_Out2_F", "Sig_Lmt2_Z", "Sig_Lmt2_F"});
    e.read("In_Rng1").table1(true).read("Input_B4_Table").read("Int_Temp").moduleConfirmed();
    return e.frames();
}

std::vector<Frame> kv714v2Reading() {
    return v2Reading(4, false);
}
std::vector<Frame> kv716v2Reading() {
    return v2Reading(5, true);
}

// One model on the simulator: the module, its driver, a record, its orders.
struct ModelCase {
    const char* name;
    int typeCode;
    int subType;
    const DriverDescriptor& (*driver)();
    SettingsSet (*record)();
    std::vector<Frame> (*programming)();
    std::vector<Frame> (*reading)();
    const char* programmed;
    const char* readText;
};

const ModelCase modelCases[] = {
    {"KV714 v1", 1, 0, Kv714v1Driver, kv714v1Record, kv714v1Programming, kv714v1Reading,
     "KV714 Programmed", "KV714-20 Settings Read.."},
    {"KV716 v1", 3, 0, Kv716v1Driver, kv716v1Record, kv716v1Programming, kv716v1Reading,
     "KV716 Programmed", "KV716-20 Settings Read.."},
    {"KV714 v2", 7, 0, Kv714v2Driver, kv714v2Record, kv714v2Programming, kv714v2Reading,
     "KV714/8 Programmed", "KV714-22 Settings Read.."},
    {"KV718-10 as KV714 v2", 7, 3, Kv714v2Driver, kv714v2Record, kv714v2Programming, kv714v2Reading,
     "KV714/8 Programmed", "KV718-10 Settings Read.."},
    {"KV716 v2", 8, 0, Kv716v2Driver, kv716v2Record, kv716v2Programming, kv716v2Reading,
     "KV716 Programmed", "KV716-22 Settings Read.."},
};

// Fields every reading run gives back, and those of each version and model.
bool sameCommon(const SettingsSet& back, const SettingsSet& s) {
    return drvbench::sameFields(back, s,
                                {DRV_FIELD(BussIdenti), DRV_FIELD(Inp1Respon),
                                 DRV_FIELD(UserLmtEna), DRV_FIELD(Out1RngTyp),
                                 DRV_FIELD(Out1EngZro), DRV_FIELD(Out1EngFul),
                                 DRV_FIELD(Out1SigLmZ), DRV_FIELD(Out1SigLmF)});
}

bool sameOutput2(const SettingsSet& back, const SettingsSet& s) {
    return drvbench::sameFields(back, s,
                                {DRV_FIELD(DirecrReve), DRV_FIELD(Out2RngTyp),
                                 DRV_FIELD(Out2EngZro), DRV_FIELD(Out2EngFul),
                                 DRV_FIELD(Out2SigLmZ), DRV_FIELD(Out2SigLmF)});
}

bool sameVersion1(const SettingsSet& back, const SettingsSet& s) {
    return drvbench::sameFields(
        back, s, {DRV_FIELD(Inp1RngTyp), DRV_FIELD(Inp1EngZro), DRV_FIELD(Inp1EngFul)});
}

bool sameVersion2(const SettingsSet& back, const SettingsSet& s) {
    return drvbench::sameFields(back, s,
                                {DRV_FIELD(FileName), DRV_FIELD(Inp1RngSet), DRV_FIELD(Inp1mU_Zro),
                                 DRV_FIELD(Inp1mU_Ful), DRV_FIELD(Inp1EngZro),
                                 DRV_FIELD(Inp1EngFul), DRV_FIELD(Inp1EngUnt), DRV_FIELD(Inp1Shape),
                                 DRV_FIELD(DirecrReve), DRV_FIELD(RemoteCont)}) &&
           back.Table1 == s.Table1;
}

}  // namespace

class TestDrv7146 : public QObject {
    Q_OBJECT
private slots:
    void flagWord_data();
    void flagWord();

    void programThenReadFollowsTheOrders_data();
    void programThenReadFollowsTheOrders();
    void readWithoutRangesWarns_data();
    void readWithoutRangesWarns();
    void windowRefusesAnotherFamily();
    void inputOutOfRange_data();
    void inputOutOfRange();
};

void TestDrv7146::flagWord_data() {
    QTest::addColumn<int>("model");
    QTest::addColumn<int>("respon");
    QTest::addColumn<int>("limits");
    QTest::addColumn<int>("reverse");
    QTest::addColumn<int>("remote");
    QTest::addColumn<QString>("shape");
    QTest::addColumn<int>("flags");

    // clang-format off
    QTest::newRow("714 nothing") << 4 << 0 << 0 << 0 << 0 << "Linear" << 0x00;
    QTest::newRow("714 response") << 4 << 1 << 0 << 0 << 0 << "Linear" << 0x80;
    QTest::newRow("714 limits") << 4 << 0 << 1 << 0 << 0 << "Linear" << 0x40;
    QTest::newRow("714 reverse") << 4 << 0 << 0 << 1 << 0 << "Linear" << 0x20;
    QTest::newRow("714 remote") << 4 << 0 << 0 << 0 << 1 << "Linear" << 0x10;
    QTest::newRow("714 table") << 4 << 0 << 0 << 0 << 0 << "Table" << 0x08;
    QTest::newRow("716 response") << 5 << 1 << 0 << 0 << 0 << "Linear" << 0x80;
    QTest::newRow("716 table") << 5 << 0 << 0 << 0 << 0 << "Table" << 0x40;
    QTest::newRow("716 remote output 1") << 5 << 0 << 0 << 0 << 1 << "Linear" << 0x01;
    QTest::newRow("716 remote output 2") << 5 << 0 << 0 << 0 << 2 << "Linear" << 0x02;
    QTest::newRow("716 limits both") << 5 << 0 << 3 << 0 << 0 << "Linear" << 0x0C;
    QTest::newRow("716 limits output 2") << 5 << 0 << 2 << 0 << 0 << "Linear" << 0x08;
    QTest::newRow("716 reverse output 1") << 5 << 0 << 0 << 1 << 0 << "Linear" << 0x10;
    QTest::newRow("716 reverse output 2") << 5 << 0 << 0 << 2 << 0 << "Linear" << 0x20;
    QTest::newRow("716 everything") << 5 << 1 << 3 << 3 << 3 << "Table" << 0xFF;
    // clang-format on
}

// The flag word written, and the record it gives back when read.
void TestDrv7146::flagWord() {
    QFETCH(int, model);
    QFETCH(int, respon);
    QFETCH(int, limits);
    QFETCH(int, reverse);
    QFETCH(int, remote);
    QFETCH(QString, shape);
    QFETCH(int, flags);
    SettingsSet s;
    s.Inp1Respon = respon;
    s.UserLmtEna = limits;
    s.DirecrReve = reverse;
    s.RemoteCont = remote;
    s.Inp1Shape = shape;
    QCOMPARE(int(KV7146v2FlagA(s, model)), flags);

    SettingsSet back;
    back.Inp1Respon = back.UserLmtEna = back.DirecrReve = back.RemoteCont = 9;
    KV7146v2ReadFlagA(quint16(flags), model, back);
    QVERIFY(
        drvbench::sameFields(back, s,
                             {DRV_FIELD(Inp1Respon), DRV_FIELD(UserLmtEna), DRV_FIELD(DirecrReve),
                              DRV_FIELD(RemoteCont), DRV_FIELD(Inp1Shape)}));
}

void TestDrv7146::programThenReadFollowsTheOrders_data() {
    QTest::addColumn<int>("model");
    for (int i = 0; i < int(std::size(modelCases)); ++i)
        QTest::newRow(modelCases[i].name) << i;
}

void TestDrv7146::programThenReadFollowsTheOrders() {
    QFETCH(int, model);
    const ModelCase& m = modelCases[model];
    drvbench::Bench bench(m.typeCode, m.subType);
    QVERIFY(bench.ready());
    const SettingsSet s = m.record();
    QVERIFY2(bench.program(m.driver(), s), qPrintable(bench.result));
    QCOMPARE(bench.result, QString(m.programmed));
    QString difference;
    QVERIFY2(drvbench::sameFrames(bench.sent, m.programming(), difference), qPrintable(difference));

    QVERIFY2(bench.read(m.driver(), SettingsSet()), qPrintable(bench.result));
    QCOMPARE(bench.result, QString(m.readText));
    QCOMPARE(bench.run.warning(), QString());
    QVERIFY2(drvbench::sameFrames(bench.sent, m.reading(), difference), qPrintable(difference));

    const SettingsSet& back = bench.run.settings();
    QCOMPARE(back.ModTypeSet, m.typeCode);
    QVERIFY(sameCommon(back, s));
    const int family = m.driver().family;
    const bool version1 = family == KV714v1 || family == KV716v1;
    QVERIFY(version1 ? sameVersion1(back, s) : sameVersion2(back, s));
    if (family == KV716v1 || family == KV716v2)
        QVERIFY(sameOutput2(back, s));
}

void TestDrv7146::readWithoutRangesWarns_data() {
    QTest::addColumn<int>("model");
    QTest::addColumn<QString>("warning");
    QTest::newRow("KV716 v1") << 1 << "Invalid Input 1 Range, Invalid Output 2 Range";
    QTest::newRow("KV716 v2") << 4 << "Invalid Output 2 Range";
}

void TestDrv7146::readWithoutRangesWarns() {
    QFETCH(int, model);
    const ModelCase& m = modelCases[model];
    drvbench::Bench bench(m.typeCode, m.subType);
    QVERIFY(bench.ready());
    const RegMap map = RegMapFor(m.driver().family);
    bench.sim->setRegisterValue(map.In_Rng1, 17);
    bench.sim->setRegisterValue(map.Out_Rng2, -1);
    QVERIFY2(bench.read(m.driver(), m.record()), qPrintable(bench.result));
    QTEST(bench.run.warning(), "warning");
    QCOMPARE(bench.run.settings().Out2RngTyp, -1);
    QCOMPARE(bench.run.settings().Out2EngFul, 0.0f);
}

void TestDrv7146::windowRefusesAnotherFamily() {
    drvbench::Bench bench(4, 1);  // a KV720 on the KV714/KV716 windows
    QVERIFY(bench.ready());
    QVERIFY(!bench.program(Kv714v1Driver(), kv714v1Record()));
    QCOMPARE(bench.result, QString("f_KV714 Unknown memory map"));
    QVERIFY(!bench.read(Kv716v2Driver(), SettingsSet()));
    QCOMPARE(bench.result, QString("f_KV7146v2.cbGet Incorecct memory map"));
    QCOMPARE(bench.sent.size(), size_t(1));
}

void TestDrv7146::inputOutOfRange_data() {
    QTest::addColumn<int>("model");
    QTest::addColumn<QString>("message");
    QTest::newRow("KV714 v1") << 0 << "PROGRAM FAIL Module Type: UsrCalRangeSet: Max > 21";
    QTest::newRow("KV714 v2") << 2 << "PROGRAM FAIL D Measure Unit FS 1: UsrCalRangeSet: Max > 21";
}

void TestDrv7146::inputOutOfRange() {
    QFETCH(int, model);
    const ModelCase& m = modelCases[model];
    drvbench::Bench bench(m.typeCode, m.subType);
    QVERIFY(bench.ready());
    SettingsSet s = m.record();
    s.Inp1EngFul = 21.5f;  // beyond 4-20 mA in the first version
    s.Inp1mU_Ful = 21.5f;  // and in the second
    QVERIFY(!bench.program(m.driver(), s));
    QTEST(bench.result, "message");
    // Nothing past the failing step went out: the input range was never written.
    const Frame inRange{'W', 16, RegAdd.In_Rng1};
    QVERIFY(std::find(bench.sent.begin(), bench.sent.end(), inRange) == bench.sent.end());
}

QTEST_GUILESS_MAIN(TestDrv7146)
#include "tst_drv7146.moc"
