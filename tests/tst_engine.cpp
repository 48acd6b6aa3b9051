// The request engine against a scripted peer on a pseudo-terminal, one tick at a time.
#include "engine/message_log.h"
#include "engine/request_engine.h"
#include "model/register_map.h"
#include "serial/frame.h"
#include "tests/support/diagnostic_capture.h"
#include "tests/support/pty_peer.h"

#include <QSignalSpy>
#include <QtTest>

using namespace kv;

namespace {
struct Recorder : CallbackReceiver {
    struct Call {
        QString kind;
        qint32 address;
        qint16 busId;
        QString text;
        bool ok;
    };
    std::vector<Call> calls;
    void cbGet(qint32 address, qint16 busId) override {
        calls.push_back({"get", address, busId, {}, true});
    }
    void cbSet(qint32 address, qint16 busId, const QString& text, bool ok) override {
        calls.push_back({"set", address, busId, text, ok});
    }
};

// Answers reads with a fixed value and writes with their echo, after dropping
// the first `drops` frames.
PeerResponder module(int drops, QByteArray value = "00000123") {
    auto seen = std::make_shared<int>(0);
    return [=](const QByteArray& frame) -> std::vector<PeerChunk> {
        if ((*seen)++ < drops)
            return {};
        const QByteArray data = frame[1] == 'R' ? value : frame.mid(4, 8);
        return {{0, PtyPeer::replyTo(frame, data)}};
    };
}

// The command letter, bus ID and address of each frame the peer received.
QList<QByteArray> framesSeen(const PtyPeer& peer) {
    QList<QByteArray> frames;
    const QByteArray bytes = peer.received();
    for (qsizetype at = bytes.indexOf('\x02'); at >= 0 && at + 16 <= bytes.size();
         at = bytes.indexOf('\x02', at + 16))
        frames << bytes.mid(at + 1, 11);
    return frames;
}
}  // namespace

class TestEngine : public QObject {
    Q_OBJECT
private slots:
    void init();
    void refusals();
    void readRetriedThenCalledBackOnce();
    void givingUpOnAReadCallsBackAndDisconnects();
    void givingUpOnAWriteTellsTheWriter();
    void portFaultDisconnectsAtOnce();
    void writeThenDelayedRead();
    void writeDataFields_data();
    void writeDataFields();
    void missingReceiver();
    void reserveSomeTime();
    void messageLogLimits();
    void statusLineHides();

private:
    std::unique_ptr<PtyPeer> peer_;
    std::unique_ptr<RequestEngine> engine_;
    Recorder recorder_;
};

void TestEngine::init() {
    peer_ = std::make_unique<PtyPeer>(4);
    QVERIFY(peer_->isReady());
    engine_ = std::make_unique<RequestEngine>();
    engine_->setPort(4);
    engine_->setConnected(true);
    engine_->setState(StateRun);
    recorder_.calls.clear();
    engine_->registerReceiver("MCT00001", &recorder_);
    SetRegMap(RegAdd, NoModuleMap);
}

void TestEngine::refusals() {
    DiagnosticCapture capture;
    QString error;
    QVERIFY(!engine_->R_CB(15, 16, "MCT00001", CallbackGet, error));
    QCOMPARE(error, QString("Address < 16 not allowed"));
    QCOMPARE(StatusText(), QString("R_CB:Address < 16 not allowed"));
    QVERIFY(!engine_->R_CB(20, 15, "MCT00001", CallbackGet, error));
    QCOMPARE(error, QString("ID must be 16 or above"));
    QVERIFY(!engine_->W_DataOK(20, 16, "MCT00001", 1, {}, {}, {}, ValueLong, "X", error));
    QCOMPARE(error, QString("X? Retry Control"));
    QCOMPARE(StatusText(), QString("W_DataOK:X? Retry Control"));
    QVERIFY(engine_->R_CB(20, 18, "MCT00001", CallbackGet, error));  // odd bus IDs are table steps
    QVERIFY(!engine_->R_CB(21, 16, "MCT00001", CallbackGet, error));
    QCOMPARE(error, QString("Must be in run mode"));
    QVERIFY(!engine_->W_DelayCB(21, 5, ValueLong, "MCT00001", CallbackGet, error));
    QCOMPARE(error, QString("Must be in run mode"));
    QCOMPARE(engine_->state(), qint32(StateCallBackVal));
}

