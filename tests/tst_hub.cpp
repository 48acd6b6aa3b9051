// The main window and its companions, offscreen: start-up, the command line,
// refusals while the engine is reserved, tabs, the status line, the
// connection settings window and the colour theme.
#include "engine/app_settings.h"
#include "engine/diagnostics.h"
#include "engine/start_up.h"
#include "files/kv7_file.h"
#include "model/register_map.h"
#include "tests/support/pty_peer.h"
#include "tests/support/stored_properties.h"
#include "ui/app/demo_module.h"
#include "ui/common/colour_palette.h"
#include "ui/common/settings_window.h"
#include "ui/comset/frm_comset.h"
#include "ui/comset/port_probe.h"
#include "ui/hub/hub.h"
#include "ui/hub/please_wait.h"

#include <QAction>
#include <QCheckBox>
#include <QComboBox>
#include <QFile>
#include <QLabel>
#include <QPushButton>
#include <QSettings>
#include <QStackedWidget>
#include <QTabBar>
#include <QTemporaryDir>
#include <QTreeWidget>
#include <QtTest>

using namespace kv;
using namespace kv::test;

namespace {

constexpr int WaitMs = 20000;

// A settings window as the editors will provide it, recording what the main window asks.
class FakeSettings : public SettingsWindow {
public:
    explicit FakeSettings(hub& owner) : SettingsWindow(QStringLiteral("New Fake")), owner_(owner) {}
    void Restore(int map) override { restored = map; }
    void LoadDialouge(int map) override { loaded = map; }
    void CloseMe(const QString& tag) override {
        if (tag != this->tag())
            return;
        ShowStatus(QStringLiteral("closing"));
        owner_.ts_CloseTabSelectNext(tag);
        owner_.engine().setReserved(false);
    }
    void cbGet(qint32, qint16) override {}
    void cbSet(qint32, qint16, const QString&, bool) override {}
    void SetColour() override {}

    int restored = 0;
    int loaded = 0;

private:
    hub& owner_;
};

// A main window whose connect always fails, as a connect that cannot be made would.
class RefusingHub : public hub {
public:
    bool OpenCom(bool connect, QString& error) override {
        if (!connect)
            return hub::OpenCom(false, error);
        error = QStringLiteral("adapter missing");
        return false;
    }
};

// Links every COM port but the given ones to nothing, so the port search
// finds only what the test puts there.
void linkMissingPorts(const QString& dir, QList<int> present) {
    for (int port = 0; port <= LastProbedPort; ++port)
        if (!present.contains(port))
            QFile::link(dir + QStringLiteral("/missing"), dir + QStringLiteral("/com%1").arg(port));
}

QAction* command(hub& h, int index) {
    return h.findChild<QAction*>(QStringLiteral("cmdProcess%1").arg(index));
}

QLabel* statusLine(hub& h) {
    return h.findChild<QLabel*>(QStringLiteral("labStatus"));
}

QTabBar* tabStrip(hub& h) {
    return h.findChild<QTabBar*>(QStringLiteral("ts"));
}

QString shownTag(hub& h) {
    auto* window = h.findChild<QStackedWidget*>(QStringLiteral("tabWindows"))->currentWidget();
    return window ? window->objectName() : QString();
}

template <typename Child>
Child* settingsChild(hub& h, const char* name) {
    return h.settingsWindow()->findChild<Child*>(QLatin1String(name));
}

// Selects the first port the search found and connects through `adapter`.
void connectFirstPort(hub& h, int adapter) {
    auto* ports = settingsChild<QTreeWidget>(h, "lstPorts");
    ports->setCurrentItem(ports->topLevelItem(0));
    settingsChild<QComboBox>(h, "cboAdapter")->setCurrentIndex(adapter);
    settingsChild<QPushButton>(h, "cmdSet0")->click();
}

QString writeSettingsFile(const QString& folder, qint32 typeCode) {
    SettingsSet record;
    record.ModTypeSet = typeCode;
    QString name = folder + QStringLiteral("/pump-station.kv7");
    return SaveKVdef(name, record) ? name : QString();
}

}  // namespace

class TestHub : public QObject {
    Q_OBJECT
private slots:
    void initTestCase();
    void init();
    void cleanup();

