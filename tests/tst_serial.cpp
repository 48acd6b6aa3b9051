// The serial link against a real pseudo-terminal with a scripted peer.
#include "serial/adapter_test.h"
#include "serial/frame.h"
#include "serial/port_handle.h"
#include "serial/port_path.h"
#include "serial/transact.h"
#include "tests/support/diagnostic_capture.h"
#include "tests/support/pty_peer.h"

#include <QDir>
#include <QElapsedTimer>
#include <QFile>
#include <QtTest>

#include <fcntl.h>
#include <sys/file.h>
#include <sys/ioctl.h>
#include <unistd.h>

using namespace kv::KvSerialPort;

namespace {
QByteArray readMessage(quint8 address, quint8 bus = 16) {
    QByteArray m("R");
    m += char(bus);
    m += char(address);
    m += "30303030F";
    return m;
}

PeerResponder answerWith(const QByteArray& data) {
    return [data](const QByteArray& frame) {
        return std::vector<PeerChunk>{{0, PtyPeer::replyTo(frame, data)}};
    };
}

int openDescriptors() {
    return int(QDir("/proc/self/fd").entryList(QDir::NoDotAndDotDot | QDir::AllEntries).size());
}
}  // namespace

class TestSerial : public QObject {
    Q_OBJECT
private slots:
    void workedFrames_data();
    void workedFrames();
    void scanReply_data();
    void scanReply();

    void readsRegister();
    void replySplitOverTwoReads();
    void noiseBeforeReply();
    void badCheckThenGoodFrame();
    void foreignAddressTimesOut();
    void unansweredTableStepCountsAsDone();
    void primedAdapterGetsTwoBlocksBeforeEveryRead();
    void refusesMalformedRequests();

    void missingPort();
    void busyPortThenFree();
    void portNumberThroughPortDir();
    void silentReadReturnsNothing();
    void exclusivityReleasedAfterExchange();
    void noDescriptorLeak();

    void adapterSelfTest();
    void adapterSelfTestMissingPort();
};

void TestSerial::workedFrames_data() {
    QTest::addColumn<QByteArray>("message");
    QTest::addColumn<QByteArray>("frame");
    QTest::newRow("register 255") << readMessage(255)
                                  << QByteArray::fromHex("02521 0ff33303330333033304603 3037");
    QTest::newRow("register 20") << readMessage(20)
                                 << QByteArray::fromHex("025210143330333033303330460 33e3c");
}

void TestSerial::workedFrames() {
    QFETCH(QByteArray, message);
    QFETCH(QByteArray, frame);
    QCOMPARE(BuildFrame(message), frame);
}

void TestSerial::scanReply_data() {
    const QByteArray sent = BuildFrame(readMessage(20));
    const QByteArray good = PtyPeer::replyTo(sent, "00000123");
    QByteArray badCheck = good;
    badCheck[15] = badCheck[15] == '0' ? '1' : '0';
    QByteArray foreign = PtyPeer::replyTo(BuildFrame(readMessage(21)), "00000123");

    QTest::addColumn<QByteArray>("accumulator");
    QTest::addColumn<bool>("found");
    QTest::addColumn<QByteArray>("kept");  // what stays for the next read when not found
    QTest::newRow("whole reply") << good << true << QByteArray();
    QTest::newRow("noise first") << QByteArray("\x02xyz\x02R") + good << true << QByteArray();
    QTest::newRow("first five bytes") << good.left(5) << false << good.left(5);
    QTest::newRow("partial after noise")
        << QByteArray("abc") + good.left(14) << false << good.left(14);
    QTest::newRow("bad check then good") << badCheck + good << true << QByteArray();
    QTest::newRow("bad check alone") << badCheck << false << QByteArray();
    QTest::newRow("foreign address") << foreign << false << QByteArray();
    QTest::newRow("garbage") << QByteArray("dddddddddddddddd") << false << QByteArray();
}

void TestSerial::scanReply() {
    QFETCH(QByteArray, accumulator);
    QFETCH(bool, found);
    QFETCH(QByteArray, kept);
    const QByteArray sent = BuildFrame(readMessage(20));
    QByteArray reply;
    QCOMPARE(ScanReply(accumulator, sent, reply, false), found);
    if (found)
        QCOMPARE(reply, sent.mid(1, 3) + "00000123" + '0');
    else
        QCOMPARE(accumulator, kept);
}