void TestEngine::readRetriedThenCalledBackOnce() {
    peer_->setResponder(module(2));
    QString error;
    QVERIFY(engine_->R_CB(20, 16, "MCT00001", CallbackGet, error));
    engine_->Communicate();
    QCOMPARE(engine_->retryCount(), qint16(1));
    engine_->Communicate();
    QCOMPARE(engine_->retryCount(), qint16(2));
    QVERIFY(recorder_.calls.empty());
    engine_->Communicate();
    QCOMPARE(engine_->retryCount(), qint16(0));
    QCOMPARE(engine_->state(), qint32(StateRun));
    QCOMPARE(recorder_.calls.size(), size_t(1));
    QCOMPARE(recorder_.calls[0].kind, QString("get"));
    QCOMPARE(recorder_.calls[0].address, 20);
    QCOMPARE(recorder_.calls[0].busId, qint16(16));
    engine_->Communicate();  // nothing pending: nothing more is sent or called
    QCOMPARE(peer_->framesReceived(), 3);
    QCOMPARE(recorder_.calls.size(), size_t(1));
}

void TestEngine::givingUpOnAReadCallsBackAndDisconnects() {
    QSignalSpy disconnects(engine_.get(), &RequestEngine::disconnectRequested);
    QString error;
    QVERIFY(engine_->R_CB(20, 16, "MCT00001", CallbackSet, error));
    for (int tick = 1; tick <= MaxAttempts; ++tick) {
        QCOMPARE(disconnects.count(), 0);
        engine_->Communicate();
    }
    QCOMPARE(peer_->framesReceived(), MaxAttempts);
    QCOMPARE(disconnects.count(), 1);
    QCOMPARE(recorder_.calls.size(), size_t(1));
    QCOMPARE(recorder_.calls[0].kind, QString("set"));
    QCOMPARE(recorder_.calls[0].text, QString("Too many retries:"));
    QVERIFY(!recorder_.calls[0].ok);
    QVERIFY(StatusText().endsWith(" !Fail! "));
}

void TestEngine::givingUpOnAWriteTellsTheWriter() {
    QString error;
    QVERIFY(engine_->W_DataOK(20, 16, "MCT00001", 7, {}, {}, {}, ValueLong, "", error));
    for (int tick = 1; tick <= MaxAttempts; ++tick)
        engine_->Communicate();
    QCOMPARE(recorder_.calls.size(), size_t(1));
    QCOMPARE(recorder_.calls[0].kind, QString("set"));
    QCOMPARE(recorder_.calls[0].address, 20);
    QVERIFY(recorder_.calls[0].text.startsWith("Too many retries:"));
    QVERIFY(!recorder_.calls[0].ok);
}

void TestEngine::portFaultDisconnectsAtOnce() {
    QSignalSpy disconnects(engine_.get(), &RequestEngine::disconnectRequested);
    engine_->setPort(31);  // no such device
    QString error;
    QVERIFY(engine_->R_CB(20, 16, "MCT00001", CallbackGet, error));
    engine_->Communicate();
    QCOMPARE(disconnects.count(), 1);
    QCOMPARE(StatusText(), QString("Communicate:%"));
}

void TestEngine::writeThenDelayedRead() {
    peer_->setResponder(module(0, "00000042"));
    QString error;
    QVERIFY(engine_->W_DelayCB(30, 42, ValueLong, "MCT00001", CallbackGet, error));
    engine_->Communicate();
    QCOMPARE(peer_->framesReceived(), 1);
    for (int tick = 1; tick <= 5; ++tick) {
        engine_->Communicate();
        QCOMPARE(StatusText(), QString("Delay Read"));
        QCOMPARE(peer_->framesReceived(), 1);
        QVERIFY(recorder_.calls.empty());
    }
    engine_->Communicate();
    QCOMPARE(peer_->framesReceived(), 2);
    QCOMPARE(recorder_.calls.size(), size_t(1));
    QCOMPARE(recorder_.calls[0].address, 30);
    QCOMPARE(engine_->delayCounter(), qint16(0));  // handed back to the live polling
    const QList<QByteArray> frames = framesSeen(*peer_);
    QCOMPARE(frames.value(0), QByteArray("W\x10\x1E"
                                         "0000002:"));
    QCOMPARE(frames.value(1), QByteArray("R\x10\x1E"
                                         "30303030"));
}

