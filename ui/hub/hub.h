#pragma once
// The main window: owns the request engine and its timer, the status line and
// message log, the connection, the tool bar, and the tab strip that hosts the
// start page, the debug log and one settings window per module or file.

#include "engine/message_log.h"
#include "engine/module_connection.h"
#include "model/register_map.h"
#include "ui/common/themed_window.h"
#include "ui/comset/frm_comset.h"
#include "ui/hub/settings_window_classes.h"

#include <QMainWindow>
#include <QPointer>

#include <array>
#include <functional>

class QAction;
class QButtonGroup;
class QCheckBox;
class QLabel;
class QPushButton;
class QRadioButton;
class QStackedWidget;
class QTabBar;
class QVBoxLayout;

namespace kv {

class PleaseWait;
class TabWindow;
class frmAbout;
class frmLog;

// Tool-bar buttons, in order.
enum HubCommand {
    CmdOpenFile = 0,
    CmdReadModule = 1,
    CmdUserGuide = 2,
    CmdSettings = 3,
    CmdCloseTab = 4,
};
// Connection option buttons.
enum ConnectOption { OptCloseCom = 0, OptConnect = 1 };
// Debug-panel service buttons.
enum ServiceTool { ToolTrimValues = 0, ToolTrimWild = 1, ToolTester = 2 };

constexpr auto UserGuideName = "KV705-DS41876-UserGuide-9.pdf";

inline const QString HubTag = QStringLiteral("hub");

// The register maps of the module families, each with its settings window class.
inline bool IsModuleMap(int map) {
    return map >= 1 && map <= MapCount;
}

class hub : public QMainWindow, public ThemedWindow {
    Q_OBJECT
public:
    explicit hub(QWidget* parent = nullptr);
    ~hub() override;

    // Start-up: reads the stored properties, shows the start page (and the
    // debug log with the debug flag), then starts the timer; once start-up is
    // over it connects, or opens `fileToOpen` when one is given.
    void Load(const QString& fileToOpen);
    // A file handed over by another start of the program.
    void ReceiveFile(const QString& path);

    // Connects to `port` instead of the stored one, without storing it; `note`
    // tells the user why (a demonstration on a simulated module).
    void overrideConnection(qint16 port, qint16 connector, const QString& note);

    ModuleConnection& connection() { return connection_; }
    RequestEngine& engine() { return connection_.engine(); }
    MessageLog& messageLog() { return log_; }

    // Connects or disconnects the engine.
    virtual bool OpenCom(bool connect, QString& error);
    qint16 GetComPortID() { return engine().port(); }
    void SetComPortID(qint16 port) { engine().setPort(port); }
    qint16 GetConnector() { return engine().connector(); }
    void setConnector(qint16 connector) { engine().setConnector(connector); }

    // Tabs. A window added here is registered with the engine by its tag when
    // it takes callbacks, and selected unless `select` is false.
    void addTabWindow(TabWindow* window, bool select = true);
    void ts_SelectTab();
    // Removes the tab of `tag` (the selected one when empty) and deletes its
    // window; when it was selected and above the second, the tab before it is selected.
    void ts_CloseTabSelectNext(const QString& tag = {});
    TabWindow* findTabWindow(const QString& tag) const;
    QString selectedTag() const;
    int tabCount() const;
    // Opens the settings window of register map `map` for the file loaded last.
    bool OpenRestoredModule(int map);
    void CheckMinorTrim(const QString& tag);
    SettingsWindowRegistry& settingsWindowClasses() { return settingsWindows_; }

    // The live value display sits between the module bar and the tabs.
    void setLivePanel(QWidget* panel);
    QWidget* livePanel() const { return livePanel_; }
    // Enables a debug-panel button once its service window exists.
    void setServiceTool(ServiceTool tool, std::function<void()> open);

    void WaitMsg(bool show, const QString& text);
    bool waitBoxShown() const;
    // Waits `seconds` with the engine timer stopped, handling window events.
    void AddDelay(float seconds, const QString& text);
    void ResetStatusTimer() { log_.resetStatusCounter(); }

    // The connection settings window while it is open.
    frmComSet* settingsWindow() const { return comSet_; }
    // A new theme from the settings window: stored, and every window repainted.
    void ChangeColourTheme(int theme);
    void SetColour() override;

signals:
    // After every window has been repainted; widgets that are no window follow it.
    void colourThemeChanged(int theme);

protected:
    void closeEvent(QCloseEvent* event) override;

private:
    void buildToolBar();
    QWidget* buildModuleBar();
    QWidget* buildDebugPanel();
    QWidget* buildTabArea();
    void placeWindow();

    void cmdProcess_Click(int index);
    void openFileIntoTab();
    void readModuleIntoTab();
    void openUserGuide();
    void openSettings();
    void closeActiveTab();

    void optConnect_Click(int index);
    void onTabChanged();
    void finishStartUp();
    void openFile(const QString& path);
    void showStatus(const QString& text);
    void showModuleCaption(const QString& text);
    void onModuleControlsChanged();
    void showConnection(bool connected);
    int tabIndexOf(const QString& tag) const;
    void setCurrentTab(int index);

    ModuleConnection connection_;
    MessageLog log_;
    SettingsWindowRegistry settingsWindows_;
    QString fileToOpen_;

    std::array<QAction*, 5> cmdProcess_{};
    QWidget* moduleBar_ = nullptr;
    QLabel* labModule_ = nullptr;
    QButtonGroup* optConnect_ = nullptr;
    QWidget* livePanelArea_ = nullptr;
    QVBoxLayout* livePanelLayout_ = nullptr;
    QWidget* livePanel_ = nullptr;
    QWidget* debugPanel_ = nullptr;
    std::array<QPushButton*, 3> cmdDebug_{};
    QTabBar* tabs_ = nullptr;
    QStackedWidget* tabWindows_ = nullptr;
    QLabel* labStatus_ = nullptr;
    QLabel* labConnection_ = nullptr;
    PleaseWait* waitBox_ = nullptr;
    QPointer<frmComSet> comSet_;
    frmAbout* about_ = nullptr;
    frmLog* logWindow_ = nullptr;
    bool changingTabs_ = false;
    QString shownTag_;
    QString connectionNote_;
};

}  // namespace kv
