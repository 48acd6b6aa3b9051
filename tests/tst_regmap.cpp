#include "model/module_types.h"
#include "model/register_map.h"

#include <QSet>
#include <QtTest>

using namespace kv;

namespace {
const RegisterRow& rowNamed(const char* name) {
    for (const RegisterRow& row : AllRegisters())
        if (qstrcmp(row.field.name(), name) == 0)
            return row;
    qFatal("no row %s", name);
}
}  // namespace

class TestRegMap : public QObject {
    Q_OBJECT
private slots:
    void addressesOfMaps_data();
    void addressesOfMaps();
    void unknownMapsDefineNothing_data();
    void unknownMapsDefineNothing();
    void setRegMapAppliesAndResets();
    void setRegMapOutsideRangeKeepsTable();
    void findRegisterPrefersRegisterOverLimit();
    void modMapOfTypeCodes_data();
    void modMapOfTypeCodes();

    // Self-checks of the address table.
    void rowsNamedOnceAndDescribed();
    void addressesFitOneByte();
    void registersUniquePerMap();
    void limitsEncloseTheImage();
    void onlyKnownRegistersInsideRangeSpan();
};

void TestRegMap::addressesOfMaps_data() {
    QTest::addColumn<int>("map");
    QTest::addColumn<QString>("member");
    QTest::addColumn<int>("address");
    // Columns are easily shifted: these rows differ between neighbouring maps.
    QTest::newRow("2 Buss_ID") << 2 << "Buss_ID" << 93;
    QTest::newRow("5 Buss_ID") << 5 << "Buss_ID" << 92;
    QTest::newRow("3 Int_Ref swapped") << 3 << "Int_Ref" << 69;
    QTest::newRow("3 Revision swapped") << 3 << "Revision" << 68;
    QTest::newRow("7 MIZ") << 7 << "MIZ" << 100;
    QTest::newRow("5 IO_Dir undefined") << 5 << "IO_Dir" << -1;
    QTest::newRow("6 floating") << 6 << "Trig_Level_RT" << 76;
    QTest::newRow("3 16 bit") << 3 << "TypInput" << 28;
}

void TestRegMap::addressesOfMaps() {
    QFETCH(int, map);
    QFETCH(QString, member);
    QFETCH(int, address);
    QCOMPARE(rowNamed(member.toLatin1()).field.address(RegMapFor(map)), address);
}

void TestRegMap::unknownMapsDefineNothing_data() {
    QTest::addColumn<int>("map");
    QTest::newRow("no module") << 0;
    QTest::newRow("unknown module") << 99;
    QTest::newRow("8") << 8;
    QTest::newRow("negative") << -1;
}

void TestRegMap::unknownMapsDefineNothing() {
    QFETCH(int, map);
    const RegMap addresses = RegMapFor(map);
    for (const RegisterRow& row : AllRegisters()) {
        const int expected = row.field.is(&RegMap::Mod_Type)    ? 255
                             : row.field.is(&RegMap::Com_Power) ? 254
                                                                : -1;
        QCOMPARE(row.field.address(addresses), expected);
    }
}

void TestRegMap::setRegMapAppliesAndResets() {
    RegVal.Serial_No = 1234;
    RegVal.File_Text = "something";
    RegMap addresses;
    SetRegMap(addresses, 3);
    QCOMPARE(addresses.Gain_Factor, 74);
    QCOMPARE(addresses.Eng_In_Z, 51.0f);
    QCOMPARE(RegVal.Serial_No, 1234);  // only map 0 touches the values

    SetRegMap(addresses, 4);
    QCOMPARE(addresses.Gain_Factor, -1);  // not carried over from map 3
    QCOMPARE(addresses.Mod_Type, 127);

    SetRegMap(addresses, 0);
    QCOMPARE(addresses.Serial_No, -1);
    QCOMPARE(addresses.Eng_In_Z, -1.0f);
    QCOMPARE(addresses.Mod_Type, 255);
    QCOMPARE(addresses.Com_Power, 254);
    QCOMPARE(RegVal.Serial_No, -1);
    QCOMPARE(RegVal.Mod_Type, 255);
    QCOMPARE(RegVal.Com_Power, 254);
    QCOMPARE(RegVal.Flag_A, qint16(-1));
    QCOMPARE(RegVal.File_Text, QString());
}

