// kv700-cli: its command line, and the real program against the module simulator.
#include "cli/cli_args.h"
#include "cli/cli_registers.h"
#include "model/codec.h"
#include "model/module_types.h"
#include "model/register_map.h"
#include "sim/simulator.h"

#include <QProcess>
#include <QTemporaryDir>
#include <QtTest>

using namespace kv;
using namespace kv::cli;
using namespace kv::sim;

Q_DECLARE_METATYPE(kv::cli::Command)

namespace {
struct Run {
    int exitCode = -1;
    QString out;
    QString err;
};

Run runCli(const QStringList& arguments, const QProcessEnvironment& environment = {}) {
    QProcess process;
    if (!environment.isEmpty())
        process.setProcessEnvironment(environment);
    process.start(QStringLiteral(KV700_CLI_PATH), arguments);
    Run run;
    if (!process.waitForFinished(180000)) {
        process.kill();
        process.waitForFinished();
        return run;
    }
    run.exitCode = process.exitStatus() == QProcess::NormalExit ? process.exitCode() : -1;
    run.out = QString::fromUtf8(process.readAllStandardOutput());
    run.err = QString::fromUtf8(process.readAllStandardError());
    return run;
}

// One simulated module published as a COM port of its own for one test.
class SimPort {
public:
    explicit SimPort(const ModuleIdentity& module = {}, int adapter = 0, SimFaults faults = {})
        : sim(optionsFor(module, adapter, faults)), port(nextPort++) {
        QString error;
        ok = sim.start(error) && sim.publishAsPort(port, error);
        if (!ok)
            qWarning() << "simulator:" << error;
    }
    // The command line of kv700-cli for this port.
    QStringList args(const QStringList& command) const {
        return QStringList{"--port", QString::number(port)} + command;
    }
    int writesSeen() const {
        int writes = 0;
        for (const SimLogEntry& entry : sim.log())
            writes += entry.kind == SimLogEntry::Request && entry.command == 'W';
        return writes;
    }

    Simulator sim;
    int port;
    bool ok = false;

private:
    static SimOptions optionsFor(const ModuleIdentity& module, int adapter,
                                 const SimFaults& faults) {
        SimOptions options;
        options.module = module;
        options.adapter = adapter;
        options.faults = faults;
        return options;
    }
    static inline int nextPort = 1;
};

ModuleIdentity kv720(qint32 serial) {
    ModuleIdentity module;
    module.typeCode = 4;  // KV720-20
    module.serial = serial;
    module.revision = 0x0203;
    module.busId = 5;
    return module;
}

int kv720Address(qint32 RegMap::*member) {
    return RegMapFor(Kv720Map).*member;
}

// The text of a .kv7 file with one `"key",value` line replaced.
QByteArray withLine(const QByteArray& file, const QByteArray& key, const QByteArray& value) {
    QList<QByteArray> lines = file.split('\n');
    for (QByteArray& line : lines)
        if (line.startsWith('"' + key + "\","))
            line = '"' + key + "\"," + value + '\r';
    return lines.join('\n');
}

QByteArray readFile(const QString& name) {
    QFile file(name);
    return file.open(QIODevice::ReadOnly) ? file.readAll() : QByteArray();
}

// A failed command prints nothing on standard output and exits with 1.
void verifyFailed(const Run& run) {
    QCOMPARE(run.exitCode, 1);
    QVERIFY(run.out.isEmpty());
}

bool writeFile(const QString& name, const QByteArray& bytes) {
    QFile file(name);
    return file.open(QIODevice::WriteOnly) && file.write(bytes) == bytes.size();
}
}  // namespace

class TestCli : public QObject {
    Q_OBJECT
private slots:
    void initTestCase();
    void parsesCommands_data();
    void parsesCommands();
    void usageErrors_data();
    void usageErrors();
    void usageErrorsExitWithTwo();
    void helpGoesToStandardOutput();
    void setRefusesWhatTheViewerRefuses();
    void valuesDecodedByTheMap();

    void probeFindsAndIdentifyPrintsTheModule();
    void getAndSetRoundTrip();
    void regsListsTheMap();
    void selfTestOfAPrimedAdapter();
    void missingPortFails();
    void refusedRequestFails();
    void moduleGoingSilentFails();
    void readThenProgramRoundTrip();
    void programRefusesAnotherModel();
    void programRefusesAnUnreadableFile();

private:
    QTemporaryDir ports_;
    QTemporaryDir files_;
};

