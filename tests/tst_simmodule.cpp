// The simulator's pieces on their own: its frame reader, its model table, the
// factory state of every family, and its command line.
#include "model/module_types.h"
#include "model/register_map.h"
#include "sim/sim_cli.h"
#include "sim/sim_factory.h"
#include "sim/sim_frame.h"
#include "sim/sim_models.h"
#include "sim/sim_module.h"

#include <QtTest>

using namespace kv;
using namespace kv::sim;

namespace {
QByteArray frameOf(char command, int busId, int address, const QByteArray& data,
                   char status = 'F') {
    QByteArray body(1, command);
    body += char(busId);
    body += char(address);
    body += data;
    body += status;
    body += Etx;
    return QByteArray(1, Stx) + body + CheckCharacters(body);
}

struct Counts {
    int frames = 0;
    int priming = 0;
    int garbage = 0;
};

Counts scan(FrameScanner& scanner, const QByteArray& bytes) {
    std::vector<FrameScanner::Event> events;
    scanner.feed(bytes, events);
    Counts counts;
    for (const FrameScanner::Event& event : events) {
        if (event.kind == FrameScanner::Event::Frame)
            ++counts.frames;
        if (event.kind == FrameScanner::Event::Priming)
            counts.priming += int(event.bytes.size());
        if (event.kind == FrameScanner::Event::Garbage)
            counts.garbage += int(event.bytes.size());
    }
    return counts;
}

ModuleIdentity modelOf(const QString& text) {
    ModuleIdentity identity;
    ParseModel(text, identity);
    return identity;
}
}  // namespace

class TestSimModule : public QObject {
    Q_OBJECT
private slots:
    void workedFrames_data();
    void workedFrames();
    void checkOfAB();
    void replyEchoesRequest();
    void scanner_data();
    void scanner();
    void scannerWaitsForTheRestOfAFrame();

    void modelsAgreeWithProgram();
    void modelForms_data();
    void modelForms();
    void unknownTypeAnswersItsTypeOnly();

    void factoryStateIsUsable_data();
    void factoryStateIsUsable();
    void factoryTables();

    void commandLine_data();
    void commandLine();
    void commandLineErrors_data();
    void commandLineErrors();
};

void TestSimModule::workedFrames_data() {
    QTest::addColumn<QByteArray>("frame");
    QTest::addColumn<int>("address");
    QTest::newRow("register 255") << QByteArray::fromHex("025210ff333033303330333046033037") << 255;
    QTest::newRow("register 20") << QByteArray::fromHex("02521014333033303330333046033e3c") << 20;
}

void TestSimModule::workedFrames() {
    QFETCH(QByteArray, frame);
    QFETCH(int, address);
    Request request;
    QVERIFY(DecodeRequest(frame, request));
    QCOMPARE(request.command, 'R');
    QCOMPARE(request.busId, 16);
    QCOMPARE(request.address, address);
    QCOMPARE(frameOf('R', 16, address, "30303030"), frame);
}

void TestSimModule::checkOfAB() {
    // 0xFF XOR 'T' is 0xAB.
    QCOMPARE(CheckCharacters("T"), QByteArray(":;"));
}

void TestSimModule::replyEchoesRequest() {
    Request request;
    QVERIFY(DecodeRequest(frameOf('W', 24, 98, "41424344"), request));
    const QByteArray reply = EncodeReply(request, "41424344", StatusDone);
    QCOMPARE(reply.size(), FrameSize);
    QCOMPARE(reply.left(4), frameOf('W', 24, 98, "41424344").left(4));
    QCOMPARE(reply.mid(4, 9), QByteArray("414243440"));
    QCOMPARE(reply.mid(14), CheckCharacters(reply.mid(1, 13)));
    const QByteArray corrupt = EncodeReply(request, "41424344", StatusDone, true);
    QCOMPARE(corrupt.left(14), reply.left(14));
    QVERIFY(corrupt.mid(14) != reply.mid(14));
}