    void commandLine_data();
    void commandLine();
    void caption_data();
    void caption();
    void unknownThemeTakesTheFirstPalette();

    void firstStartWithEmptyStore();
    void debugStartShowsPanelAndLog();
    void toolBarRefusedWhileReserved_data();
    void toolBarRefusedWhileReserved();
    void tabRefusedWhileReserved();
    void statusLineHidesAfter301Ticks();
    void readModuleOpensTheFamilysWindow();
    void openRestoredModule_data();
    void openRestoredModule();
    void closingTabsSelectsTheOneBefore();
    void windowGoneByItselfIsNotCalledBack();
    void fileOnCommandLineOpensInsteadOfConnecting();
    void unreadableFileOnCommandLine();
    void fileHandedOverWhileStartingUp();
    void fileHandedOverWhileConnected();
    void missingUserGuide();
    void pleaseWaitBox();
    void addDelayHoldsTheEngine();
    void debugPanelOptions();
    void closingDisconnectsAndClosesTheRest();

    void probeEntries_data();
    void probeEntries();
    void settingsConnectNeedsAPortAndStoresIt();
    void failedConnectKeepsThePreviousPort();
    void themeChangeStoresAndRepaints();
    void settingsWindowClosesOnRunMode();
    void demoReachesRunMode();

private:
    // Shows a main window not loaded yet.
    void create(std::unique_ptr<hub> window = std::make_unique<hub>());
    // Starts a main window and waits until start-up and its automatic connect are over.
    bool start(bool debug);
    bool openSettings();
    // Lets register map `map` open a fake settings window, collected in made_.
    void offerWindow(int map);

    QTemporaryDir settingsDir_;
    QTemporaryDir portDir_;
    std::unique_ptr<hub> hub_;
    std::vector<FakeSettings*> made_;
};

void TestHub::initTestCase() {
    QVERIFY(settingsDir_.isValid());
    QVERIFY(portDir_.isValid());
    QSettings::setPath(QSettings::NativeFormat, QSettings::UserScope, settingsDir_.path());
    linkMissingPorts(portDir_.path(), {});
}

void TestHub::init() {
    qputenv("KV700_PORT_DIR", portDir_.path().toLocal8Bit());
    ClearStoredProperties();
    SetColourTheme(DefaultColourTheme);
    ShowStatus(QString());
}

void TestHub::cleanup() {
    hub_.reset();
    made_.clear();
    SetDebugFlag(false);
    ModuleMap = NoModuleMap;
}

void TestHub::create(std::unique_ptr<hub> window) {
    hub_.reset();  // one message log at a time
    hub_ = std::move(window);
    hub_->show();
}

bool TestHub::start(bool debug) {
    SetDebugFlag(debug);
    create();
    hub_->Load(QString());
    // The automatic connect meets no port and closes again.
    return QTest::qWaitFor(
        [this] { return hub_->engine().state() == StateClosed && !hub_->engine().connected(); },
        WaitMs);
}

bool TestHub::openSettings() {
    command(*hub_, CmdSettings)->trigger();
    return hub_->settingsWindow() &&
           QTest::qWaitFor(
               [this] {
                   return hub_->settingsWindow()->message() ==
                          QStringLiteral("Select a COM port and press Connect.");
               },
               WaitMs);
}

void TestHub::offerWindow(int map) {
    hub_->settingsWindowClasses().add({map, "frmFake", [this](hub& h) {
                                           made_.push_back(new FakeSettings(h));
                                           return made_.back();
                                       }});
}

