// Self-checks of every driver's order tables: the registers they name, how the
// orders start and end, that each acknowledgement leads to exactly one row,
// and that multi-part transfers are complete; and the drivers' descriptors
// against what their modules are documented to do.
#include "drivers/driver_list.h"
#include "drivers/kv7146v1_driver.h"
#include "drivers/kv7146v2_driver.h"
#include "drivers/kv718_driver.h"
#include "drivers/kv760_driver.h"
#include "drivers/step_runner.h"
#include "engine/request_engine.h"
#include "model/register_map.h"

#include <QSet>
#include <QtTest>

#include <algorithm>
#include <cstring>

using namespace kv;

namespace {

struct Order {
    const DriverDescriptor* driver;
    const char* which;
    StepTable rows;
    RegField last;
};

QList<Order> allOrders() {
    QList<Order> orders;
    for (const DriverDescriptor* driver : AllDrivers()) {
        orders.append({driver, "programming", driver->programOrder, driver->lastProgrammed});
        orders.append({driver, "reading", driver->readOrder, driver->lastRead});
    }
    return orders;
}

QByteArray where(const Order& order, int row = -1) {
    QByteArray text = QByteArray(order.driver->module) + ' ' + order.which;
    if (row >= 0)
        text += " row " + QByteArray::number(row + 1);
    return text;
}

bool isRegisterOf(const RegField& reg, int family) {
    const RegMap map = RegMapFor(family);
    const int address = reg.address(map);
    return reg.isSet() && address >= 0 && FindRegister(map, address) != nullptr;
}

bool acknowledgedBy(const StepTable& rows, const RegField& reg, AckKind kind) {
    for (const StepRow& row : rows)
        if (row.ack.reg.isSameAs(reg) && row.ack.kind == kind)
            return true;
    return false;
}

AckKind ackKindFor(RequestKind kind) {
    switch (kind) {
    case RequestKind::FirstFileName:
        return AckKind::FileNameParts;
    case RequestKind::FirstTable:
        return AckKind::TableParts;
    default:
        return AckKind::Register;
    }
}

struct Documented {
    const DriverDescriptor& (*driver)();
    const char* module;
    const char* dispatcher;
    int family;
    const char* setTag;
    const char* getTag;
    const char* lastProgrammed;
    const char* lastProgrammedText;  // its description in a failure text
    const char* lastRead;
};

const Documented documented[] = {
    {Kv760Driver, "modKV760v1", "GS760", 6, "modKV760.cbSet", "modKV760.cbGet", "Remote1",
     "Remote Output 1", "Int_Temp"},
    {Kv714v1Driver, "modKV7146v1", "GS714v1", 1, "modKV7146v1.cbSet", "GS7146v1.cbGet", "Buss_ID",
     "BUSS ID", "Int_Temp"},
    {Kv716v1Driver, "modKV7146v1", "GS716v1", 2, "modKV7146v1.cbSet", "GS7146v1.cbGet", "Buss_ID",
     "BUSS ID", "Int_Temp"},
    {Kv714v2Driver, "modKV7146v2", "GS714v2", 4, "modKV7146v2.cbSet", "GS7146v2.cbGet", "Buss_ID",
     "BUSS ID", "Int_Temp"},
    {Kv716v2Driver, "modKV7146v2", "GS716v2", 5, "modKV7146v2.cbSet", "GS7146v2.cbGet", "Buss_ID",
     "BUSS ID", "Int_Temp"},
    {Kv718Driver, "modKV718vA", "GS718vA", 7, "modKV718vA.cbSet", "GS718vA.cbGet", "Buss_ID",
     "BUSS ID", "Int_Temp"},
};

}  // namespace

class TestDriverTables : public QObject {
    Q_OBJECT
private slots:
    void everyRegisterExistsInTheFamilyMap();
    void ordersStartOnTheModuleType();
    void ordersEndOnTheirLastRegister();
    void everyRequestIsAcknowledgedByARow();
    void everyRowIsReached();
    void repeatedAcknowledgementsAreToldApart();
    void valuesMatchTheRegisterWidth();
    void multiPartRegistersUseTheirTransfers();
    void driverListIsConsistent();
    void descriptors_data();
    void descriptors();
    void windowPicksItsDriverByMap();
};

