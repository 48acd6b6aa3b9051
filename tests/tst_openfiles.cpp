// Handing a file from a second start of the program to the first: a real
// second kv700 process, and peers that send what no kv700 would.
#include "ui/app/open_files.h"

#include <QDir>
#include <QFile>
#include <QLocalSocket>
#include <QProcess>
#include <QSignalSpy>
#include <QTemporaryDir>
#include <QtTest>

using namespace kv;

namespace {
constexpr int PeerTimeoutMs = 300;
constexpr int WaitMs = 30000;

// A peer that sends `bytes` and reports whether the server dropped it.
bool droppedAfterSending(const QString& name, const QByteArray& bytes) {
    QLocalSocket peer;
    peer.connectToServer(name);
    if (!peer.waitForConnected(WaitMs))
        return false;
    if (!bytes.isEmpty()) {
        peer.write(bytes);
        peer.flush();
    }
    const bool dropped =
        QTest::qWaitFor([&peer] { return peer.state() == QLocalSocket::UnconnectedState; }, WaitMs);
    return dropped && peer.readAll().isEmpty();
}
}  // namespace

class TestOpenFiles : public QObject {
    Q_OBJECT
private slots:
    void initTestCase();
    void pathFromMessage_data();
    void pathFromMessage();
    void handOverBetweenTwoProcesses();
    void onlyOneFirstStart();
    void badPeersAreDropped_data();
    void badPeersAreDropped();
    void socketLeftByACrashIsReplaced();
    void nobodyToHandOverTo();

private:
    QTemporaryDir runtime_;
    QTemporaryDir config_;
};

void TestOpenFiles::initTestCase() {
    QVERIFY(runtime_.isValid());
    QVERIFY(config_.isValid());
    QFile::setPermissions(runtime_.path(), QFile::ReadOwner | QFile::WriteOwner | QFile::ExeOwner);
    qputenv("XDG_RUNTIME_DIR", runtime_.path().toLocal8Bit());
    qputenv("XDG_CONFIG_HOME", config_.path().toLocal8Bit());
    QVERIFY(OpenFilesServerName().startsWith(runtime_.path()));
}

void TestOpenFiles::pathFromMessage_data() {
    QTest::addColumn<QByteArray>("message");
    QTest::addColumn<QString>("path");
    QTest::newRow("non-ASCII") << QByteArray("/home/op/Pumpe \xc3\xbc.kv7")
                               << QString::fromUtf8("/home/op/Pumpe \xc3\xbc.kv7");
    QTest::newRow("empty") << QByteArray() << "";
    QTest::newRow("invalid UTF-8") << QByteArray("/home/\xff\xfe.kv7") << "";
    QTest::newRow("control character") << QByteArray("/home/a\tb.kv7") << "";
    QTest::newRow("NUL") << QByteArray("/home/a\0b.kv7", 13) << "";
}

void TestOpenFiles::pathFromMessage() {
    QFETCH(QByteArray, message);
    QTEST(PathFromMessage(message), "path");
}

void TestOpenFiles::handOverBetweenTwoProcesses() {
    OpenFilesServer first;
    QString error;
    QCOMPARE(first.listen(error), OpenFilesRole::First);
    QSignalSpy received(&first, &OpenFilesServer::fileReceived);

    QTemporaryDir work;
    QProcess second;
    second.setWorkingDirectory(work.path());
    QProcessEnvironment environment = QProcessEnvironment::systemEnvironment();
    environment.insert(QStringLiteral("QT_QPA_PLATFORM"), QStringLiteral("offscreen"));
    second.setProcessEnvironment(environment);
    // Relative, as a shell in another folder would pass it.
    second.start(QStringLiteral(KV700_PROGRAM), {QStringLiteral("Plant 7.kv7")});
    QVERIFY(second.waitForStarted(WaitMs));

    QTRY_COMPARE_WITH_TIMEOUT(received.count(), 1, WaitMs);
    QCOMPARE(received.at(0).at(0).toString(), QDir(work.path()).filePath("Plant 7.kv7"));
    // The second start ends by itself, without a main window of its own.
    QTRY_VERIFY_WITH_TIMEOUT(second.state() == QProcess::NotRunning, WaitMs);
    QCOMPARE(second.exitStatus(), QProcess::NormalExit);
    QCOMPARE(second.exitCode(), 0);
}

void TestOpenFiles::onlyOneFirstStart() {
    const QString name = runtime_.filePath(QStringLiteral("only-one"));
    OpenFilesServer first(name);
    OpenFilesServer second(name);
    QString error;
    QCOMPARE(first.listen(error), OpenFilesRole::First);
    QCOMPARE(second.listen(error), OpenFilesRole::Second);
}

void TestOpenFiles::badPeersAreDropped_data() {
    QTest::addColumn<QByteArray>("bytes");
    QTest::newRow("nothing at all") << QByteArray();
    QTest::newRow("no end of line") << QByteArray("/home/op/plant.kv7");
    QTest::newRow("invalid UTF-8") << QByteArray("\xff\xfe\xfd\n");
    QTest::newRow("huge") << QByteArray(OpenFilesMaxMessage + 4096, 'a');
    QTest::newRow("huge line") << QByteArray(OpenFilesMaxMessage + 10, 'a') + '\n';
}

void TestOpenFiles::badPeersAreDropped() {
    QFETCH(QByteArray, bytes);
    const QString name = runtime_.filePath(QStringLiteral("bad-peers"));
    OpenFilesServer server(name, PeerTimeoutMs);
    QString error;
    QCOMPARE(server.listen(error), OpenFilesRole::First);
    QSignalSpy received(&server, &OpenFilesServer::fileReceived);

    QVERIFY(droppedAfterSending(name, bytes));
    QCOMPARE(received.count(), 0);

    // The server goes on serving the next peer.
    QLocalSocket good;
    good.connectToServer(name);
    QVERIFY(good.waitForConnected(WaitMs));
    good.write("/home/op/plant.kv7\n");
    QTRY_COMPARE_WITH_TIMEOUT(received.count(), 1, WaitMs);
    QCOMPARE(received.at(0).at(0).toString(), QStringLiteral("/home/op/plant.kv7"));
    QByteArray answer;
    QTRY_COMPARE_WITH_TIMEOUT(answer += good.readAll(), QByteArray("OK\n"), WaitMs);
}

void TestOpenFiles::socketLeftByACrashIsReplaced() {
    const QString name = runtime_.filePath(QStringLiteral("crashed"));
    {
        QFile leftOver(name);
        QVERIFY(leftOver.open(QIODevice::WriteOnly));
    }
    OpenFilesServer server(name);
    QString error;
    QCOMPARE(server.listen(error), OpenFilesRole::First);
    QLocalSocket peer;
    peer.connectToServer(name);
    QVERIFY(peer.waitForConnected(WaitMs));
}

void TestOpenFiles::nobodyToHandOverTo() {
    QString error;
    QVERIFY(!SendFileToRunningInstance(QStringLiteral("/home/op/plant.kv7"), error,
                                       runtime_.filePath(QStringLiteral("nobody"))));
    QVERIFY(!error.isEmpty());
}

QTEST_GUILESS_MAIN(TestOpenFiles)
#include "tst_openfiles.moc"