void TestHub::commandLine_data() {
    QTest::addColumn<QStringList>("arguments");
    QTest::addColumn<bool>("debug");
    QTest::addColumn<QString>("file");
    QTest::addColumn<bool>("demo");
    QTest::addColumn<QString>("model");

    QTest::newRow("Debug") << QStringList{"Debug"} << true << "" << false << "";
    QTest::newRow("debug in lower case is a file")
        << QStringList{"debug"} << false << "debug" << false << "";
    QTest::newRow("file and Debug")
        << QStringList{"/data/a b.kv7", "Debug"} << true << "/data/a b.kv7" << false << "";
    QTest::newRow("Debug inside a path")
        << QStringList{"/home/Debugger/a.kv7"} << true << "/home/Debugger/a.kv7" << false << "";
    QTest::newRow("quotes passed on")
        << QStringList{"\"/data/a b.kv7\""} << false << "/data/a b.kv7" << false << "";
    QTest::newRow("first file wins")
        << QStringList{"a.kv7", "b.kv7"} << false << "a.kv7" << false << "";
    QTest::newRow("options are no files")
        << QStringList{"--verbose", "a.kv7"} << false << "a.kv7" << false << "";
    QTest::newRow("demo") << QStringList{"--demo"} << false << "" << true << "";
    QTest::newRow("demo with model")
        << QStringList{"--demo", "KV718-1A"} << false << "" << true << "KV718-1A";
    QTest::newRow("demo with type code")
        << QStringList{"--demo=7:5"} << false << "" << true << "7:5";
    QTest::newRow("demo then file")
        << QStringList{"--demo", "plant.kv7"} << false << "plant.kv7" << true << "";
}

void TestHub::commandLine() {
    QFETCH(QStringList, arguments);
    const CommandLine command = ParseCommandLine(arguments);
    QTEST(command.debug, "debug");
    QTEST(command.fileToOpen, "file");
    QTEST(command.demo, "demo");
    QTEST(command.demoModel, "model");
}

void TestHub::caption_data() {
    QTest::addColumn<QString>("version");
    QTest::addColumn<QString>("caption");
    QTest::newRow("1.0.0") << "1.0.0"
                           << "KV700 PC Programmer 0100 r0";
    QTest::newRow("2019.12.2") << "2019.12.2"
                               << "KV700 PC Programmer 201912 r2";
}

void TestHub::caption() {
    QFETCH(QString, version);
    QTEST(ProgramCaption(version), "caption");
}

void TestHub::unknownThemeTakesTheFirstPalette() {
    QCOMPARE(PaletteFor(5).themeAccent, QColor(0, 78, 75));
}

void TestHub::firstStartWithEmptyStore() {
    QVERIFY(start(false));
    QCOMPARE(hub_->GetComPortID(), qint16(0));
    QCOMPARE(hub_->GetConnector(), qint16(0));
    QCOMPARE(ColourTheme(), 1);
    QCOMPARE(hub_->windowTitle(), ProgramCaption(QStringLiteral(KV700_VERSION)));
    // The automatic connect found no port 0 and says so.
    QVERIFY2(StatusText().startsWith(QStringLiteral("Communicate:%")), qPrintable(StatusText()));
    QVERIFY(hub_->findChild<QAbstractButton*>(QStringLiteral("optConnect0"))->isChecked());
    QCOMPARE(tabStrip(*hub_)->tabText(0), QStringLiteral("About"));
    QVERIFY(!hub_->waitBoxShown());
    QVERIFY(hub_->findChild<QWidget*>(QStringLiteral("debugPanel"))->isHidden());
    QCOMPARE(hub_->tabCount(), 1);
}

void TestHub::debugStartShowsPanelAndLog() {
    QVERIFY(start(true));
    QVERIFY(!hub_->findChild<QWidget*>(QStringLiteral("debugPanel"))->isHidden());
    QCOMPARE(hub_->tabCount(), 2);
    QCOMPARE(tabStrip(*hub_)->tabText(1), QStringLiteral("Debug Log"));
    TabWindow* log = hub_->findTabWindow(tabStrip(*hub_)->tabData(1).toString());
    QVERIFY(log);
    QCOMPARE(log->windowTitle(), QStringLiteral("Log"));
    QVERIFY(!log->CanClose());
    QVERIFY(log->findChild<QPushButton*>(QStringLiteral("cmdClear")));
    QCOMPARE(hub_->selectedTag(), tabStrip(*hub_)->tabData(0).toString());  // the start page
}

void TestHub::toolBarRefusedWhileReserved_data() {
    QTest::addColumn<int>("button");
    QTest::addColumn<QString>("toolTip");
    QTest::newRow("open file") << int(CmdOpenFile) << "Open disk file into a new tab.";
    QTest::newRow("read module") << int(CmdReadModule)
                                 << "Read settings from module into a new tab.";
    QTest::newRow("user guide") << int(CmdUserGuide) << "Open Help Document";
    QTest::newRow("settings") << int(CmdSettings) << "Settings";
    QTest::newRow("close tab") << int(CmdCloseTab) << "Close this settins tab window";
}