void TestCli::initTestCase() {
    QVERIFY(ports_.isValid() && files_.isValid());
    // The simulators publish their ports here, and kv700-cli inherits it.
    qputenv("KV700_PORT_DIR", QFile::encodeName(ports_.path()));
}

void TestCli::parsesCommands_data() {
    QTest::addColumn<QStringList>("arguments");
    QTest::addColumn<Command>("command");
    QTest::addColumn<int>("port");  // -1: not given
    QTest::addColumn<int>("adapter");
    QTest::addColumn<QString>("device");
    QTest::addColumn<int>("address");
    QTest::addColumn<int>("busId");
    QTest::addColumn<double>("value");
    QTest::addColumn<bool>("asFloat");
    QTest::addColumn<QString>("file");

    QTest::newRow("probe") << QStringList{"probe"} << Command::Probe << -1 << -1 << "" << 0 << 16
                           << 0.0 << false << "";
    QTest::newRow("port before") << QStringList{"--port", "5", "identify"} << Command::Identify << 5
                                 << -1 << "" << 0 << 16 << 0.0 << false << "";
    QTest::newRow("port after, with =") << QStringList{"identify", "--port=7"} << Command::Identify
                                        << 7 << -1 << "" << 0 << 16 << 0.0 << false << "";
    QTest::newRow("device, get with id")
        << QStringList{"--device", "/dev/pts/9", "get", "40", "--id", "20"} << Command::Get << -1
        << -1 << "/dev/pts/9" << 40 << 20 << 0.0 << false << "";
    QTest::newRow("negative whole value") << QStringList{"set", "40", "-5"} << Command::Set << -1
                                          << -1 << "" << 40 << 16 << -5.0 << false << "";
    QTest::newRow("float value") << QStringList{"set", "41", "1.5", "--float"} << Command::Set << -1
                                 << -1 << "" << 41 << 16 << 1.5 << true << "";
    QTest::newRow("adapter 1") << QStringList{"--adapter", "1", "selftest"} << Command::SelfTest
                               << -1 << 1 << "" << 0 << 16 << 0.0 << false << "";
    QTest::newRow("read") << QStringList{"read", "--out", "a.kv7"} << Command::Read << -1 << -1
                          << "" << 0 << 16 << 0.0 << false << "a.kv7";
    QTest::newRow("program") << QStringList{"--port", "3", "program", "b.kv7"} << Command::Program
                             << 3 << -1 << "" << 0 << 16 << 0.0 << false << "b.kv7";
    QTest::newRow("help wins") << QStringList{"get", "--help"} << Command::Help << -1 << -1 << ""
                               << 0 << 16 << 0.0 << false << "";
}

void TestCli::parsesCommands() {
    QFETCH(QStringList, arguments);
    const ParseOutcome outcome = ParseArguments(arguments);
    QVERIFY2(outcome.ok, qPrintable(outcome.error));
    const CliRequest& r = outcome.request;
    QTEST(r.command, "command");
    QTEST(r.port ? int(*r.port) : -1, "port");
    QTEST(r.adapter ? int(*r.adapter) : -1, "adapter");
    QTEST(r.device, "device");
    QTEST(int(r.address), "address");
    QTEST(int(r.busId), "busId");
    QTEST(r.value, "value");
    QTEST(r.asFloat, "asFloat");
    QTEST(r.file, "file");
}