void TestSerial::readsRegister() {
    PtyPeer peer;
    QVERIFY(peer.isReady());
    peer.setResponder(answerWith("0000?:00"));
    DiagnosticCapture capture;
    QByteArray reply;
    QString error = "untouched";
    bool fault = true;
    QVERIFY(Transact(peer.port(), readMessage(255), ConnectorPlain, true, reply, error, fault));
    QVERIFY(!fault);
    QCOMPARE(error, QString("untouched"));
    QCOMPARE(reply, QByteArray("R\x10\xFF"
                               "0000?:00"
                               "0"));
    QCOMPARE(peer.received(), BuildFrame(readMessage(255)));  // nothing but the frame went out
    QVERIFY(!capture.lines.empty());
    QCOMPARE(capture.lines.front().text, QString("0 >>>"));
    QCOMPARE(capture.lines.front().data, BuildFrame(readMessage(255)));
    QCOMPARE(capture.lines.front().kind, QString("St"));
}

void TestSerial::replySplitOverTwoReads() {
    PtyPeer peer;
    peer.setResponder([](const QByteArray& frame) {
        const QByteArray reply = PtyPeer::replyTo(frame, "00000042");
        // The gap exceeds the 10 ms inter-byte time-out, so the two parts arrive in separate reads.
        return std::vector<PeerChunk>{{0, reply.left(5)}, {40, reply.mid(5)}};
    });
    DiagnosticCapture capture;
    QByteArray reply;
    QString error;
    bool fault = false;
    QVERIFY(Transact(peer.port(), readMessage(20), ConnectorPlain, true, reply, error, fault));
    QCOMPARE(reply.mid(3, 8), QByteArray("00000042"));
    int unfinishedReads = 0;
    for (const CapturedLine& line : capture.lines)
        unfinishedReads += line.text.endsWith(" F") ? 1 : 0;
    QVERIFY(unfinishedReads >= 1);
}

void TestSerial::noiseBeforeReply() {
    PtyPeer peer;
    peer.setResponder([](const QByteArray& frame) {
        return std::vector<PeerChunk>{
            {0, QByteArray("\x02\xff noise") + PtyPeer::replyTo(frame, "00000007")}};
    });
    QByteArray reply;
    QString error;
    bool fault = false;
    QVERIFY(Transact(peer.port(), readMessage(20), ConnectorPlain, false, reply, error, fault));
    QCOMPARE(reply.mid(3, 8), QByteArray("00000007"));
}

void TestSerial::badCheckThenGoodFrame() {
    PtyPeer peer;
    peer.setResponder([](const QByteArray& frame) {
        QByteArray bad = PtyPeer::replyTo(frame, "00000001");
        bad[14] = char(bad[14] ^ 1);
        return std::vector<PeerChunk>{{0, bad + PtyPeer::replyTo(frame, "00000002")}};
    });
    DiagnosticCapture capture;
    QByteArray reply;
    QString error;
    bool fault = false;
    QVERIFY(Transact(peer.port(), readMessage(20), ConnectorPlain, true, reply, error, fault));
    QCOMPARE(reply.mid(3, 8), QByteArray("00000002"));
    QVERIFY(capture.hasText("Check Sum Failed"));
}

void TestSerial::foreignAddressTimesOut() {
    PtyPeer peer;
    peer.setResponder([](const QByteArray&) {
        return std::vector<PeerChunk>{
            {0, PtyPeer::replyTo(BuildFrame(readMessage(21)), "00000001")}};
    });
    QByteArray reply = "before";
    QString error = "untouched";
    bool fault = true;
    QVERIFY(!Transact(peer.port(), readMessage(20), ConnectorPlain, false, reply, error, fault));
    QVERIFY(!fault);
    QCOMPARE(error, QString("untouched"));
    QCOMPARE(reply, QByteArray("before"));
}

