#include "model/codec.h"

#include <QtTest>

using namespace kv;

class TestCodec : public QObject {
    Q_OBJECT
private slots:
    void longRoundTrip_data();
    void longRoundTrip();
    void highHalfReadsUnsigned();
    void wireToIntNarrows();
    void singles_data();
    void singles();
    void binaryTexts();
    void binToDecRejectsOtherCharacters();
    void bitsAndShifts();
    void checksums_data();
    void checksums();
    void helpers();
};

void TestCodec::longRoundTrip_data() {
    QTest::addColumn<qint32>("value");
    QTest::addColumn<QByteArray>("wire");
    QTest::newRow("minus one") << -1 << QByteArray("????????");
    QTest::newRow("255") << 255 << QByteArray("000000??");
    QTest::newRow("7ABC") << 31420 << QByteArray("00007:;<");
    QTest::newRow("zero") << 0 << QByteArray("00000000");
    QTest::newRow("most negative") << qint32(0x80000000) << QByteArray("80000000");
}

void TestCodec::longRoundTrip() {
    QFETCH(qint32, value);
    QFETCH(QByteArray, wire);
    QCOMPARE(LongToWire(value), wire);
    QCOMPARE(WireToLong(wire), value);
}

void TestCodec::highHalfReadsUnsigned() {
    // A value with only the low 16 bits set is a positive 32-bit number.
    QCOMPARE(WireToLong("0000????"), 65535);
    QCOMPARE(WireToLong("00008000"), 32768);
}

void TestCodec::wireToIntNarrows() {
    qint16 v = 7;
    QVERIFY(WireToInt("????????", v));
    QCOMPARE(v, qint16(-1));
    QVERIFY(WireToInt("00002904", v));
    QCOMPARE(v, qint16(10500));
    v = 7;
    QVERIFY(!WireToInt("00008000", v));
    QCOMPARE(v, qint16(7));  // untouched on overflow
    QVERIFY(!WireToInt("???7????", v));
}

void TestCodec::singles_data() {
    QTest::addColumn<float>("value");
    QTest::addColumn<QByteArray>("wire");
    QTest::newRow("one") << 1.0f << QByteArray("3?800000");
    QTest::newRow("-2.5") << -2.5f << QByteArray("<0200000");
    QTest::newRow("zero") << 0.0f << QByteArray("00000000");
    QTest::newRow("0.1") << 0.1f << QByteArray("3=<<<<<=");
    QTest::newRow("20") << 20.0f << QByteArray("41:00000");
}

void TestCodec::singles() {
    QFETCH(float, value);
    QFETCH(QByteArray, wire);
    QCOMPARE(SingleToWire(value), wire);
    QCOMPARE(WireToSingle(wire), value);
}

void TestCodec::binaryTexts() {
    QCOMPARE(DecToBin(5, true), QString("00000000 00000000 00000000 00000101"));
    QCOMPARE(DecToBin(0x80000001u, false), QString("10000000000000000000000000000001"));
    QCOMPARE(ToBin(5), QString("0000 0101"));
    QCOMPARE(ToBin(256), QString("0000 0001 0000 0000"));

    quint32 v = 0;
    QString error;
    QVERIFY(BinToDec("1111"
                     "0000000000000101",
                     true, v, error));
    QCOMPARE(v, 5u);  // only the last 16 characters count
    QVERIFY(BinToDec("1111"
                     "0000000000000101",
                     false, v, error));
    QCOMPARE(v, 0xF0005u);
}

void TestCodec::binToDecRejectsOtherCharacters() {
    quint32 v = 42;
    QString error;
    QVERIFY(!BinToDec("0102", false, v, error));
    QCOMPARE(error, QString("Invalid Input"));
    QCOMPARE(v, 42u);
}

void TestCodec::bitsAndShifts() {
    QCOMPARE(SetBit(0, 15), quint16(0x8000));
    QCOMPARE(ClearBit(0xFFFF, 3), quint16(0xFFF7));
    QVERIFY(TestBit(0x0040, 6));
    QVERIFY(!TestBit(0x0040, 7));
    QCOMPARE(ShiftRight(-1, 4), qint32(0x0FFFFFFF));         // zero fill
    QCOMPARE(ShiftLeft(0x40000000, 1), qint32(0x80000000));  // bit 30 becomes the sign
    quint8 lo = 0, hi = 0;
    SplitNibbles(0xA7, lo, hi);
    QCOMPARE(lo, quint8(7));
    QCOMPARE(hi, quint8(10));
}

void TestCodec::checksums_data() {
    QTest::addColumn<QByteArray>("bytes");
    QTest::addColumn<QByteArray>("check");
    QTest::newRow("read 255 bus 16") << QByteArray("R\x10\xFF"
                                                   "30303030F\x03")
                                     << QByteArray("07");
    QTest::newRow("read 20 bus 16") << QByteArray("R\x10\x14"
                                                  "30303030F\x03")
                                    << QByteArray("><");
    // 0xFF ^ 0x54 = 0xAB
    QTest::newRow("x = AB") << QByteArray("\x54") << QByteArray(":;");
}

void TestCodec::checksums() {
    QFETCH(QByteArray, bytes);
    QFETCH(QByteArray, check);
    QCOMPARE(FrameChecksum(bytes), check);
}

void TestCodec::helpers() {
    QCOMPARE(StrToHex("AB"), QString(" 41 42"));
    QCOMPARE(StrToHex(""), QString(""));
    QCOMPARE(StrToHex("\x10\xFF"), QString(" 10 FF"));
    QCOMPARE(TextPart("  key=value ", "=", true), QString("key"));
    QCOMPARE(TextPart("key=value", "=", false), QString("value"));
    QCOMPARE(TextPart(" plain ", "=", true), QString("plain"));
    QCOMPARE(TextPart("", "=", true), QString(""));
    const QString a = NextTag(true), b = NextTag(true), c = NextTag(false);
    QVERIFY(a.startsWith("MCT") && a.size() == 8);
    QVERIFY(a != b);
    QVERIFY(c.startsWith("FT") && c.size() == 8);
}

QTEST_APPLESS_MAIN(TestCodec)
#include "tst_codec.moc"