void TestDriverTables::everyRegisterExistsInTheFamilyMap() {
    for (const Order& order : allOrders()) {
        const int family = order.driver->family;
        QVERIFY2(isRegisterOf(order.last, family), where(order) + " last register");
        int i = 0;
        for (const StepRow& row : order.rows) {
            QVERIFY2(isRegisterOf(row.ack.reg, family), where(order, i) + " acknowledged");
            QVERIFY2(isRegisterOf(row.next.reg, family), where(order, i) + " requested");
            if (row.next.value.kind == ValueSource::Computed)
                QVERIFY2(isRegisterOf(row.next.value.computed, family), where(order, i) + " value");
            ++i;
        }
    }
}

void TestDriverTables::ordersStartOnTheModuleType() {
    for (const Order& order : allOrders()) {
        QVERIFY2(order.rows.count > 0, where(order));
        QVERIFY2(order.rows.begin()->ack.reg.isSameAs(KV_REG(Mod_Type)), where(order, 0));
        for (const StepRow* row = order.rows.begin() + 1; row != order.rows.end(); ++row)
            QVERIFY2(!row->ack.reg.isSameAs(KV_REG(Mod_Type)),
                     where(order, int(row - order.rows.begin())));
    }
}

void TestDriverTables::ordersEndOnTheirLastRegister() {
    // The run handles the last register itself: exactly one row asks for it and
    // none acknowledges it.
    for (const Order& order : allOrders()) {
        int requests = 0;
        for (const StepRow& row : order.rows) {
            QVERIFY2(!row.ack.reg.isSameAs(order.last), where(order));
            if (row.next.reg.isSameAs(order.last))
                ++requests;
        }
        QVERIFY2(requests == 1, where(order) + " requests its last register " +
                                    QByteArray::number(requests) + " times");
        QVERIFY2((order.rows.end() - 1)->next.reg.isSameAs(order.last),
                 where(order) + " does not end on its last register");
    }
}

void TestDriverTables::everyRequestIsAcknowledgedByARow() {
    for (const Order& order : allOrders()) {
        int i = 0;
        for (const StepRow& row : order.rows) {
            if (!row.next.reg.isSameAs(order.last))
                QVERIFY2(acknowledgedBy(order.rows, row.next.reg, ackKindFor(row.next.kind)),
                         where(order, i) + " asks for " + row.next.reg.name() +
                             ", which no row of the right kind acknowledges");
            ++i;
        }
    }
}

void TestDriverTables::everyRowIsReached() {
    for (const Order& order : allOrders()) {
        int i = 0;
        for (const StepRow& row : order.rows) {
            bool requested = i == 0;
            for (const StepRow& other : order.rows)
                if (other.next.reg.isSameAs(row.ack.reg) &&
                    ackKindFor(other.next.kind) == row.ack.kind)
                    requested = true;
            QVERIFY2(requested, where(order, i) + " acknowledges " + row.ack.reg.name() +
                                    ", which no row asks for");
            ++i;
        }
    }
}

void TestDriverTables::repeatedAcknowledgementsAreToldApart() {
    // Rows that acknowledge the same register are tried in order: every one
    // but the last needs a condition, or the later ones are never taken. Two
    // registers of one order must not share an address in the family's map.
    for (const Order& order : allOrders()) {
        const RegMap map = RegMapFor(order.driver->family);
        for (const StepRow* row = order.rows.begin(); row != order.rows.end(); ++row) {
            for (const StepRow* later = row + 1; later != order.rows.end(); ++later) {
                if (later->ack.reg.isSameAs(row->ack.reg))
                    QVERIFY2(row->ack.when != nullptr,
                             where(order, int(row - order.rows.begin())) + " hides row " +
                                 QByteArray::number(int(later - order.rows.begin()) + 1));
                else
                    QVERIFY2(row->ack.reg.address(map) != later->ack.reg.address(map),
                             where(order, int(row - order.rows.begin())) + " shares its address");
            }
        }
    }
}

void TestDriverTables::valuesMatchTheRegisterWidth() {
    for (const Order& order : allOrders()) {
        int i = 0;
        for (const StepRow& row : order.rows) {
            const NextRequest& next = row.next;
            const bool writes =
                next.kind == RequestKind::Write || next.kind == RequestKind::WriteData;
            if (!writes) {
                QVERIFY2(next.value.kind == ValueSource::None,
                         where(order, i) + " read with a value");
            } else {
                QVERIFY2(next.value.kind != ValueSource::None,
                         where(order, i) + " write without value");
                const bool singleValue =
                    next.value.kind == ValueSource::SettingSingle ||
                    (next.value.kind == ValueSource::Computed && next.value.computed.isSingle());
                QVERIFY2(singleValue == next.reg.isSingle(),
                         where(order, i) + " writes " + next.reg.name() + " with the wrong width");
            }
            QVERIFY2(!(std::strcmp(order.which, "reading") == 0 && writes),
                     where(order, i) + " writes during a read");
            ++i;
        }
    }
}

