// The tool bar of the main window: every command first reserves the engine.
#include "ui/hub/hub.h"

#include "engine/diagnostics.h"
#include "model/module_types.h"
#include "model/register_map.h"
#include "ui/common/document_launcher.h"
#include "ui/common/kv_file_dialog.h"
#include "ui/common/settings_window.h"

#include <QCoreApplication>

namespace kv {

void hub::cmdProcess_Click(int index) {
    if (!engine().ReserveSomeTime()) {
        ShowStatus(QStringLiteral("Please try again !!"));
        return;
    }
    switch (index) {
    case CmdOpenFile:
        openFileIntoTab();
        break;
    case CmdReadModule:
        readModuleIntoTab();
        break;
    case CmdUserGuide:
        openUserGuide();
        break;
    case CmdSettings:
        openSettings();
        break;
    case CmdCloseTab:
        closeActiveTab();
        break;
    }
}

void hub::openFileIntoTab() {
    QString name;
    qint32 typeCode = 0;
    if (OpenKVFile(name, typeCode, this)) {
        ShowStatus(name);
        OpenRestoredModule(GetModMap(typeCode));
    } else {
        ShowStatus(QStringLiteral("Failed: ") + name);
    }
    // The new window only shows the loaded settings; nothing is left to wait for.
    engine().setReserved(false);
}

void hub::readModuleIntoTab() {
    if (!IsModuleMap(ModuleMap)) {
        FailGeneral(QStringLiteral("cmdProcess"), HubTag, QStringLiteral("Unknown Module Type"));
    } else if (const SettingsWindowClass* windowClass = settingsWindows_.find(ModuleMap)) {
        SettingsWindow* window = windowClass->create(*this);
        addTabWindow(window);
        // The window's reading run keeps the engine and releases it when done.
        window->LoadDialouge(ModuleMap);
        return;
    } else {
        ShowStatus(QStringLiteral("cmdProcess: this version has no settings window for the ") +
                   DisplayModuleType(RegVal.Mod_Type));
    }
    engine().setReserved(false);
}

void hub::openUserGuide() {
    const QString path =
        QCoreApplication::applicationDirPath() + QLatin1Char('/') + QLatin1String(UserGuideName);
    QString result = path;
    if (ShellOpen(result)) {
        ShowStatus(path);
    } else {
        ShowStatus(result + QStringLiteral(" - the user guide belongs in the program's folder."));
        AddMessage(result);
    }
    engine().setReserved(false);
}

void hub::openSettings() {
    optConnect_Click(OptCloseCom);
    if (!comSet_) {
        comSet_ = new frmComSet(*this);
        comSet_->setAttribute(Qt::WA_DeleteOnClose);
    }
    comSet_->show();
    comSet_->raise();
    comSet_->activateWindow();
}

void hub::closeActiveTab() {
    const QString tag = selectedTag();
    if (TabWindow* window = findTabWindow(tag))
        window->CloseMe(tag);
    engine().setReserved(false);
}

}  // namespace kv