void TestEngine::writeDataFields_data() {
    QTest::addColumn<qint16>("type");
    QTest::addColumn<QVariantList>("values");
    QTest::addColumn<QByteArray>("data");
    QTest::newRow("long") << qint16(ValueLong) << QVariantList{-2, 0, 0, 0}
                          << QByteArray("??????"
                                        "?>");
    QTest::newRow("long rounds half to even")
        << qint16(ValueLongToo) << QVariantList{2.5, 0, 0, 0} << QByteArray("00000002");
    QTest::newRow("single") << qint16(ValueSingle) << QVariantList{1.0, 0, 0, 0}
                            << QByteArray("3?800000");
    QTest::newRow("two words") << qint16(ValueTwoWords) << QVariantList{0x1234, 0xFFFF, 0, 0}
                               << QByteArray("1234????");
    QTest::newRow("four chars") << qint16(ValueFourChars) << QVariantList{"A", "b", " ", "x"}
                                << QByteArray("41622078");
    QTest::newRow("four bytes") << qint16(ValueFourBytes) << QVariantList{1, 255, 16, 0}
                                << QByteArray("01??1000");
}

void TestEngine::writeDataFields() {
    QFETCH(qint16, type);
    QFETCH(QVariantList, values);
    QFETCH(QByteArray, data);
    peer_->setResponder(module(0));
    QString error;
    QVERIFY(engine_->W_DataOK(40, 22, "MCT00001", values[0], values[1], values[2], values[3], type,
                              "T", error));
    engine_->Communicate();
    QCOMPARE(recorder_.calls.size(), size_t(1));
    QVERIFY(recorder_.calls[0].ok);
    // A table step travels as a write.
    QCOMPARE(framesSeen(*peer_).value(0), QByteArray("W\x16\x28") + data);
}

void TestEngine::missingReceiver() {
    peer_->setResponder(module(0));
    QString error;
    QVERIFY(engine_->R_CB(20, 16, "MCT00099", CallbackGet, error));
    engine_->Communicate();
    QCOMPARE(StatusText(), QString("Missing CB form?"));
    QVERIFY(recorder_.calls.empty());
}

void TestEngine::reserveSomeTime() {
    QVERIFY(engine_->ReserveSomeTime());
    QVERIFY(!engine_->ReserveSomeTime());
    QCOMPARE(StatusText(), QString("Try Again Later ...!!"));
    engine_->setReserved(false);

    // A pending request that completes while the caller waits.
    peer_->setResponder(module(0));
    QTimer driver;
    connect(&driver, &QTimer::timeout, engine_.get(), &RequestEngine::Communicate);
    driver.start(10);
    QString error;
    QVERIFY(engine_->R_CB(20, 16, "MCT00001", CallbackGet, error));
    QVERIFY(engine_->ReserveSomeTime());
    QVERIFY(engine_->reserved());
    QCOMPARE(recorder_.calls.size(), size_t(1));
    driver.stop();

    // One that never completes: refused after the wait.
    engine_->setReserved(false);
    QVERIFY(engine_->R_CB(20, 16, "MCT00001", CallbackGet, error));
    QVERIFY(!engine_->ReserveSomeTime());
    QCOMPARE(StatusText(), QString("Try Again Later ...!!"));
    QVERIFY(!engine_->reserved());

    // A module of unknown type: the engine sends nothing, so the settings and
    // service windows must not be kept waiting.
    engine_->setState(StateUnknownModule);
    QVERIFY(engine_->ReserveSomeTime());
}

void TestEngine::messageLogLimits() {
    MessageLog log;
    SetDebugFlag(false);
    DebugMessage(DiagGeneral, "R_CB", "refused");
    QCOMPARE(log.status(), QString("R_CB:refused"));
    QVERIFY(log.text().isEmpty());  // no log without the debug flag

    SetDebugFlag(true);
    DebugMessage(DiagSend, "COM", "1.00 >", "R", "RV");
    QVERIFY(log.text().isEmpty());  // "Send" not ticked
    log.setOption(LogSend, true);
    log.setOption(LogSerialSteps, true);
    DebugMessage(DiagSend, "COM", "1.00 >", "R\x10", "RV");
    DebugMessage(DiagSerialStep, "COM", "0 >>>", {}, "St");
    QCOMPARE(log.text(), QString("COM:RV1.00 > 52 10\nCOMSt0 >>>\n"));

    log.clear();
    AddMessage(QString(LogLimit + 1, 'a'));
    AddMessage("tail");
    QCOMPARE(log.text().size(), LogLimit + 1 - LogDropped + 4);
    QVERIFY(log.text().endsWith("atail"));
    SetDebugFlag(false);
}

void TestEngine::statusLineHides() {
    MessageLog log;
    ShowStatus("hello");
    for (int tick = 1; tick < StatusVisibleTicks; ++tick)
        log.statusTick();
    QVERIFY(log.statusVisible());
    log.statusTick();
    QVERIFY(!log.statusVisible());
    ShowStatus("again");
    QVERIFY(log.statusVisible());
}

QTEST_GUILESS_MAIN(TestEngine)
#include "tst_engine.moc"