void TestSimModule::scanner_data() {
    QTest::addColumn<QByteArray>("bytes");
    QTest::addColumn<int>("frames");
    QTest::addColumn<int>("garbage");
    QTest::addColumn<int>("priming");
    const QByteArray good = frameOf('R', 16, 83, "30303030");
    QByteArray badCheck = good;
    badCheck[15] = char(badCheck[15] ^ 1);
    QTest::newRow("clean frame") << good << 1 << 0 << 0;
    QTest::newRow("noise before") << QByteArray("abc") + good << 1 << 3 << 0;
    QTest::newRow("bad check then good") << badCheck + good << 1 << 16 << 0;
    QTest::newRow("truncated then whole") << good.left(9) + good << 1 << 9 << 0;
    QTest::newRow("stray STX before") << QByteArray(1, Stx) + good << 1 << 1 << 0;
    QTest::newRow("priming blocks then frame")
        << QByteArray(32, PrimingByte) + good << 1 << 0 << 32;
    QTest::newRow("frame then priming") << good + QByteArray(16, PrimingByte) << 1 << 0 << 16;
    QTest::newRow("bus ID 100 inside a frame") << frameOf('R', 100, 100, "30303030") << 1 << 0 << 0;
    QTest::newRow("unknown command") << frameOf('X', 16, 83, "30303030") << 0 << 16 << 0;
    QTest::newRow("write data not nibbles") << frameOf('W', 16, 83, "0000ABCD") << 0 << 16 << 0;
    QTest::newRow("request status not F") << frameOf('R', 16, 83, "30303030", '0') << 0 << 16 << 0;
}

void TestSimModule::scanner() {
    QFETCH(QByteArray, bytes);
    QFETCH(int, frames);
    QFETCH(int, garbage);
    QFETCH(int, priming);
    FrameScanner scanner;
    const Counts counts = scan(scanner, bytes);
    QCOMPARE(counts.frames, frames);
    QCOMPARE(counts.garbage, garbage);
    QCOMPARE(counts.priming, priming);
    QCOMPARE(scanner.pending(), 0);
}

void TestSimModule::scannerWaitsForTheRestOfAFrame() {
    FrameScanner scanner;
    const QByteArray frame = frameOf('W', 16, 77, "00000004");
    const Counts first = scan(scanner, frame.left(5));
    QCOMPARE(first.frames + first.garbage, 0);
    QCOMPARE(scanner.pending(), 5);
    std::vector<FrameScanner::Event> events;
    scanner.feed(frame.mid(5), events);
    QCOMPARE(int(events.size()), 1);
    QCOMPARE(events[0].request.command, 'W');
    QCOMPARE(events[0].request.address, 77);
    QCOMPARE(events[0].request.data, QByteArray("00000004"));
}

void TestSimModule::modelsAgreeWithProgram() {
    const QStringList models = KnownModels().split(QStringLiteral(", "));
    QCOMPARE(models.size(), 17);
    for (const QString& model : models) {
        ModuleIdentity identity;
        QVERIFY2(ParseModel(model, identity), qPrintable(model));
        QCOMPARE(ModelText(identity.typeCode, qint16(identity.subType)), model);
        QCOMPARE(FamilyOfType(identity.typeCode), GetModMap(identity.typeCode));
        QCOMPARE(ModelName(identity.typeCode, identity.subType), model);
    }
    QCOMPARE(FamilyOfType(11), 0);
    QCOMPARE(GetModMap(11), int(UnknownModuleMap));
}

void TestSimModule::modelForms_data() {
    QTest::addColumn<QString>("text");
    QTest::addColumn<bool>("known");
    QTest::addColumn<int>("typeCode");
    QTest::addColumn<int>("subType");
    QTest::newRow("lower case") << "kv718-1a" << true << 10 << 3;
    QTest::newRow("code and sub-type") << "7:5" << true << 7 << 5;
    QTest::newRow("negative sub-type") << "7:-1" << true << 7 << -1;
    QTest::newRow("code alone takes its first model") << "9" << true << 9 << 0;
    QTest::newRow("KV720 code starts as mV input") << "5" << true << 5 << 1;
    QTest::newRow("code outside the families") << "42" << true << 42 << 0;
    QTest::newRow("unknown text") << "KV999-20" << false << 0 << 0;
    QTest::newRow("bad sub-type") << "7:x" << false << 0 << 0;
    QTest::newRow("code too big") << "300" << false << 0 << 0;
}

