#include "drivers/kv7146_flags.h"

#include <QtTest>

using namespace kv;

class TestDrv7146 : public QObject {
    Q_OBJECT
private slots:
    void flagWord_data();
    void flagWord();
    void flagWordReadsBack_data();
    void flagWordReadsBack();
};

void TestDrv7146::flagWord_data() {
    QTest::addColumn<int>("model");
    QTest::addColumn<int>("respon");
    QTest::addColumn<int>("limits");
    QTest::addColumn<int>("reverse");
    QTest::addColumn<int>("remote");
    QTest::addColumn<QString>("shape");
    QTest::addColumn<int>("flags");

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
}

void TestDrv7146::flagWord() {
    QFETCH(int, model);
    SettingsSet s;
    QFETCH(int, respon);
    QFETCH(int, limits);
    QFETCH(int, reverse);
    QFETCH(int, remote);
    QFETCH(QString, shape);
    s.Inp1Respon = respon;
    s.UserLmtEna = limits;
    s.DirecrReve = reverse;
    s.RemoteCont = remote;
    s.Inp1Shape = shape;
    QTEST(int(KV7146v2FlagA(s, model)), "flags");
}

void TestDrv7146::flagWordReadsBack_data() {
    flagWord_data();
}

void TestDrv7146::flagWordReadsBack() {
    QFETCH(int, model);
    QFETCH(int, flags);
    SettingsSet s;
    s.Inp1Respon = s.UserLmtEna = s.DirecrReve = s.RemoteCont = 9;
    KV7146v2ReadFlagA(quint16(flags), model, s);
    QTEST(s.Inp1Respon, "respon");
    QTEST(s.UserLmtEna, "limits");
    QTEST(s.DirecrReve, "reverse");
    QTEST(s.RemoteCont, "remote");
    QTEST(s.Inp1Shape, "shape");
}

QTEST_GUILESS_MAIN(TestDrv7146)
#include "tst_drv7146.moc"