void TestCli::usageErrors_data() {
    QTest::addColumn<QStringList>("arguments");
    QTest::addColumn<QString>("error");

    QTest::newRow("nothing") << QStringList{} << "no command given";
    QTest::newRow("unknown command") << QStringList{"flash"} << "unknown command flash";
    QTest::newRow("unknown option")
        << QStringList{"--baud", "9600", "probe"} << "unknown option --baud";
    QTest::newRow("get without address") << QStringList{"get"} << "get takes 1 argument(s), not 0";
    QTest::newRow("set without value")
        << QStringList{"set", "40"} << "set takes 2 argument(s), not 1";
    QTest::newRow("address beyond a byte")
        << QStringList{"get", "256"} << "a register address is a whole number from 0 to 255";
    QTest::newRow("address not a number")
        << QStringList{"get", "x1"} << "a register address is a whole number from 0 to 255";
    QTest::newRow("bus id beyond a byte")
        << QStringList{"get", "40", "--id", "300"} << "--id needs a bus ID from 0 to 255";
    QTest::newRow("fraction without --float")
        << QStringList{"set", "40", "1.5"}
        << "1.5 is not a 32-bit whole number (use --float for a floating value)";
    QTest::newRow("beyond 32 bits")
        << QStringList{"set", "40", "2147483648"}
        << "2147483648 is not a 32-bit whole number (use --float for a floating value)";
    QTest::newRow("comma as decimal point")
        << QStringList{"set", "40", "1,5", "--float"} << "1,5 is not a floating value";
    QTest::newRow("port and device") << QStringList{"--port", "2", "--device", "/dev/x", "probe"}
                                     << "--port and --device exclude each other";
    QTest::newRow("port not a number")
        << QStringList{"--port", "COM3", "probe"} << "--port needs a port number from 0 to 32767";
    QTest::newRow("adapter 2") << QStringList{"--adapter", "2", "probe"}
                               << "--adapter must be 0 or 1";
    QTest::newRow("option value missing")
        << QStringList{"probe", "--port"} << "--port needs a value";
    QTest::newRow("option of another command")
        << QStringList{"probe", "--id", "3"} << "--id does not apply to probe";
    QTest::newRow("read without --out") << QStringList{"read"} << "read needs --out FILE.kv7";
    QTest::newRow("twice") << QStringList{"--port", "1", "--port", "2", "probe"}
                           << "--port given twice";
    QTest::newRow("flag with a value")
        << QStringList{"--verbose=yes", "probe"} << "--verbose takes no value";
}

void TestCli::usageErrors() {
    QFETCH(QStringList, arguments);
    const ParseOutcome outcome = ParseArguments(arguments);
    QVERIFY(!outcome.ok);
    QTEST(outcome.error, "error");
}

void TestCli::usageErrorsExitWithTwo() {
    const Run run = runCli({"get", "x1"});
    QCOMPARE(run.exitCode, 2);
    QVERIFY(run.out.isEmpty());
    QVERIFY(run.err.startsWith("kv700-cli: a register address is a whole number from 0 to 255"));
    QVERIFY(run.err.contains(UsageText()));
}

void TestCli::helpGoesToStandardOutput() {
    const Run run = runCli({"--help"});
    QCOMPARE(run.exitCode, 0);
    QCOMPARE(run.out, UsageText());
    QVERIFY(run.err.isEmpty());
}

void TestCli::setRefusesWhatTheViewerRefuses() {
    SetRegMap(RegAdd, 3);
    QVERIFY(SetRefusal(RegAdd.Usr_Out1_Z, false).isEmpty());
    QCOMPARE(SetRefusal(RegAdd.Revision, false),
             QStringLiteral("Register %1 is not writable").arg(RegAdd.Revision));
    const int engineering = qRound(RegAdd.Eng_In_Z);
    QVERIFY(SetRefusal(engineering, true).isEmpty());
    QCOMPARE(SetRefusal(engineering, false),
             QStringLiteral("Register %1 holds a floating value: give --float").arg(engineering));
    QCOMPARE(SetRefusal(RegAdd.Usr_Out1_Z, true),
             QStringLiteral("Register %1 holds a whole number: leave out --float")
                 .arg(RegAdd.Usr_Out1_Z));
    SetRegMap(RegAdd, NoModuleMap);
}

void TestCli::valuesDecodedByTheMap() {
    SetRegMap(RegAdd, 3);
    RegVal.Eng_In_Z = 2.5f;
    const int engineering = qRound(RegAdd.Eng_In_Z);
    QCOMPARE(DataAndValue(engineering, 16, SingleToWire(2.5f)),
             QString::fromLatin1(SingleToWire(2.5f)) + "\t2.5\n");
    // Another bus ID, or an address in no member: the field as a whole number.
    QCOMPARE(DataAndValue(engineering, 20, LongToWire(77)),
             QString::fromLatin1(LongToWire(77)) + "\t77\n");
    SetRegMap(RegAdd, NoModuleMap);
}

void TestCli::probeFindsAndIdentifyPrintsTheModule() {
    SimPort module(kv720(123457));
    QVERIFY(module.ok);
    Run run = runCli({"probe"});
    QCOMPARE(run.exitCode, 0);
    QVERIFY2(run.out.split('\n').contains(QStringLiteral("Com%1 KV720-20").arg(module.port)),
             qPrintable(run.out));
    QVERIFY(run.err.isEmpty());

    run = runCli(module.args({"identify"}));
    QCOMPARE(run.exitCode, 0);
    QCOMPARE(run.out, QStringLiteral("Model\tKV720-20\nSerial number\t123457\nRevision\t2.003\n"
                                     "Bus ID\t5\n"));
    QVERIFY(run.err.contains("Run Mode"));

    run = runCli({"--device", module.sim.slavePath(), "identify"});
    QCOMPARE(run.exitCode, 0);
    QVERIFY2(run.out.contains("Serial number\t123457\n"), qPrintable(run.out));
}

