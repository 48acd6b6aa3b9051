// The tab strip of the main window, keyed by the tags of the windows it hosts.
#include "ui/hub/hub.h"

#include "engine/diagnostics.h"
#include "ui/common/settings_window.h"

#include <QAction>
#include <QStackedWidget>
#include <QTabBar>

namespace kv {

void hub::addTabWindow(TabWindow* window, bool select) {
    tabWindows_->addWidget(window);
    changingTabs_ = true;
    const int index = tabs_->addTab(window->tabTitle());
    tabs_->setTabData(index, window->tag());
    changingTabs_ = false;
    if (auto* receiver = dynamic_cast<CallbackReceiver*>(window))
        engine().registerReceiver(window->tag(), receiver);
    connect(window, &TabWindow::tabTitleChanged, this,
            [this](const QString& tag, const QString& title) {
                const int at = tabIndexOf(tag);
                if (at >= 0)
                    tabs_->setTabText(at, title);
            });
    // A window that goes away by itself takes its tab and its callbacks with it.
    const QString tag = window->tag();
    connect(window, &QObject::destroyed, this, [this, tag] {
        engine().unregisterReceiver(tag);
        const int at = tabIndexOf(tag);
        if (at < 0)
            return;
        changingTabs_ = true;
        tabs_->removeTab(at);
        changingTabs_ = false;
        ts_SelectTab();
    });
    window->SetColour();
    if (select) {
        setCurrentTab(index);
        ts_SelectTab();
    }
}

void hub::onTabChanged() {
    if (changingTabs_)
        return;
    if (engine().reserved()) {
        ShowStatus(QStringLiteral("Try again later !!"));
        setCurrentTab(tabIndexOf(shownTag_));
        return;
    }
    ts_SelectTab();
}

void hub::ts_SelectTab() {
    if (tabs_->count() == 0)
        return;
    TabWindow* window = findTabWindow(selectedTag());
    if (!window)
        return;
    tabWindows_->setCurrentWidget(window);
    shownTag_ = window->tag();
    cmdProcess_[CmdCloseTab]->setEnabled(window->CanClose());
}

void hub::ts_CloseTabSelectNext(const QString& tag) {
    const int index = tag.isEmpty() ? tabs_->currentIndex() : tabIndexOf(tag);
    if (index <= 0)
        return;  // the start page stays
    const bool wasSelected = index == tabs_->currentIndex();
    TabWindow* window = findTabWindow(tabs_->tabData(index).toString());
    changingTabs_ = true;
    tabs_->removeTab(index);
    changingTabs_ = false;
    if (window) {
        engine().unregisterReceiver(window->tag());
        tabWindows_->removeWidget(window);
        window->deleteLater();
    }
    if (wasSelected && index >= 2)
        setCurrentTab(index - 1);
    ts_SelectTab();
}

TabWindow* hub::findTabWindow(const QString& tag) const {
    for (int i = 0; i < tabWindows_->count(); ++i) {
        auto* window = qobject_cast<TabWindow*>(tabWindows_->widget(i));
        if (window && window->tag() == tag)
            return window;
    }
    return nullptr;
}

QString hub::selectedTag() const {
    return tabs_->tabData(tabs_->currentIndex()).toString();
}

int hub::tabCount() const {
    return tabs_->count();
}

int hub::tabIndexOf(const QString& tag) const {
    for (int i = 0; i < tabs_->count(); ++i)
        if (tabs_->tabData(i).toString() == tag)
            return i;
    return -1;
}

void hub::setCurrentTab(int index) {
    changingTabs_ = true;
    tabs_->setCurrentIndex(index);
    changingTabs_ = false;
}

bool hub::OpenRestoredModule(int map) {
    if (!IsModuleMap(map)) {
        ShowStatus(QStringLiteral("OpenRestoredModule: ? Module"));
        return false;
    }
    const SettingsWindowClass* windowClass = settingsWindows_.find(map);
    if (!windowClass) {
        ShowStatus(QStringLiteral("OpenRestoredModule: this version has no settings window for "
                                  "register map %1; the file cannot be shown.")
                       .arg(map));
        return false;
    }
    SettingsWindow* window = windowClass->create(*this);
    addTabWindow(window);
    window->Restore(map);
    return true;
}

void hub::CheckMinorTrim(const QString& tag) {
    if (auto* window = dynamic_cast<SettingsWindow*>(findTabWindow(tag)))
        window->CheckMinorTrim();
}

}  // namespace kv
