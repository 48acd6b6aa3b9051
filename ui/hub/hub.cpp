#include "ui/hub/hub.h"

#include "engine/app_settings.h"
#include "engine/diagnostics.h"
#include "engine/start_up.h"
#include "files/kv7_file.h"
#include "model/module_types.h"
#include "model/register_map.h"
#include "model/register_values.h"
#include "ui/about/frm_about.h"
#include "ui/common/colour_palette.h"
#include "ui/common/tab_window.h"
#include "ui/comset/frm_comset.h"
#include "ui/hub/please_wait.h"
#include "ui/log/frm_log.h"

#include <QAction>
#include <QApplication>
#include <QButtonGroup>
#include <QCheckBox>
#include <QCloseEvent>
#include <QEventLoop>
#include <QGroupBox>
#include <QHBoxLayout>
#include <QLabel>
#include <QPushButton>
#include <QRadioButton>
#include <QScreen>
#include <QStackedWidget>
#include <QStatusBar>
#include <QStyle>
#include <QTabBar>
#include <QTimer>
#include <QToolBar>
#include <QVBoxLayout>

namespace kv {

namespace {
constexpr int TopEdge = 10;

struct ToolButton {
    const char* text;
    const char* toolTip;
    QStyle::StandardPixmap icon;
};
// clang-format off
const ToolButton toolButtons[] = {
    {"Open File",   "Open disk file into a new tab.",            QStyle::SP_DialogOpenButton},
    {"Read Module", "Read settings from module into a new tab.", QStyle::SP_BrowserReload},
    {"User Guide",  "Open Help Document",                        QStyle::SP_DialogHelpButton},
    {"Settings",    "Settings",                                  QStyle::SP_ComputerIcon},
    {"Close Tab",   "Close this settins tab window",             QStyle::SP_DialogCloseButton},
};

// Debug-panel options: which diagnostic levels reach the log.
struct LevelOption {
    const char* text;
    int option;
};
const LevelOption levelOptions[] = {
    {"Send", LogSend}, {"Rec", LogReceive}, {"Gen", LogGeneral},
    {"Com Stp", LogSerialSteps}, {"Descript", LogDescribe},
};

const char* const serviceTools[] = {"Trim Values", "Trim Wild", "KV Tester"};
// clang-format on

}  // namespace

hub::hub(QWidget* parent) : QMainWindow(parent) {
    setObjectName(HubTag);
    setWindowTitle(ProgramCaption(QStringLiteral(KV700_VERSION)));

    buildToolBar();
    auto* central = new QWidget(this);
    auto* layout = new QVBoxLayout(central);
    layout->setContentsMargins(0, 0, 0, 0);
    layout->setSpacing(0);
    layout->addWidget(buildModuleBar());

    livePanelArea_ = new QWidget(central);
    livePanelArea_->setObjectName(QStringLiteral("livePanelArea"));
    livePanelLayout_ = new QVBoxLayout(livePanelArea_);
    livePanelLayout_->setContentsMargins(8, 8, 8, 0);
    livePanelArea_->hide();
    layout->addWidget(livePanelArea_);

    layout->addWidget(buildDebugPanel());
    layout->addWidget(buildTabArea(), 1);
    setCentralWidget(central);

    labStatus_ = new QLabel(this);
    labStatus_->setObjectName(QStringLiteral("labStatus"));
    labStatus_->setTextInteractionFlags(Qt::TextSelectableByMouse);
    statusBar()->addWidget(labStatus_, 1);
    labConnection_ = new QLabel(this);
    labConnection_->setObjectName(QStringLiteral("labConnection"));
    statusBar()->addPermanentWidget(labConnection_);
    statusBar()->setSizeGripEnabled(true);

    waitBox_ = new PleaseWait(this);

    connect(&log_, &MessageLog::statusChanged, this, &hub::showStatus);
    connect(&log_, &MessageLog::statusVisibilityChanged, labStatus_, &QLabel::setVisible);
    connect(&connection_, &ModuleConnection::ticked, &log_, &MessageLog::statusTick);
    connect(&connection_, &ModuleConnection::startUpTick, this, &hub::finishStartUp);
    connect(&connection_, &ModuleConnection::waitBox, this, &hub::WaitMsg);
    connect(&connection_, &ModuleConnection::beep, this, [] { QApplication::beep(); });
    connect(&connection_, &ModuleConnection::moduleTextChanged, this, &hub::showModuleCaption);
    connect(&connection_, &ModuleConnection::moduleControlsChanged, this,
            &hub::onModuleControlsChanged);
    connect(&connection_, &ModuleConnection::connectionChanged, this, &hub::showConnection);
    SetModuleCaptionHandler([this](const QString& text) { showModuleCaption(text); });

    resize(1000, 720);
    SetColour();
}

hub::~hub() {
    SetModuleCaptionHandler(nullptr);
    // While the engine still exists, so that each window leaves its callbacks behind.
    while (tabWindows_->count() > 0)
        delete tabWindows_->widget(0);
}

void hub::buildToolBar() {
    auto* bar = addToolBar(QStringLiteral("Commands"));
    bar->setObjectName(QStringLiteral("toolBar"));
    bar->setMovable(false);
    bar->setFloatable(false);
    bar->setToolButtonStyle(Qt::ToolButtonTextBesideIcon);
    bar->setContextMenuPolicy(Qt::PreventContextMenu);
    for (int i = 0; i < int(cmdProcess_.size()); ++i) {
        const ToolButton& button = toolButtons[i];
        QAction* action =
            bar->addAction(style()->standardIcon(button.icon), QString::fromLatin1(button.text));
        action->setObjectName(QStringLiteral("cmdProcess%1").arg(i));
        action->setToolTip(QString::fromLatin1(button.toolTip));
        connect(action, &QAction::triggered, this, [this, i] { cmdProcess_Click(i); });
        cmdProcess_[i] = action;
        if (i == CmdUserGuide)
            bar->addSeparator();
    }
}

QWidget* hub::buildModuleBar() {
    moduleBar_ = new QWidget(this);
    moduleBar_->setObjectName(QStringLiteral("moduleBar"));
    labModule_ = new QLabel(moduleBar_);
    labModule_->setObjectName(QStringLiteral("labModule"));
    QFont font = labModule_->font();
    font.setPointSizeF(font.pointSizeF() * 1.3);
    font.setBold(true);
    labModule_->setFont(font);

    optConnect_ = new QButtonGroup(this);
    auto* layout = new QHBoxLayout(moduleBar_);
    layout->setContentsMargins(12, 8, 12, 8);
    layout->setSpacing(16);
    layout->addWidget(labModule_, 1);
    const char* const captions[] = {"Close COM", "Connect to module"};
    for (int i : {OptConnect, OptCloseCom}) {
        auto* option = new QRadioButton(QString::fromLatin1(captions[i]), moduleBar_);
        option->setObjectName(QStringLiteral("optConnect%1").arg(i));
        optConnect_->addButton(option, i);
        layout->addWidget(option);
    }
    optConnect_->button(OptCloseCom)->setChecked(true);
    connect(optConnect_, &QButtonGroup::idClicked, this, &hub::optConnect_Click);
    showModuleCaption(QString());
    return moduleBar_;
}

QWidget* hub::buildDebugPanel() {
    debugPanel_ = new QWidget(this);
    debugPanel_->setObjectName(QStringLiteral("debugPanel"));
    auto* frame = new QGroupBox(QStringLiteral("Debug"), debugPanel_);
    auto* outer = new QVBoxLayout(debugPanel_);
    outer->setContentsMargins(8, 6, 8, 0);
    outer->addWidget(frame);
    auto* layout = new QHBoxLayout(frame);
    for (int i = 0; i < int(cmdDebug_.size()); ++i) {
        auto* button = new QPushButton(QString::fromLatin1(serviceTools[i]), frame);
        button->setObjectName(QStringLiteral("cmdDebug%1").arg(i));
        button->setEnabled(false);
        button->setToolTip(QStringLiteral("This service tool is not part of this version."));
        layout->addWidget(button);
        cmdDebug_[i] = button;
    }
    layout->addSpacing(24);
    layout->addWidget(new QLabel(QStringLiteral("Log:"), frame));
    for (const LevelOption& level : levelOptions) {
        auto* option = new QCheckBox(QString::fromLatin1(level.text), frame);
        option->setObjectName(QStringLiteral("chkLevel%1").arg(level.option));
        const int index = level.option;
        connect(option, &QCheckBox::toggled, this, [this, index](bool on) {
            log_.setOption(index, on);
            if (index == LogDescribe)
                engine().setDescribeMessages(on);
        });
        layout->addWidget(option);
    }
    layout->addSpacing(24);
    auto* noDef = new QCheckBox(QStringLiteral("No Def"), frame);
    noDef->setObjectName(QStringLiteral("chkNoDef"));
    noDef->setToolTip(QStringLiteral("Suspend the live polling of the module"));
    connect(noDef, &QCheckBox::toggled, &connection_, &ModuleConnection::setPollingSuspended);
    layout->addWidget(noDef);
    layout->addStretch();
    debugPanel_->hide();
    return debugPanel_;
}

QWidget* hub::buildTabArea() {
    auto* area = new QWidget(this);
    auto* layout = new QVBoxLayout(area);
    layout->setContentsMargins(8, 8, 8, 4);
    layout->setSpacing(0);
    tabs_ = new QTabBar(area);
    tabs_->setObjectName(QStringLiteral("ts"));
    tabs_->setExpanding(false);
    tabs_->setDocumentMode(true);
    tabWindows_ = new QStackedWidget(area);
    tabWindows_->setObjectName(QStringLiteral("tabWindows"));
    tabWindows_->setFrameShape(QFrame::StyledPanel);
    layout->addWidget(tabs_);
    layout->addWidget(tabWindows_, 1);
    connect(tabs_, &QTabBar::currentChanged, this, &hub::onTabChanged);
    return area;
}

void hub::Load(const QString& fileToOpen) {
    connection_.stopTimer();
    engine().setState(StateStartUp);

    const StoredProperties stored = LoadProperties(engine().port(), engine().connector());
    SetColourTheme(stored.colourTheme);
    engine().setPort(stored.commPort);
    engine().setConnector(stored.connector);

    SetRegMap(RegAdd, NoModuleMap);
    ModuleMap = NoModuleMap;
    emit connection_.moduleControlsChanged();
    showConnection(false);

    placeWindow();
    about_ = new frmAbout(this);
    addTabWindow(about_, false);
    if (DebugFlag()) {
        debugPanel_->show();
        logWindow_ = new frmLog(log_, this);
        addTabWindow(logWindow_, false);
    }
    setCurrentTab(0);
    ts_SelectTab();

    fileToOpen_ = fileToOpen;
    if (!fileToOpen_.isEmpty())
        ShowStatus(fileToOpen_);
    SetColour();
    WaitMsg(true, QStringLiteral("Starting Up"));
    connection_.startTimer(StartUpIntervalMs);
}

void hub::placeWindow() {
    const QScreen* screen = this->screen();
    if (!screen)
        return;
    const QRect available = screen->availableGeometry();
    resize(qMin(width(), available.width()), qMin(height(), available.height() - TopEdge));
    move(available.x() + (available.width() - frameGeometry().width()) / 2,
         available.y() + TopEdge);
}

void hub::finishStartUp() {
    engine().setState(StateClosed);
    setMinimumSize(minimumSizeHint());
    const QString file = std::exchange(fileToOpen_, QString());
    if (file.isEmpty()) {
        optConnect_Click(OptConnect);
        return;
    }
    WaitMsg(false, QString());
    ShowStatus(file);
    openFile(file);
}

void hub::openFile(const QString& path) {
    QString name = path;
    qint32 typeCode = 0;
    if (!RestoreKVdef(name, typeCode)) {
        ShowStatus(QStringLiteral("1 DDE F: ") + path);
        AddMessage(name);
        return;
    }
    ShowStatus(path);
    OpenRestoredModule(GetModMap(typeCode));
}

void hub::ReceiveFile(const QString& path) {
    if (engine().state() == StateStartUp) {
        fileToOpen_ = path;
        return;
    }
    optConnect_Click(OptCloseCom);
    openFile(path);
    raise();
    activateWindow();
}

void hub::overrideConnection(qint16 port, qint16 connector, const QString& note) {
    SetConnectionPropertiesFrozen(true);
    engine().setPort(port);
    engine().setConnector(connector);
    connectionNote_ = note;
    showConnection(engine().connected());
}

bool hub::OpenCom(bool connect, QString& error) {
    return connection_.OpenCom(connect, error);
}

void hub::optConnect_Click(int index) {
    if (connection_.busy())
        return;
    QString error;
    const bool connect = index == OptConnect;
    if (!OpenCom(connect, error))
        ShowStatus((connect ? QStringLiteral("Open Com: ") : QStringLiteral("Close Com: ")) +
                   error);
}

void hub::setLivePanel(QWidget* panel) {
    if (livePanel_)
        livePanel_->deleteLater();
    livePanel_ = panel;
    if (panel)
        livePanelLayout_->addWidget(panel);
    livePanelArea_->setVisible(panel != nullptr);
}

void hub::setServiceTool(ServiceTool tool, std::function<void()> open) {
    QPushButton* button = cmdDebug_[tool];
    button->disconnect();
    button->setEnabled(bool(open));
    button->setToolTip(QString());
    if (open)
        connect(button, &QPushButton::clicked, this, std::move(open));
}

void hub::WaitMsg(bool show, const QString& text) {
    if (comSet_)
        return;
    if (!show) {
        if (waitBox_->isVisible()) {
            if (text.isEmpty())
                waitBox_->hide();
            else
                waitBox_->setMessage(text);
        }
        return;
    }
    if (!waitBox_->isVisible()) {
        waitBox_->show();
        waitBox_->move(geometry().center() - waitBox_->rect().center());
    }
    if (!text.isEmpty())
        waitBox_->setMessage(text);
}

bool hub::waitBoxShown() const {
    return waitBox_->isVisible();
}

void hub::AddDelay(float seconds, const QString& text) {
    const bool running = connection_.timerActive();
    connection_.stopTimer();
    ShowStatus(QStringLiteral("Delay ") + text);
    QEventLoop wait;
    QTimer::singleShot(qMax(0, qRound(seconds * 1000.0f)), &wait, &QEventLoop::quit);
    wait.exec();
    if (running)
        connection_.startTimer(engine().state() == StateStartUp ? StartUpIntervalMs
                                                                : RunIntervalMs);
}

void hub::showStatus(const QString& text) {
    labStatus_->setText(text);
    if (comSet_)
        comSet_->AddMessage(text);
    if (waitBox_->isVisible())
        waitBox_->setMessage(text);
}

void hub::showModuleCaption(const QString& text) {
    labModule_->setText(text.trimmed().isEmpty() ? QStringLiteral("No module") : text);
}

void hub::onModuleControlsChanged() {
    if (ModuleMap == NoModuleMap)
        showModuleCaption(QString());
}

void hub::showConnection(bool connected) {
    optConnect_->button(connected ? OptConnect : OptCloseCom)->setChecked(true);
    const qint16 adapter = engine().connector();
    const QString adapterName = adapter == 0   ? QStringLiteral("QTR490-02")
                                : adapter == 1 ? QStringLiteral("KV705-01")
                                               : QStringLiteral("adapter type %1").arg(adapter);
    QString text;
    if (connected)
        text = QStringLiteral("COM%1, %2").arg(engine().port()).arg(adapterName);
    else if (engine().port() <= 0)
        text = QStringLiteral("No COM port chosen: press Settings");
    else
        text = QStringLiteral("Not connected (COM%1, %2)").arg(engine().port()).arg(adapterName);
    labConnection_->setText(
        connectionNote_.isEmpty() ? text : connectionNote_ + QStringLiteral(" - ") + text);
}

void hub::ChangeColourTheme(int theme) {
    if (theme == ColourTheme())
        return;
    SetColourTheme(theme);
    SaveProperty(KeyColourTheme, qint16(ColourTheme()));
    for (QWidget* widget : QApplication::allWidgets())
        if (auto* window = dynamic_cast<ThemedWindow*>(widget))
            window->SetColour();
    emit colourThemeChanged(ColourTheme());
}

void hub::SetColour() {
    ApplyBaseColours(this);
    ApplyAccentColours(moduleBar_);
}

void hub::closeEvent(QCloseEvent* event) {
    QString error;
    if (!OpenCom(false, error))
        ShowStatus(error);
    for (QWidget* window : QApplication::topLevelWidgets())
        if (window != this && window->isVisible())
            window->close();
    event->accept();
}

}  // namespace kv