void TestDriverTables::multiPartRegistersUseTheirTransfers() {
    // The file name goes in five parts of four characters from bus ID 16 by 4;
    // a table register only through a table transfer.
    QCOMPARE((FileNameIds.last - FileNameIds.first) / FileNameIds.step + 1, FileNameLength / 4);
    for (const Order& order : allOrders()) {
        int i = 0;
        for (const StepRow& row : order.rows) {
            const bool fileName = row.next.reg.isSameAs(KV_REG(File_Name));
            const bool table =
                row.next.reg.isSameAs(KV_REG(Table1)) || row.next.reg.isSameAs(KV_REG(TableC));
            QVERIFY2(fileName == (row.next.kind == RequestKind::FirstFileName),
                     where(order, i) + " file name");
            QVERIFY2(table == (row.next.kind == RequestKind::FirstTable),
                     where(order, i) + " table");
            ++i;
        }
    }
}

void TestDriverTables::driverListIsConsistent() {
    QSet<QByteArray> dispatchers;
    for (const DriverDescriptor* driver : AllDrivers()) {
        QVERIFY2(driver->family >= 1 && driver->family <= MapCount, driver->module);
        QVERIFY2(!dispatchers.contains(driver->dispatcher), driver->dispatcher);
        dispatchers.insert(driver->dispatcher);
        QVERIFY(driver->work);
        QCOMPARE(DriverForMap(driver->family) != nullptr, true);
        // A window that serves several drivers picks one by map and must say
        // what it does with a map that none of them serves.
        int sameWindow = 0;
        for (const DriverDescriptor* other : AllDrivers())
            if (std::strcmp(other->run.window, driver->run.window) == 0)
                ++sameWindow;
        if (sameWindow > 1) {
            QVERIFY2(*driver->run.unknownMapProgram && *driver->run.unknownMapRead &&
                         *driver->run.unknownMapWarning,
                     driver->module);
        }
        QCOMPARE(WindowDriverForMap(*driver, driver->family), driver);
    }
    QCOMPARE(DriverForMap(NoModuleMap), nullptr);
    QCOMPARE(DriverForMap(UnknownModuleMap), nullptr);
}

void TestDriverTables::descriptors_data() {
    QTest::addColumn<int>("row");
    for (int i = 0; i < int(std::size(documented)); ++i)
        QTest::newRow(documented[i].dispatcher) << i;
}

void TestDriverTables::descriptors() {
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

    // The window, not the driver, handles the last register of a programming run.
    SetRegMap(RegAdd, d.family);
    RequestEngine engine;
    SettingsSet settings;
    QString text;
    QVERIFY(!ProgramStep(d, engine, d.lastProgrammed.address(RegAdd), 16, text, settings));
    QCOMPARE(text, QStringLiteral("PROGRAM FAIL %1: cbSet RegAdd.%2 End process on calling form")
                       .arg(doc.lastProgrammedText, doc.lastProgrammed));
}

void TestDriverTables::windowPicksItsDriverByMap() {
    // The KV718 "-10"/"-20" share the second-version KV714 map and so its driver.
    QCOMPARE(WindowDriverForMap(Kv716v1Driver(), 1), &Kv714v1Driver());
    QCOMPARE(WindowDriverForMap(Kv714v1Driver(), 2), &Kv716v1Driver());
    QCOMPARE(WindowDriverForMap(Kv716v2Driver(), 4), &Kv714v2Driver());
    QCOMPARE(WindowDriverForMap(Kv714v2Driver(), 5), &Kv716v2Driver());
    // A window with several drivers has none for a foreign map; one with a
    // single driver keeps it, and its model check names the wrong module.
    QCOMPARE(WindowDriverForMap(Kv714v1Driver(), 4), nullptr);
    QCOMPARE(WindowDriverForMap(Kv714v2Driver(), 2), nullptr);
    QCOMPARE(WindowDriverForMap(Kv760Driver(), 3), &Kv760Driver());
}

QTEST_GUILESS_MAIN(TestDriverTables)
#include "tst_drivertables.moc"