void TestHub::toolBarRefusedWhileReserved() {
    QFETCH(int, button);
    QVERIFY(start(true));
    QTEST(command(*hub_, button)->toolTip(), "toolTip");
    ModuleMap = 3;
    offerWindow(3);
    QVERIFY(hub_->OpenRestoredModule(3));  // a tab the close button may close
    hub_->engine().setReserved(true);
    command(*hub_, button)->trigger();
    QCOMPARE(StatusText(), QStringLiteral("Please try again !!"));
    QCOMPARE(hub_->tabCount(), 3);
    QVERIFY(!hub_->settingsWindow());
    QVERIFY(hub_->engine().reserved());  // still the other user's
}

void TestHub::tabRefusedWhileReserved() {
    QVERIFY(start(true));
    QTabBar* tabs = tabStrip(*hub_);
    const QString about = tabs->tabData(0).toString();
    const QString log = tabs->tabData(1).toString();
    QCOMPARE(shownTag(*hub_), about);

    hub_->engine().setReserved(true);
    QTest::mouseClick(tabs, Qt::LeftButton, {}, tabs->tabRect(1).center());
    QCOMPARE(StatusText(), QStringLiteral("Try again later !!"));
    QCOMPARE(shownTag(*hub_), about);
    QCOMPARE(tabs->currentIndex(), 0);

    hub_->engine().setReserved(false);
    QTest::mouseClick(tabs, Qt::LeftButton, {}, tabs->tabRect(1).center());
    QCOMPARE(shownTag(*hub_), log);
    // Neither the start page nor the log can be closed.
    QVERIFY(!command(*hub_, CmdCloseTab)->isEnabled());
}

void TestHub::statusLineHidesAfter301Ticks() {
    QVERIFY(start(false));
    QLabel* line = statusLine(*hub_);
    ShowStatus(QStringLiteral("Update Registers"));
    for (int tick = 1; tick < StatusVisibleTicks; ++tick)
        emit hub_->connection().ticked();
    QVERIFY(!line->isHidden());
    QCOMPARE(line->text(), QStringLiteral("Update Registers"));
    emit hub_->connection().ticked();
    QVERIFY(line->isHidden());

    ShowStatus(QStringLiteral("Run Mode"));
    QVERIFY(!line->isHidden());
    QCOMPARE(line->text(), QStringLiteral("Run Mode"));
    for (int tick = 1; tick < StatusVisibleTicks; ++tick)
        emit hub_->connection().ticked();
    hub_->ResetStatusTimer();
    emit hub_->connection().ticked();
    QVERIFY(!line->isHidden());  // the counter started again
}

void TestHub::readModuleOpensTheFamilysWindow() {
    QVERIFY(start(false));
    ModuleMap = NoModuleMap;
    command(*hub_, CmdReadModule)->trigger();
    QCOMPARE(StatusText(), QStringLiteral("cmdProcess: Unknown Module Type"));
    QCOMPARE(hub_->tabCount(), 1);
    QVERIFY(!hub_->engine().reserved());  // the live polling may go on

    offerWindow(5);
    ModuleMap = 5;
    command(*hub_, CmdReadModule)->trigger();
    QCOMPARE(made_.size(), size_t(1));
    QCOMPARE(made_[0]->loaded, 5);
    QCOMPARE(hub_->selectedTag(), made_[0]->tag());
    QCOMPARE(shownTag(*hub_), made_[0]->tag());
    QVERIFY(command(*hub_, CmdCloseTab)->isEnabled());
    QVERIFY(hub_->engine().reserved());  // the reading run holds the engine until it ends

    // A family whose editor is not there yet is explained, and nothing stays reserved.
    hub_->engine().setReserved(false);
    ModuleMap = 6;
    command(*hub_, CmdReadModule)->trigger();
    QVERIFY(StatusText().startsWith(QStringLiteral("cmdProcess: ")));
    QCOMPARE(hub_->tabCount(), 2);
    QVERIFY(!hub_->engine().reserved());
}

