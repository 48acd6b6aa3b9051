// kv700-cli: its command line, and the real program against the module simulator.
#include "cli/cli_args.h"
#include "cli/cli_probe.h"
#include "cli/cli_registers.h"
#include "model/codec.h"
#include "model/register_map.h"

#include <QProcess>
#include <QtTest>

using namespace kv;
using namespace kv::cli;

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
}  // namespace

class TestCli : public QObject {
    Q_OBJECT
private slots:
    void parsesCommands_data();
    void parsesCommands();
    void usageErrors_data();
    void usageErrors();
    void usageErrorsExitWithTwo();
    void helpGoesToStandardOutput();
    void probeEntries_data();
    void probeEntries();
    void setRefusesWhatTheViewerRefuses();
    void valuesDecodedByTheMap();
};

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

void TestCli::probeEntries_data() {
    QTest::addColumn<bool>("answered");
    QTest::addColumn<QByteArray>("reply");
    QTest::addColumn<QString>("error");
    QTest::addColumn<QString>("entry");

    const QByteArray kv720 = QByteArray("R\x10\xFF") + LongToWire(4) + "0";
    QTest::newRow("module answers") << true << kv720 << ""
                                    << "Com7 KV720-20";
    QTest::newRow("no such port") << false << QByteArray() << "%"
                                  << "";
    QTest::newRow("port held") << false << QByteArray() << "/Port is use"
                               << "Com7/Port is use";
    QTest::newRow("port refused") << false << QByteArray() << "/Port file error 13"
                                  << "Com7/Port file error 13";
    QTest::newRow("silence") << false << QByteArray() << ""
                             << "Com7";
}

void TestCli::probeEntries() {
    QFETCH(bool, answered);
    QFETCH(QByteArray, reply);
    QFETCH(QString, error);
    QTEST(ProbeEntry(7, answered, reply, error), "entry");
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

QTEST_GUILESS_MAIN(TestCli)
#include "tst_cli.moc"
