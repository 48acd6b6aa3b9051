#pragma once
// The start page under the first tab: how to use the tool bar and the tabs.

#include "ui/common/tab_window.h"

class QTextBrowser;

namespace kv {

class frmAbout : public TabWindow {
    Q_OBJECT
public:
    explicit frmAbout(QWidget* parent = nullptr);

    // The start page is the first tab for the whole run.
    bool CanClose() const override { return false; }
    void SetColour() override;

private:
    QTextBrowser* txtAbout_;
};

// The start page's text (HTML).
QString AboutText();

}  // namespace kv