void TestHub::openRestoredModule_data() {
    QTest::addColumn<int>("map");
    QTest::addColumn<bool>("opened");
    QTest::newRow("no module") << 0 << false;
    QTest::newRow("first family") << 1 << true;
    QTest::newRow("last family") << 7 << true;
    QTest::newRow("beyond the families") << 8 << false;
}

void TestHub::openRestoredModule() {
    QFETCH(int, map);
    QFETCH(bool, opened);
    QVERIFY(start(false));
    for (int family = 1; family <= 7; ++family)
        offerWindow(family);
    ShowStatus(QString());
    QCOMPARE(hub_->OpenRestoredModule(map), opened);
    QCOMPARE(hub_->tabCount(), opened ? 2 : 1);
    if (opened) {
        QCOMPARE(made_.size(), size_t(1));
        QCOMPARE(made_[0]->restored, map);
        QCOMPARE(shownTag(*hub_), made_[0]->tag());
    } else {
        QVERIFY(made_.empty());
        QCOMPARE(StatusText(), QStringLiteral("OpenRestoredModule: ? Module"));
    }
}

void TestHub::closingTabsSelectsTheOneBefore() {
    QVERIFY(start(true));
    offerWindow(3);
    QVERIFY(hub_->OpenRestoredModule(3));
    const QString third = hub_->selectedTag();
    QVERIFY(hub_->OpenRestoredModule(3));
    const QString fourth = hub_->selectedTag();
    QCOMPARE(hub_->tabCount(), 4);

    command(*hub_, CmdCloseTab)->trigger();
    QCOMPARE(StatusText(), QStringLiteral("closing"));
    QCOMPARE(hub_->tabCount(), 3);
    QVERIFY(!hub_->findTabWindow(fourth));
    QCOMPARE(hub_->selectedTag(), third);
    QCOMPARE(shownTag(*hub_), third);

    command(*hub_, CmdCloseTab)->trigger();
    QCOMPARE(hub_->tabCount(), 2);
    QCOMPARE(hub_->selectedTag(), tabStrip(*hub_)->tabData(1).toString());  // the log
    QVERIFY(!command(*hub_, CmdCloseTab)->isEnabled());
    QVERIFY(!hub_->engine().reserved());
}

void TestHub::windowGoneByItselfIsNotCalledBack() {
    QVERIFY(start(false));
    offerWindow(3);
    QVERIFY(hub_->OpenRestoredModule(3));
    const QString tag = made_[0]->tag();
    hub_->engine().setState(StateRun);
    QString error;
    QVERIFY(hub_->engine().R_CB(20, 16, tag, CallbackGet, error));
    delete made_[0];
    QCOMPARE(hub_->tabCount(), 1);
    QCOMPARE(shownTag(*hub_), tabStrip(*hub_)->tabData(0).toString());
    hub_->engine().ProcessCallBack(20, 16, QString(), true);
    QCOMPARE(StatusText(), QStringLiteral("Missing CB form?"));
}

void TestHub::fileOnCommandLineOpensInsteadOfConnecting() {
    QTemporaryDir folder;
    const QString file = writeSettingsFile(folder.path(), 4);  // a KV720: register map 3
    QVERIFY(!file.isEmpty());
    SetDebugFlag(false);
    create();
    offerWindow(3);
    hub_->Load(file);
    QCOMPARE(StatusText(), file);
    QTRY_VERIFY_WITH_TIMEOUT(!made_.empty(), WaitMs);
    QCOMPARE(made_[0]->restored, 3);
    QCOMPARE(hub_->engine().state(), qint32(StateClosed));
    QVERIFY(!hub_->engine().connected());
    QVERIFY(!hub_->waitBoxShown());
}

void TestHub::unreadableFileOnCommandLine() {
    const QString file = QStringLiteral("/nonexistent/folder/plant.kv7");
    create();
    hub_->Load(file);
    QTRY_COMPARE_WITH_TIMEOUT(StatusText(), QStringLiteral("1 DDE F: ") + file, WaitMs);
    QCOMPARE(hub_->tabCount(), 1);
    QVERIFY(!hub_->engine().connected());
}