void TestSimModule::modelForms() {
    QFETCH(QString, text);
    QFETCH(bool, known);
    QFETCH(int, typeCode);
    QFETCH(int, subType);
    ModuleIdentity identity;
    QCOMPARE(ParseModel(text, identity), known);
    if (!known)
        return;
    QCOMPARE(identity.typeCode, typeCode);
    QCOMPARE(identity.subType, subType);
}

void TestSimModule::unknownTypeAnswersItsTypeOnly() {
    ModuleIdentity identity;
    identity.typeCode = 42;
    SimModule module(identity);
    QCOMPARE(module.value(RegMap().Mod_Type), 42);
    Request request;
    request.command = 'R';
    request.busId = 16;
    request.address = 76;
    QCOMPARE(module.handle(request).data, QByteArray("00000000"));
}

void TestSimModule::factoryStateIsUsable_data() {
    QTest::addColumn<QString>("model");
    for (const char* model : {"KV714-20", "KV716-20", "KV720-20", "KV714-22", "KV718-20",
                              "KV716-22", "KV760-20", "KV718-1A"})
        QTest::newRow(model) << QString(model);
}

// What every programming run and the live display need from a fresh module.
void TestSimModule::factoryStateIsUsable() {
    QFETCH(QString, model);
    const SimModule module(modelOf(model));
    const int family = GetModMap(module.identity().typeCode);
    const RegMap map = RegMapFor(family);
    const auto at = [&](qint32 address) { return module.value(address); };

    // Range calibration: every count set; pairs rise from minimum to maximum with room
    // for a zero 5 % of full scale below a 4-20 mA minimum ("Output Zero too low").
    QVERIFY(map.Rng_First > 0);
    const bool pairs = family != 3;
    for (int address = map.Rng_First; address <= map.Rng_Last; ++address) {
        QVERIFY2(at(address) != 0, qPrintable(QString::number(address)));
        if (!pairs || address % 2)
            continue;
        const qint32 low = at(address);
        const qint32 high = at(address + 1);
        QVERIFY(low < high);
        QVERIFY(low - 0.0625 * (high - low) >= 0);
        if (family <= 2)
            QVERIFY(high < 4090);  // first-version readings stay below "Input Hi"
    }

    // User calibration the program converts back: no count may be 0.
    for (qint32 address : {map.Usr_In1_Z, map.Usr_In1_F, map.Usr_Out1_Z, map.Usr_Out1_F,
                           map.Sig_Lmt1_Z, map.Sig_Lmt1_F, map.Usr_Out2_Z, map.Usr_Out2_F})
        if (address >= 0)
            QVERIFY2(at(address) != 0, qPrintable(QString::number(address)));
    for (qint32 address : {map.Sw_In1, map.Sw_Out1, map.Sw_Out2})
        if (address >= 0)
            QCOMPARE(at(address), 15);

    // Excitation sources: a band whose ends coincide cannot be converted back.
    const std::pair<qint32, qint32> bands[] = {{map.IS_ZS1, map.IS_FS1},
                                               {map.IS_ZS2, map.IS_FS2},
                                               {map.VS_ZS1, map.VS_FS1},
                                               {map.VS_ZS2, map.VS_FS2}};
    for (const auto& [zero, full] : bands)
        if (zero >= 0)
            QVERIFY(at(full) > at(zero) && at(zero) > 0);

    if (family == 3) {
        QVERIFY(at(map.CIN_F) > at(map.CIN_Z));
        QVERIFY(at(map.COUT_F) > at(map.COUT_Z) && at(map.COUT_Z) > 0);
        QVERIFY(at(map.SLOP_P) > 0 && at(map.SLOP_N) > 0);
        // Read back untrimmed: the trim markers agree with the calibration.
        QCOMPARE(at(map.Gain_Factor), 10000);
        QCOMPARE(at(map.Orig_OS_PWM), at(map.Usr_In1_Z));
        QCOMPARE(at(map.Orig_FlagA), at(map.Flag_A));
        QCOMPARE(at(map.Minor_Cal), 0);
    }
    const qint32 reading = at(map.Input_Reading);
    if (family > 2)
        QVERIFY(reading >= -500 && reading <= 10500);
}

