// The order tables of the KV760, KV714/KV716 and KV718-xA drivers against what
// their modules are documented to do: which family each serves, where each
// order ends, and that every step names a register of that family.
#include "drivers/driver_list.h"
#include "drivers/kv7146v1_driver.h"
#include "drivers/kv7146v2_driver.h"
#include "drivers/kv718_driver.h"
#include "drivers/kv760_driver.h"
#include "model/register_map.h"

#include <QtTest>

#include <algorithm>

using namespace kv;

namespace {

struct Documented {
    const DriverDescriptor& (*driver)();
    const char* module;
    const char* dispatcher;
    int family;
    const char* setTag;
    const char* getTag;
    const char* lastProgrammed;
    const char* lastRead;
};

const Documented documented[] = {
    {Kv760Driver, "modKV760v1", "GS760", 6, "modKV760.cbSet", "modKV760.cbGet", "Remote1",
     "Int_Temp"},
    {Kv714v1Driver, "modKV7146v1", "GS714v1", 1, "modKV7146v1.cbSet", "GS7146v1.cbGet", "Buss_ID",
     "Int_Temp"},
    {Kv716v1Driver, "modKV7146v1", "GS716v1", 2, "modKV7146v1.cbSet", "GS7146v1.cbGet", "Buss_ID",
     "Int_Temp"},
    {Kv714v2Driver, "modKV7146v2", "GS714v2", 4, "modKV7146v2.cbSet", "GS7146v2.cbGet", "Buss_ID",
     "Int_Temp"},
    {Kv716v2Driver, "modKV7146v2", "GS716v2", 5, "modKV7146v2.cbSet", "GS7146v2.cbGet", "Buss_ID",
     "Int_Temp"},
    {Kv718Driver, "modKV718vA", "GS718vA", 7, "modKV718vA.cbSet", "GS718vA.cbGet", "Buss_ID",
     "Int_Temp"},
};

bool inFamily(const RegisterRef& reg, int family) {
    const RegMap map = RegMapFor(family);
    const int address = reg.address(map);
    return address >= 0 && FindRegister(map, address) != nullptr;
}

}  // namespace

class TestDrvOrders : public QObject {
    Q_OBJECT
private slots:
    void descriptors_data();
    void descriptors();
    void stepsNameRegistersOfTheFamily_data();
    void stepsNameRegistersOfTheFamily();
    void ordersEndOnTheDocumentedRegister_data();
    void ordersEndOnTheDocumentedRegister();
    void noAcknowledgementIsAmbiguous_data();
    void noAcknowledgementIsAmbiguous();
    void modelsSharingAWindowAreToldApartByTheirMap();
};

void TestDrvOrders::descriptors_data() {
    QTest::addColumn<int>("row");
    for (int i = 0; i < int(std::size(documented)); ++i)
        QTest::newRow(documented[i].dispatcher) << i;
}

void TestDrvOrders::descriptors() {
    QFETCH(int, row);
    const Documented& doc = documented[row];
    const DriverDescriptor& d = doc.driver();
    QCOMPARE(d.module, doc.module);
    QCOMPARE(d.dispatcher, doc.dispatcher);
    QCOMPARE(d.family, doc.family);
    QCOMPARE(d.setTag, doc.setTag);
    QCOMPARE(d.getTag, doc.getTag);
    QCOMPARE(d.lastProgrammed.name(), doc.lastProgrammed);
    QCOMPARE(d.lastRead.name(), doc.lastRead);
    const DriverList all = AllDrivers();
    QVERIFY(std::find(all.begin(), all.end(), &d) != all.end());
}

void TestDrvOrders::stepsNameRegistersOfTheFamily_data() {
    descriptors_data();
}

void TestDrvOrders::stepsNameRegistersOfTheFamily() {
    QFETCH(int, row);
    const DriverDescriptor& d = documented[row].driver();
    for (const StepTable* order : {&d.programOrder, &d.readOrder}) {
        for (const StepRow& step : *order) {
            QVERIFY2(inFamily(step.ack.reg, d.family), step.ack.reg.name());
            QVERIFY2(inFamily(step.next.reg, d.family), step.next.reg.name());
            if (step.next.value.kind == ValueSource::Computed)
                QVERIFY2(inFamily(step.next.value.computed, d.family),
                         step.next.value.computed.name());
        }
    }
}

void TestDrvOrders::ordersEndOnTheDocumentedRegister_data() {
    descriptors_data();
}

void TestDrvOrders::ordersEndOnTheDocumentedRegister() {
    // The last row asks for the last register and no other row does; no row
    // acknowledges it (the window ends the run there).
    QFETCH(int, row);
    const DriverDescriptor& d = documented[row].driver();
    const struct {
        const StepTable& order;
        const RegisterRef& last;
    } orders[] = {{d.programOrder, d.lastProgrammed}, {d.readOrder, d.lastRead}};
    for (const auto& o : orders) {
        QVERIFY(o.order.count > 1);
        QVERIFY(o.order.begin()->ack.reg.isSameAs(KV_REG(Mod_Type)));
        QVERIFY2((o.order.end() - 1)->next.reg.isSameAs(o.last), o.last.name());
        for (const StepRow* step = o.order.begin(); step != o.order.end(); ++step) {
            QVERIFY(!step->ack.reg.isSameAs(o.last));
            if (step != o.order.end() - 1)
                QVERIFY2(!step->next.reg.isSameAs(o.last), step->ack.reg.name());
        }
    }
}

void TestDrvOrders::noAcknowledgementIsAmbiguous_data() {
    descriptors_data();
}

void TestDrvOrders::noAcknowledgementIsAmbiguous() {
    // Rows of one register are tried in order: all but the last need a condition,
    // and two registers of one row set must not share an address in the family.
    QFETCH(int, row);
    const DriverDescriptor& d = documented[row].driver();
    const RegMap map = RegMapFor(d.family);
    for (const StepTable* order : {&d.programOrder, &d.readOrder}) {
        for (const StepRow* a = order->begin(); a != order->end(); ++a) {
            for (const StepRow* b = a + 1; b != order->end(); ++b) {
                if (a->ack.reg.isSameAs(b->ack.reg))
                    QVERIFY2(a->ack.when, a->ack.reg.name());
                else
                    QVERIFY2(
                        a->ack.reg.address(map) != b->ack.reg.address(map),
                        qPrintable(
                            QStringLiteral("%1 and %2").arg(a->ack.reg.name(), b->ack.reg.name())));
            }
        }
    }
}

void TestDrvOrders::modelsSharingAWindowAreToldApartByTheirMap() {
    // The KV718 "-10"/"-20" share the second-version KV714 map and so its driver.
    QCOMPARE(WindowDriverForMap(Kv716v1Driver(), 1), &Kv714v1Driver());
    QCOMPARE(WindowDriverForMap(Kv714v1Driver(), 2), &Kv716v1Driver());
    QCOMPARE(WindowDriverForMap(Kv716v2Driver(), 4), &Kv714v2Driver());
    QCOMPARE(WindowDriverForMap(Kv714v2Driver(), 5), &Kv716v2Driver());
    QCOMPARE(WindowDriverForMap(Kv714v1Driver(), 4), nullptr);
    QCOMPARE(WindowDriverForMap(Kv714v2Driver(), 2), nullptr);
}

QTEST_GUILESS_MAIN(TestDrvOrders)
#include "tst_drvorders.moc"