void TestHub::fileHandedOverWhileStartingUp() {
    QTemporaryDir folder;
    const QString file = writeSettingsFile(folder.path(), 9);  // a KV760: register map 6
    create();
    offerWindow(6);
    hub_->Load(QString());
    hub_->ReceiveFile(file);  // before the first tick
    QVERIFY(made_.empty());
    QTRY_VERIFY_WITH_TIMEOUT(!made_.empty(), WaitMs);
    QCOMPARE(made_[0]->restored, 6);
    QVERIFY(!hub_->engine().connected());
}

void TestHub::fileHandedOverWhileConnected() {
    QTemporaryDir folder;
    const QString file = writeSettingsFile(folder.path(), 4);
    QVERIFY(start(false));
    offerWindow(3);
    QString error;
    QVERIFY(hub_->OpenCom(true, error));
    hub_->ReceiveFile(file);
    QVERIFY(!hub_->engine().connected());
    QVERIFY(hub_->findChild<QAbstractButton*>(QStringLiteral("optConnect0"))->isChecked());
    QCOMPARE(made_.size(), size_t(1));
    QCOMPARE(StatusText(), file);
}

void TestHub::missingUserGuide() {
    QVERIFY(start(true));
    hub_->messageLog().clear();
    command(*hub_, CmdUserGuide)->trigger();
    const QString expected = QStringLiteral("file not found ") +
                             QCoreApplication::applicationDirPath() +
                             QStringLiteral("/KV705-DS41876-UserGuide-9.pdf");
    QVERIFY2(hub_->messageLog().text().startsWith(expected), qPrintable(hub_->messageLog().text()));
    QVERIFY2(StatusText().startsWith(expected), qPrintable(StatusText()));
    QVERIFY(!hub_->engine().reserved());
}

void TestHub::pleaseWaitBox() {
    QVERIFY(start(false));
    auto* box = hub_->findChild<PleaseWait*>();
    QVERIFY(box);
    hub_->WaitMsg(false, QStringLiteral("Reading"));
    QVERIFY(!hub_->waitBoxShown());
    hub_->WaitMsg(true, QString());
    QVERIFY(hub_->waitBoxShown());
    QCOMPARE(box->windowTitle(), QStringLiteral("Please Wait"));
    hub_->WaitMsg(true, QStringLiteral("Reading"));
    QCOMPARE(box->message(), QStringLiteral("Reading"));
    ShowStatus(QStringLiteral("Input 1: 4-20 mA"));
    QCOMPARE(box->message(), QStringLiteral("Input 1: 4-20 mA"));
    hub_->WaitMsg(false, QStringLiteral("Nearly done"));
    QCOMPARE(box->message(), QStringLiteral("Nearly done"));
    hub_->WaitMsg(false, QString());
    QVERIFY(!hub_->waitBoxShown());

    // The connection settings window keeps the box away.
    QVERIFY(openSettings());
    hub_->WaitMsg(true, QStringLiteral("Reading"));
    QVERIFY(!hub_->waitBoxShown());
}

void TestHub::addDelayHoldsTheEngine() {
    QVERIFY(start(false));
    QString error;
    QVERIFY(hub_->OpenCom(true, error));
    QVERIFY(hub_->connection().timerActive());
    bool runningDuringDelay = true;
    QTimer::singleShot(0, this, [&] { runningDuringDelay = hub_->connection().timerActive(); });
    hub_->AddDelay(0.05f, QStringLiteral("settling"));
    QCOMPARE(StatusText(), QStringLiteral("Delay settling"));
    QVERIFY(!runningDuringDelay);
    QVERIFY(hub_->connection().timerActive());

    QVERIFY(hub_->OpenCom(false, error));
    hub_->AddDelay(0.01f, QStringLiteral("again"));
    QVERIFY(!hub_->connection().timerActive());  // stays as it was
}