void TestCli::getAndSetRoundTrip() {
    SimPort module(kv720(100010));
    QVERIFY(module.ok);
    const int zero = kv720Address(&RegMap::Usr_Out1_Z);
    Run run = runCli(module.args({"set", QString::number(zero), "-1234"}));
    QCOMPARE(run.exitCode, 0);
    QCOMPARE(run.out, QString::fromLatin1(LongToWire(-1234)) + "\t-1234\n");
    QCOMPARE(module.sim.registerValue(zero), -1234);

    module.sim.setRegisterValue(zero, 4321);
    run = runCli(module.args({"get", QString::number(zero)}));
    QCOMPARE(run.exitCode, 0);
    QCOMPARE(run.out, QString::fromLatin1(LongToWire(4321)) + "\t4321\n");

    const int engineering = qRound(RegMapFor(Kv720Map).Eng_In_Z);
    run = runCli(module.args({"set", QString::number(engineering), "2.5", "--float"}));
    QCOMPARE(run.exitCode, 0);
    QCOMPARE(run.out, QString::fromLatin1(SingleToWire(2.5f)) + "\t2.5\n");
    QCOMPARE(module.sim.registerValue(engineering), WireToLong(SingleToWire(2.5f)));

    const int writes = module.writesSeen();
    run = runCli(module.args({"set", QString::number(engineering), "3"}));
    verifyFailed(run);
    QVERIFY(run.err.endsWith(
        QStringLiteral("Register %1 holds a floating value: give --float\n").arg(engineering)));
    QCOMPARE(module.sim.registerValue(engineering), WireToLong(SingleToWire(2.5f)));
    QCOMPARE(module.writesSeen(), writes);
}

void TestCli::regsListsTheMap() {
    SimPort module(kv720(100012));
    QVERIFY(module.ok);
    const int serial = kv720Address(&RegMap::Serial_No);
    const Run run = runCli(module.args({"regs"}));
    QCOMPARE(run.exitCode, 0);
    QStringList lines = run.out.split('\n');
    QCOMPARE(lines.takeLast(), QString());
    QCOMPARE(lines.takeFirst(), QStringLiteral("Add\tValue\tDescription"));
    const RegMap map = RegMapFor(Kv720Map);
    // Every address of the image, then the power and type registers.
    QCOMPARE(lines.size(), map.Highest_Reg - map.Lowest_Reg + 1 + 2);
    QCOMPARE(lines.first().section('\t', 0, 0).toInt(), map.Lowest_Reg);
    QCOMPARE(lines.last(), QStringLiteral("255\t4\tModule Type"));
    QVERIFY(
        lines.contains(QStringLiteral("%1\t100012\tSerial number").arg(serial, 3, 10, QChar('0'))));
    // Each listed register was read again at bus ID 16; identification reads
    // with its phase marks instead.
    QSet<int> readAt16;
    for (const SimLogEntry& entry : module.sim.log())
        if (entry.kind == SimLogEntry::Request && entry.command == 'R' && entry.busId == 16)
            readAt16 << entry.address;
    for (const QString& line : lines)
        QVERIFY2(readAt16.contains(line.section('\t', 0, 0).toInt()), qPrintable(line));
}

void TestCli::selfTestOfAPrimedAdapter() {
    SimPort primed(kv720(100014), 1);
    QVERIFY(primed.ok);
    Run run = runCli(primed.args({"selftest"}));
    QCOMPARE(run.exitCode, 0);
    QVERIFY2(run.out.startsWith("PASS KV705 !!! "), qPrintable(run.out));
    QVERIFY(run.err.isEmpty());

    // A plain adapter's output stops at once: too short a decay.
    SimPort plain(kv720(100015), 0);
    QVERIFY(plain.ok);
    run = runCli(plain.args({"selftest"}));
    verifyFailed(run);
    QVERIFY2(run.err.startsWith("FAIL KV705 decay"), qPrintable(run.err));
}