void TestSerial::unansweredTableStepCountsAsDone() {
    PtyPeer peer;
    QByteArray step("T");
    step += char(18);
    step += char(60);
    step += "00010002F";
    DiagnosticCapture capture;
    QByteArray reply;
    QString error;
    bool fault = true;
    QVERIFY(Transact(peer.port(), step, ConnectorPlain, false, reply, error, fault));
    QVERIFY(!fault);
    QCOMPARE(reply, step);  // the request itself, its "T" included
    QByteArray wire = step;
    wire[0] = 'W';
    QCOMPARE(peer.received(), BuildFrame(wire));
    QVERIFY(!capture.lines.empty());
    QVERIFY(capture.lines.back().text.endsWith(" Write Table Time Out"));
}

void TestSerial::primedAdapterGetsTwoBlocksBeforeEveryRead() {
    PtyPeer peer;
    QByteArray reply;
    QString error;
    bool fault = false;
    QVERIFY(!Transact(peer.port(), readMessage(20), ConnectorPrimed, false, reply, error, fault));
    const QByteArray frame = BuildFrame(readMessage(20));
    // The frame, then 20 read cycles each preceded by two 16-byte priming blocks.
    QCOMPARE(peer.received(), frame + QByteArray(ReadBudget * 32, 'd'));
}

void TestSerial::refusesMalformedRequests() {
    PtyPeer peer;
    QByteArray reply;
    QString error;
    bool fault = false;
    QVERIFY(!Transact(peer.port(),
                      "R\x10\x14"
                      "3030303F",
                      ConnectorPlain, false, reply, error, fault));
    QVERIFY(error.contains("length"));
    QVERIFY(!fault);

    QVERIFY(!Transact(peer.port(),
                      "X\x10\x14"
                      "30303030F",
                      ConnectorPlain, false, reply, error, fault));
    QCOMPARE(error, QString("/Unknown RWC"));
    QVERIFY(fault);
    QTest::qWait(30);
    QCOMPARE(peer.received(), QByteArray());  // neither went out
}

void TestSerial::missingPort() {
    QTemporaryDir empty;
    qputenv("KV700_PORT_DIR", empty.path().toLocal8Bit());
    QFile::link(empty.path() + "/nowhere", empty.path() + "/com7");  // dangling link: no device
    QByteArray reply;
    QString error;
    bool fault = false;
    QVERIFY(!Transact(7, readMessage(20), ConnectorPlain, false, reply, error, fault));
    QCOMPARE(error, QString("%"));
    QVERIFY(fault);
    PortHandle handle;
    QVERIFY(!OpenPort(31, handle, error));  // no built-in device either
    QCOMPARE(error, QString("%"));
    QVERIFY(!handle.isOpen());
}

void TestSerial::busyPortThenFree() {
    PtyPeer peer(3);
    const int holder = ::open(peer.slavePath().toLocal8Bit().constData(), O_RDWR | O_NOCTTY);
    QVERIFY(holder >= 0);
    QCOMPARE(flock(holder, LOCK_EX | LOCK_NB), 0);
    PortHandle handle;
    QString error;
    QVERIFY(!OpenPort(3, handle, error));
    QCOMPARE(error, QString("/Port is use"));
    QVERIFY(!handle.isOpen());
    ::close(holder);
    error.clear();
    QVERIFY(OpenPort(3, handle, error));
    QVERIFY(error.isEmpty());
}

void TestSerial::portNumberThroughPortDir() {
    PtyPeer peer(12);
    QCOMPARE(PortDevicePath(12), peer.portDir() + "/com12");
    peer.setResponder(answerWith("00000012"));
    QByteArray reply;
    QString error;
    bool fault = false;
    QVERIFY(Transact(12, readMessage(20), ConnectorPlain, false, reply, error, fault));
    QCOMPARE(reply.mid(3, 8), QByteArray("00000012"));
}

void TestSerial::silentReadReturnsNothing() {
    PtyPeer peer;
    PortHandle handle;
    QString error;
    QVERIFY(OpenPort(peer.port(), handle, error));
    char buffer[17];
    int count = -1;
    int sysError = 0;
    QElapsedTimer clock;
    clock.start();
    QVERIFY(handle.readBlock(buffer, 16, count, sysError));
    QCOMPARE(count, 0);
    QVERIFY(clock.elapsed() >= 20);  // it waited for the whole read time-out
}