void TestHub::debugPanelOptions() {
    QVERIFY(start(true));
    hub_->messageLog().clear();
    DebugMessage(DiagSend, QStringLiteral("COM"), QStringLiteral("1.00 >"), "R",
                 QStringLiteral("RV"));
    QVERIFY(hub_->messageLog().text().isEmpty());  // "Send" not ticked
    hub_->findChild<QCheckBox*>(QStringLiteral("chkLevel0"))->setChecked(true);
    DebugMessage(DiagSend, QStringLiteral("COM"), QStringLiteral("1.00 >"), "R",
                 QStringLiteral("RV"));
    QCOMPARE(hub_->messageLog().text(), QStringLiteral("COM:RV1.00 > 52\n"));

    hub_->findChild<QCheckBox*>(QStringLiteral("chkNoDef"))->setChecked(true);
    QVERIFY(hub_->connection().pollingSuspended());

    auto* tester = hub_->findChild<QPushButton*>(QStringLiteral("cmdDebug2"));
    QCOMPARE(tester->text(), QStringLiteral("KV Tester"));
    QVERIFY(!tester->isEnabled());
    int opened = 0;
    hub_->setServiceTool(ToolTester, [&opened] { ++opened; });
    QVERIFY(tester->isEnabled());
    tester->click();
    QCOMPARE(opened, 1);
}

void TestHub::closingDisconnectsAndClosesTheRest() {
    QVERIFY(start(false));
    QVERIFY(openSettings());
    QString error;
    QVERIFY(hub_->OpenCom(true, error));
    hub_->close();
    QVERIFY(!hub_->engine().connected());
    QTRY_VERIFY_WITH_TIMEOUT(!hub_->settingsWindow(), WaitMs);
}

void TestHub::probeEntries_data() {
    QTest::addColumn<bool>("replied");
    QTest::addColumn<QByteArray>("reply");
    QTest::addColumn<QString>("error");
    QTest::addColumn<QString>("entry");

    const QByteArray kv720 = QByteArray("R") + char(16) + char(255) + "00000004" + "0";
    QTest::newRow("module answers") << true << kv720 << ""
                                    << "Com7 KV720-20";
    QTest::newRow("no such port") << false << QByteArray() << "%"
                                  << "";
    QTest::newRow("no permission") << false << QByteArray() << "/Port file error 13"
                                   << "Com7/Port file error 13";
    QTest::newRow("silent port") << false << QByteArray() << ""
                                 << "Com7";
}

void TestHub::probeEntries() {
    QFETCH(bool, replied);
    QFETCH(QByteArray, reply);
    QFETCH(QString, error);
    const std::optional<QString> entry = ProbeEntryText(7, replied, reply, error);
    QTEST(entry.value_or(QString()), "entry");
    if (error == QLatin1String("/Port file error 13")) {
        QVERIFY(ProbeDeviceNote(7, error).endsWith(QLatin1String("(no permission)")));
        QVERIFY(PermissionAdvice(7).contains(QLatin1String("adduser")));
    }
}

void TestHub::settingsConnectNeedsAPortAndStoresIt() {
    PtyPeer peer(4);  // a port where nothing answers
    QVERIFY(peer.isReady());
    linkMissingPorts(peer.portDir(), {4});
    QVERIFY(start(false));
    QVERIFY(openSettings());
    auto* ports = settingsChild<QTreeWidget>(*hub_, "lstPorts");
    QCOMPARE(ports->topLevelItemCount(), 1);
    QCOMPARE(ports->topLevelItem(0)->text(0), QStringLiteral("Com4"));
    QVERIFY(ports->selectedItems().isEmpty());  // the engine's port 0 is not in the list

    settingsChild<QPushButton>(*hub_, "cmdSet0")->click();
    QCOMPARE(hub_->settingsWindow()->message(), QStringLiteral("Select a COM port"));
    QVERIFY(!hub_->engine().connected());
    QVERIFY(!StoredProperty(KeyCommPort).isValid());

    connectFirstPort(*hub_, 1);
    QVERIFY(hub_->engine().connected());
    QCOMPARE(hub_->GetComPortID(), qint16(4));
    QCOMPARE(hub_->GetConnector(), qint16(1));
    QCOMPARE(StoredProperty(KeyCommPort), QVariant(QStringLiteral("4")));
    QCOMPARE(StoredProperty(KeyConnector), QVariant(QStringLiteral("1")));
    QVERIFY(!StoredProperty(KeyComBuffer).isValid());
}