void TestRegMap::setRegMapOutsideRangeKeepsTable() {
    RegMap addresses;
    SetRegMap(addresses, 6);
    SetRegMap(addresses, 99);
    QCOMPARE(addresses.Mod_Type, 255);
    QCOMPARE(addresses.Com_Power, 254);
    QCOMPARE(addresses.Serial_No, 42);  // the rest of map 6 stays
}

void TestRegMap::findRegisterPrefersRegisterOverLimit() {
    const RegisterRow* at68 = FindRegister(RegMapFor(1), 68);
    QVERIFY(at68);
    QCOMPARE(at68->field.name(), "Int_Ref");
    QCOMPARE(FindRegister(RegMapFor(3), 16)->field.name(), "CIN_Z");
    QVERIFY(!FindRegister(RegMapFor(1), 16));  // a range register is no member
    QVERIFY(!FindRegister(RegMapFor(1), -1));
    QCOMPARE(FindRegister(RegMapFor(6), 71)->field.name(), "In_Freq");
}

void TestRegMap::modMapOfTypeCodes_data() {
    QTest::addColumn<int>("code");
    QTest::addColumn<int>("map");
    const int maps[] = {99, 1, 1, 2, 3, 3, 2, 4, 5, 6, 7, 99};
    for (int code = 0; code <= 11; ++code)
        QTest::newRow(qPrintable(QString::number(code))) << code << maps[code];
    QTest::newRow("255") << 255 << 99;
    QTest::newRow("-1") << -1 << 99;
}

void TestRegMap::modMapOfTypeCodes() {
    QFETCH(int, code);
    QFETCH(int, map);
    QCOMPARE(GetModMap(code), map);
}

void TestRegMap::rowsNamedOnceAndDescribed() {
    QSet<QString> names;
    for (const RegisterRow& row : AllRegisters()) {
        QVERIFY2(!names.contains(row.field.name()), row.field.name());
        names.insert(row.field.name());
        if (row.role != RegRole::SpanLimit)
            QVERIFY2(qstrlen(row.description) > 0, row.field.name());
    }
}

void TestRegMap::addressesFitOneByte() {
    for (const RegisterRow& row : AllRegisters())
        for (int map = 1; map <= MapCount; ++map) {
            const int address = row.addressIn(map);
            QVERIFY2(address == -1 || (address >= 0 && address <= 255), row.field.name());
        }
}

void TestRegMap::registersUniquePerMap() {
    for (int map = 1; map <= MapCount; ++map) {
        QHash<int, QString> owner;
        for (const RegisterRow& row : AllRegisters()) {
            const int address = row.addressIn(map);
            if (!row.isRegister() || address < 0)
                continue;
            QVERIFY2(!owner.contains(address),
                     qPrintable(QStringLiteral("map %1 address %2: %3 and %4")
                                    .arg(map)
                                    .arg(address)
                                    .arg(owner.value(address))
                                    .arg(row.field.name())));
            owner.insert(address, row.field.name());
        }
    }
}

void TestRegMap::limitsEncloseTheImage() {
    // Every register the identification reads lies from Lowest_Reg to Highest_Reg,
    // apart from the type and power registers at the top of the address space.
    for (int map = 1; map <= MapCount; ++map) {
        const RegMap addresses = RegMapFor(map);
        QVERIFY(addresses.Lowest_Reg <= addresses.Highest_Reg);
        QVERIFY(FindRegister(addresses, addresses.Lowest_Reg));
        QVERIFY(FindRegister(addresses, addresses.Highest_Reg));
        for (const RegisterRow& row : AllRegisters()) {
            const int address = row.addressIn(map);
            if (!row.isRegister() || address < 0 || row.field.is(&RegMap::Mod_Type) ||
                row.field.is(&RegMap::Com_Power))
                continue;
            QVERIFY2(address >= addresses.Lowest_Reg && address <= addresses.Highest_Reg,
                     qPrintable(QStringLiteral("map %1 %2").arg(map).arg(row.field.name())));
        }
    }
}

void TestRegMap::onlyKnownRegistersInsideRangeSpan() {
    for (int map = 1; map <= MapCount; ++map) {
        const RegMap addresses = RegMapFor(map);
        QStringList inside;
        for (int address = addresses.Rng_First; address <= addresses.Rng_Last; ++address)
            if (const RegisterRow* row = FindRegister(addresses, address))
                inside << row->field.name();
        const QStringList expected =
            map == 3 ? QStringList{"Gain_Factor", "Orig_OS_PWM"} : QStringList{};
        QCOMPARE(inside, expected);
    }
}

QTEST_APPLESS_MAIN(TestRegMap)
#include "tst_regmap.moc"
