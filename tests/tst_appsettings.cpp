// The stored properties: defaults on a first start and what odd stored texts become.
#include "engine/app_settings.h"
#include "tests/support/stored_properties.h"

#include <QSettings>
#include <QTemporaryDir>
#include <QtTest>

using namespace kv;
using namespace kv::test;

class TestAppSettings : public QObject {
    Q_OBJECT
private slots:
    void initTestCase();
    void init();
    void emptyStoreGivesDefaults();
    void storedTexts_data();
    void storedTexts();
    void savedAsDecimalTextInPropertiesSection();
    void frozenConnectionKeepsTheUsersPort();

private:
    QTemporaryDir dir_;
};

void TestAppSettings::initTestCase() {
    QVERIFY(dir_.isValid());
    QSettings::setPath(QSettings::NativeFormat, QSettings::UserScope, dir_.path());
}

void TestAppSettings::init() {
    ClearStoredProperties();
    SetConnectionPropertiesFrozen(false);
}

void TestAppSettings::emptyStoreGivesDefaults() {
    const StoredProperties properties = LoadProperties(0, 0);
    QCOMPARE(properties.commPort, qint16(0));
    QCOMPARE(properties.connector, qint16(0));
    QCOMPARE(properties.colourTheme, qint16(1));
    // A missing port or adapter keeps what the engine has.
    QCOMPARE(LoadProperties(3, 1).commPort, qint16(3));
    QCOMPARE(LoadProperties(3, 1).connector, qint16(1));
}

void TestAppSettings::storedTexts_data() {
    QTest::addColumn<QString>("key");
    QTest::addColumn<QString>("text");
    QTest::addColumn<int>("commPort");
    QTest::addColumn<int>("connector");
    QTest::addColumn<int>("theme");

    // The engine's port is 9 and its adapter 0 in every row.
    QTest::newRow("port") << KeyCommPort << "12" << 12 << 0 << 1;
    QTest::newRow("port not a number") << KeyCommPort << "COM3" << 9 << 0 << 1;
    QTest::newRow("port beyond 16 bits") << KeyCommPort << "70000" << 9 << 0 << 1;
    QTest::newRow("adapter 1") << KeyConnector << "1" << 9 << 1 << 1;
    QTest::newRow("adapter 0") << KeyConnector << "0" << 9 << 0 << 1;
    QTest::newRow("adapter with blanks") << KeyConnector << " 1 " << 9 << 1 << 1;
    QTest::newRow("adapter text") << KeyConnector << "KV705" << 9 << 1 << 1;
    QTest::newRow("adapter empty") << KeyConnector << "" << 9 << 1 << 1;
    QTest::newRow("theme 0") << KeyColourTheme << "0" << 9 << 0 << 0;
    QTest::newRow("theme 1") << KeyColourTheme << "1" << 9 << 0 << 1;
    QTest::newRow("theme 2") << KeyColourTheme << "2" << 9 << 0 << 0;
    QTest::newRow("theme -1") << KeyColourTheme << "-1" << 9 << 0 << 0;
    QTest::newRow("theme text") << KeyColourTheme << "red" << 9 << 0 << 0;
}

void TestAppSettings::storedTexts() {
    QFETCH(QString, key);
    QFETCH(QString, text);
    StoreProperty(key, text);
    const StoredProperties properties = LoadProperties(9, 0);
    QTEST(int(properties.commPort), "commPort");
    QTEST(int(properties.connector), "connector");
    QTEST(int(properties.colourTheme), "theme");
}

void TestAppSettings::savedAsDecimalTextInPropertiesSection() {
    SaveProperty(KeyCommPort, 5);
    SaveProperty(KeyComBuffer, -1);
    QCOMPARE(StoredProperty(KeyCommPort), QVariant(QStringLiteral("5")));
    QCOMPARE(StoredProperty(KeyComBuffer), QVariant(QStringLiteral("-1")));
    QCOMPARE(LoadProperties(0, 0).commPort, qint16(5));
}

void TestAppSettings::frozenConnectionKeepsTheUsersPort() {
    SaveProperty(KeyCommPort, 4);
    SetConnectionPropertiesFrozen(true);
    SaveProperty(KeyCommPort, 1);
    SaveProperty(KeyConnector, 1);
    SaveProperty(KeyComBuffer, 1);
    SaveProperty(KeyColourTheme, 0);
    QCOMPARE(StoredProperty(KeyCommPort), QVariant(QStringLiteral("4")));
    QVERIFY(!StoredProperty(KeyConnector).isValid());
    QVERIFY(!StoredProperty(KeyComBuffer).isValid());
    QCOMPARE(StoredProperty(KeyColourTheme),
             QVariant(QStringLiteral("0")));  // the theme is the user's choice
}

QTEST_GUILESS_MAIN(TestAppSettings)
#include "tst_appsettings.moc"