void TestHub::failedConnectKeepsThePreviousPort() {
    PtyPeer peer(4);
    QVERIFY(peer.isReady());
    linkMissingPorts(peer.portDir(), {4});
    StoreProperty(KeyCommPort, QStringLiteral("7"));
    StoreProperty(KeyConnector, QStringLiteral("1"));
    SetDebugFlag(false);
    create(std::make_unique<RefusingHub>());
    hub_->Load(QString());
    QTRY_VERIFY_WITH_TIMEOUT(hub_->engine().state() == StateClosed, WaitMs);
    QCOMPARE(StatusText(), QStringLiteral("Open Com: adapter missing"));

    QVERIFY(openSettings());
    connectFirstPort(*hub_, 0);
    QCOMPARE(hub_->settingsWindow()->message(), QStringLiteral("FAIL: adapter missing"));
    QCOMPARE(hub_->GetComPortID(), qint16(7));
    QCOMPARE(hub_->GetConnector(), qint16(1));
    QCOMPARE(StoredProperty(KeyCommPort), QVariant(QStringLiteral("7")));
    QCOMPARE(StoredProperty(KeyComBuffer), QVariant(QStringLiteral("1")));
    QCOMPARE(StoredProperty(KeyConnector), QVariant(QStringLiteral("1")));
}

void TestHub::themeChangeStoresAndRepaints() {
    QVERIFY(start(false));
    auto* bar = hub_->findChild<QWidget*>(QStringLiteral("moduleBar"));
    QCOMPARE(bar->palette().color(QPalette::Window), QColor(150, 0, 0));
    QVERIFY(openSettings());
    auto* themes = settingsChild<QComboBox>(*hub_, "cboTheme");
    QCOMPARE(themes->currentIndex(), 1);

    QSignalSpy repainted(hub_.get(), &hub::colourThemeChanged);
    // The theme already in use: nothing stored.
    emit themes->activated(1);
    QVERIFY(!StoredProperty(KeyColourTheme).isValid());
    QCOMPARE(repainted.count(), 0);

    themes->setCurrentIndex(0);
    emit themes->activated(0);
    QCOMPARE(StoredProperty(KeyColourTheme), QVariant(QStringLiteral("0")));
    QCOMPARE(ColourTheme(), 0);
    QCOMPARE(bar->palette().color(QPalette::Window), QColor(0, 78, 75));
    QCOMPARE(repainted.count(), 1);
    QCOMPARE(repainted.at(0).at(0).toInt(), 0);
}

void TestHub::settingsWindowClosesOnRunMode() {
    QVERIFY(start(false));
    QVERIFY(openSettings());
    ShowStatus(QStringLiteral("Run Modem"));
    QCOMPARE(hub_->settingsWindow()->message(), QStringLiteral("Run Modem"));
    QTest::qWait(20);
    QVERIFY(hub_->settingsWindow());
    ShowStatus(QStringLiteral("Run Mode"));
    QTRY_VERIFY_WITH_TIMEOUT(!hub_->settingsWindow(), WaitMs);
}

void TestHub::demoReachesRunMode() {
    StoreProperty(KeyCommPort, QStringLiteral("9"));
    DemoModule demo;
    QString error;
    QVERIFY2(demo.start(QStringLiteral("KV760-20"), error), qPrintable(error));
    QCOMPARE(demo.modelName(), QStringLiteral("KV760-20"));
    create();
    hub_->Load(QString());
    hub_->overrideConnection(DemoPort, DemoConnector, QStringLiteral("Demo"));
    QSignalSpy identified(&hub_->connection(), &ModuleConnection::runMode);
    QVERIFY(identified.wait(60000));
    QCOMPARE(StatusText(), QStringLiteral("Run Mode"));
    QVERIFY(hub_->engine().connected());
    QCOMPARE(ModuleMap, 6);
    QCOMPARE(hub_->findChild<QLabel*>(QStringLiteral("labModule"))->text().trimmed(),
             QStringLiteral("KV760-20"));
    // The user's own port stays stored, whatever the demonstration connects to.
    QString ignored;
    hub_->OpenCom(false, ignored);
    QVERIFY(openSettings());
    auto* ports = settingsChild<QTreeWidget>(*hub_, "lstPorts");
    QVERIFY(ports->currentItem()->text(0).startsWith(QStringLiteral("Com1 KV760")));
    settingsChild<QPushButton>(*hub_, "cmdSet0")->click();
    QCOMPARE(StoredProperty(KeyCommPort), QVariant(QStringLiteral("9")));
    SetConnectionPropertiesFrozen(false);
}

QTEST_MAIN(TestHub)
#include "tst_hub.moc"
