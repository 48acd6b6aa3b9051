#pragma once
// A window hosted under a tab of the main window, found by its tag.

#include "ui/common/themed_window.h"

#include <QString>
#include <QWidget>

namespace kv {

class TabWindow : public QWidget, public ThemedWindow {
    Q_OBJECT
public:
    // Takes the next unique "MCT" tag, which also keys its tab.
    explicit TabWindow(const QString& tabTitle, QWidget* parent = nullptr);

    QString tag() const { return tag_; }
    QString tabTitle() const { return tabTitle_; }
    void setTabTitle(const QString& title);

    // Whether the close-tab button may close it.
    virtual bool CanClose() const { return true; }
    // Asked to close by the main window with the tag of the active tab; a
    // window that cannot close ignores it.
    virtual void CloseMe(const QString& tag) { Q_UNUSED(tag); }

signals:
    void tabTitleChanged(const QString& tag, const QString& title);

private:
    QString tag_;
    QString tabTitle_;
};

}  // namespace kv
