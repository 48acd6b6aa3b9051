#pragma once
// The diagnostic message log, shown as the "Debug Log" tab in debug mode.

#include "ui/common/tab_window.h"

class QPlainTextEdit;

namespace kv {

class MessageLog;

class frmLog : public TabWindow {
    Q_OBJECT
public:
    explicit frmLog(MessageLog& log, QWidget* parent = nullptr);

    // The log stays for the whole run.
    bool CanClose() const override { return false; }
    void SetColour() override;

private:
    void showLog();

    MessageLog& log_;
    QPlainTextEdit* txtLog_;
    QString shown_;
};

}  // namespace kv