void TestSerial::exclusivityReleasedAfterExchange() {
    PtyPeer peer;
    peer.setResponder(answerWith("00000001"));
    QByteArray reply;
    QString error;
    bool fault = false;
    QVERIFY(Transact(peer.port(), readMessage(20), ConnectorPlain, false, reply, error, fault));
    const int fd = ::open(peer.slavePath().toLocal8Bit().constData(), O_RDWR | O_NOCTTY);
    QVERIFY(fd >= 0);
    int exclusive = 1;
    QCOMPARE(ioctl(fd, TIOCGEXCL, &exclusive), 0);
    ::close(fd);
    QCOMPARE(exclusive, 0);  // otherwise every user but root would find the port busy next time
}

void TestSerial::noDescriptorLeak() {
    PtyPeer peer;
    peer.setResponder(answerWith("00000001"));
    QByteArray reply;
    QString error;
    bool fault = false;
    QVERIFY(Transact(peer.port(), readMessage(20), ConnectorPlain, false, reply, error, fault));
    const int before = openDescriptors();
    for (int i = 0; i < 1000; ++i)
        QVERIFY(Transact(peer.port(), readMessage(20), ConnectorPlain, false, reply, error, fault));
    PortHandle handle;
    for (int i = 0; i < 100; ++i)
        QVERIFY(!OpenPort(29, handle, error));  // failed opens leave nothing behind either
    QCOMPARE(openDescriptors(), before);
}

void TestSerial::adapterSelfTest() {
    PtyPeer peer;
    const QByteArray request = AdapterTestMessage();
    QCOMPARE(request, readMessage(255));

    // A sound adapter: the reply, then output for about 100 ms.
    peer.setResponder([](const QByteArray& frame) {
        std::vector<PeerChunk> chunks{{0, PtyPeer::replyTo(frame, "00000004")}};
        for (int i = 0; i < 12; ++i)
            chunks.push_back({8, QByteArray(16, 'd')});
        return chunks;
    });
    DiagnosticCapture capture;
    AdapterTestOutcome outcome = TestAdapter(peer.port(), request);
    QVERIFY2(outcome.passed, qPrintable(outcome.report));
    QVERIFY(outcome.report.startsWith("PASS KV705 !!! "));
    QVERIFY(outcome.report.endsWith(" mS "));
    QCOMPARE(capture.lines.back().level, 2);
    QVERIFY(peer.received().startsWith(QByteArray(160, 'd') + BuildFrame(request)));

    // Silent adapter: the first empty read ends well before 40 ms.
    peer.setResponder(nullptr);
    outcome = TestAdapter(peer.port(), request);
    QVERIFY(!outcome.passed);
    QVERIFY2(outcome.report.startsWith("FAIL KV705 decay") && outcome.report.endsWith(" < 40mS "),
             qPrintable(outcome.report));

    // Output that never settles.
    peer.setResponder([](const QByteArray& frame) {
        std::vector<PeerChunk> chunks{{0, PtyPeer::replyTo(frame, "00000004")}};
        for (int i = 0; i < 40; ++i)
            chunks.push_back({8, QByteArray(16, 'd')});
        return chunks;
    });
    outcome = TestAdapter(peer.port(), request);
    QVERIFY2(outcome.report.startsWith("FAIL KV705 decay") && outcome.report.endsWith(" > 200mS "),
             qPrintable(outcome.report));

    // Output of the right length but no reply among it.
    peer.setResponder([](const QByteArray&) {
        std::vector<PeerChunk> chunks;
        for (int i = 0; i < 12; ++i)
            chunks.push_back({8, QByteArray(16, 'd')});
        return chunks;
    });
    outcome = TestAdapter(peer.port(), request);
    QCOMPARE(outcome.report, QString("FAIL KV705 Reply not found ?"));
}

void TestSerial::adapterSelfTestMissingPort() {
    QTemporaryDir empty;
    qputenv("KV700_PORT_DIR", empty.path().toLocal8Bit());
    DiagnosticCapture capture;
    const AdapterTestOutcome outcome = TestAdapter(40, AdapterTestMessage());
    QVERIFY(!outcome.passed);
    QCOMPARE(outcome.report, QString("FAIL KV705 %"));
    QCOMPARE(capture.lines.back().level, 2);
    QCOMPARE(capture.lines.back().tag, QString("FAIL KV705 %"));
    QCOMPARE(capture.lines.back().text, QString("KV ?"));
}

QTEST_GUILESS_MAIN(TestSerial)
#include "tst_serial.moc"