void TestCli::missingPortFails() {
    // Port 31 has no link and no device of the built-in table.
    Run run = runCli({"--port", "31", "identify"});
    verifyFailed(run);
    QVERIFY2(run.err.endsWith("Communicate:% >> COM closed\n"), qPrintable(run.err));

    run = runCli({"--device", files_.filePath("no-such-tty"), "get", "40"});
    verifyFailed(run);
    QVERIFY2(run.err.endsWith("Communicate:% >> COM closed\n"), qPrintable(run.err));

    run = runCli({"--port", "31", "selftest"});
    QCOMPARE(run.exitCode, 1);
    QCOMPARE(run.err, QStringLiteral("FAIL KV705 %\n"));
}

void TestCli::refusedRequestFails() {
    SimPort module(kv720(100016));
    QVERIFY(module.ok);
    Run run = runCli(module.args({"get", "15"}));
    verifyFailed(run);
    QVERIFY(run.err.endsWith("Address < 16 not allowed\n"));

    run = runCli(module.args({"get", "40", "--id", "15"}));
    QCOMPARE(run.exitCode, 1);
    QVERIFY(run.err.endsWith("ID must be 16 or above\n"));
}

void TestCli::moduleGoingSilentFails() {
    // Identification reads the module type and the whole image; the module
    // then answers five reads of the register list and falls silent.
    const RegMap map = RegMapFor(Kv720Map);
    SimFaults faults;
    faults.deadAfter = 1 + map.Highest_Reg - map.Lowest_Reg + 1 + 5;
    SimPort module(kv720(100019), 0, faults);
    QVERIFY(module.ok);
    const Run run = runCli(module.args({"regs"}));
    verifyFailed(run);
    QVERIFY2(run.err.endsWith("Too many retries:\n"), qPrintable(run.err));
    QVERIFY(run.err.contains(QStringLiteral("Register 6 of ")));
}

void TestCli::readThenProgramRoundTrip() {
    SimPort module(kv720(100017));
    QVERIFY(module.ok);
    const QString first = files_.filePath("first");
    Run run = runCli(module.args({"read", "--out", first}));
    QCOMPARE(run.exitCode, 0);
    QCOMPARE(run.out, QStringLiteral("Saved: %1.kv7\n").arg(first));
    QVERIFY(run.err.contains("Step 1 of "));
    const QByteArray read = readFile(first + ".kv7");
    QVERIFY(read.contains("\"SerialNumb\",100017\r\n"));

    QByteArray edited = withLine(read, "FileName", "\"BENCH 7 PUMP        \"");
    edited = withLine(edited, "BussIdenti", "9");
    edited = withLine(edited, "Out1EngZro", "5");
    QVERIFY(edited != read);
    const QString second = files_.filePath("second.kv7");
    QVERIFY(writeFile(second, edited));

    run = runCli(module.args({"program", second}));
    QCOMPARE(run.exitCode, 0);
    QCOMPARE(run.out, QStringLiteral("Programmed\n"));
    QCOMPARE(module.sim.fileName(), QByteArray("BENCH 7 PUMP        "));
    QCOMPARE(module.sim.registerValue(kv720Address(&RegMap::Buss_ID)), 9);

    const QString third = files_.filePath("third.kv7");
    run = runCli(module.args({"read", "--out", third}));
    QCOMPARE(run.exitCode, 0);
    QCOMPARE(readFile(third), edited);
}

void TestCli::programRefusesAnotherModel() {
    SimPort module(kv720(100018));
    QVERIFY(module.ok);
    const QString name = files_.filePath("kv714.kv7");
    QVERIFY(writeFile(name, "\"ModTypeSet\",1\r\n\"BussIdenti\",3\r\n"));
    const Run run = runCli(module.args({"program", name}));
    verifyFailed(run);
    QString expected;
    QVERIFY(!CheckModType(1, Kv720Map, expected));
    QVERIFY2(run.err.endsWith(expected + "\n"), qPrintable(run.err));
    QCOMPARE(module.writesSeen(), 0);
}

void TestCli::programRefusesAnUnreadableFile() {
    const Run run = runCli({"--port", "31", "program", files_.filePath("absent.kv7")});
    verifyFailed(run);
    // The file is refused before any port is tried.
    QVERIFY2(run.err.startsWith("Failed: "), qPrintable(run.err));
    QVERIFY(!run.err.contains("Communicate"));
}

QTEST_GUILESS_MAIN(TestCli)
#include "tst_cli.moc"