void TestSimModule::factoryTables() {
    const SimModule module(modelOf("KV720-20"));
    const std::vector<qint32> table1 = module.table1();
    QCOMPARE(int(table1.size()), Table1Points);
    QCOMPARE(table1[0], 0);
    QCOMPARE(table1[100], 10000);
    QVERIFY(std::is_sorted(table1.begin(), table1.begin() + 101));
    quint32 x = 0;
    for (int i = 0; i <= 100; ++i)
        x ^= quint32(table1[i]);
    QCOMPARE(table1[101], qint32(~x & 0xFFFF));

    const std::vector<qint32> tableC = module.tableC();
    QCOMPARE(int(tableC.size()), TableCPoints);
    x = 0;
    for (int i = 0; i <= 50; ++i)
        x ^= quint32(tableC[i]);
    QCOMPARE(tableC[51], qint32(~x & 0xFFFF));
    QCOMPARE(module.fileName().size(), FileNameLength);
}

void TestSimModule::commandLine_data() {
    QTest::addColumn<QStringList>("arguments");
    QTest::addColumn<int>("typeCode");
    QTest::addColumn<int>("subType");
    QTest::addColumn<int>("serial");
    QTest::addColumn<int>("revision");
    QTest::addColumn<int>("port");
    QTest::newRow("defaults") << QStringList() << 4 << 1 << 100001 << 0x0203 << 1;
    QTest::newRow("module chosen")
        << QStringList{"--model", "KV718-1A", "--serial", "77", "--revision", "2.3", "--port", "3"}
        << 10 << 3 << 77 << 515 << 3;
    QTest::newRow("code and plain revision")
        << QStringList{"--model", "8:1", "--revision", "1027"} << 8 << 1 << 100001 << 1027 << 1;
}

void TestSimModule::commandLine() {
    QFETCH(QStringList, arguments);
    QFETCH(int, typeCode);
    QFETCH(int, subType);
    QFETCH(int, serial);
    QFETCH(int, revision);
    QFETCH(int, port);
    SimCommandLine command;
    QString error;
    QVERIFY2(ParseSimArguments(QStringList{"kv700-sim"} + arguments, command, error),
             qPrintable(error));
    const ModuleIdentity& module = command.options.module;
    QCOMPARE(module.typeCode, typeCode);
    QCOMPARE(module.subType, subType);
    QCOMPARE(module.serial, serial);
    QCOMPARE(module.revision, revision);
    QCOMPARE(command.port, port);
    // The module swapped in by default differs only in its serial number.
    QCOMPARE(command.options.faults.swapTo.typeCode, typeCode);
    QCOMPARE(command.options.faults.swapTo.serial, serial + 1);
}

void TestSimModule::commandLineErrors_data() {
    QTest::addColumn<QStringList>("arguments");
    QTest::addColumn<QString>("message");
    QTest::newRow("unknown model") << QStringList{"--model", "KV999"} << "unknown model";
    QTest::newRow("adapter type") << QStringList{"--adapter", "2"} << "--adapter";
    QTest::newRow("port zero") << QStringList{"--port", "0"} << "--port";
    QTest::newRow("minor above 255") << QStringList{"--revision", "2.300"} << "--revision";
    QTest::newRow("negative drop") << QStringList{"--drop-every", "-1"} << "--drop-every";
    QTest::newRow("stray argument") << QStringList{"COM3"} << "COM3";
}

void TestSimModule::commandLineErrors() {
    QFETCH(QStringList, arguments);
    QFETCH(QString, message);
    SimCommandLine command;
    QString error;
    QVERIFY(!ParseSimArguments(QStringList{"kv700-sim"} + arguments, command, error));
    QVERIFY2(error.contains(message), qPrintable(error));
}

QTEST_GUILESS_MAIN(TestSimModule)
#include "tst_simmodule.moc"
