#pragma once
// The connection settings window: finds the COM ports and what answers on
// them, and sets the port, the adapter type and the colour theme.

#include "ui/common/themed_window.h"

#include <QWidget>

class QComboBox;
class QLabel;
class QPushButton;
class QTreeWidget;

namespace kv {

class hub;

// Buttons, in order.
enum ComSetCommand { CmdApply = 0, CmdSearch = 1, CmdClose = 2 };

class frmComSet : public QWidget, public ThemedWindow {
    Q_OBJECT
public:
    explicit frmComSet(hub& owner);

    // Replaces the message line; "Run Mode" (a module identified) closes the window.
    void AddMessage(const QString& text);
    QString message() const;
    // Stores port and adapter type after a connect (the previous ones after a failure).
    void ApplySettings();
    // Selects the engine's adapter and theme and lists the ports that exist.
    void LoadPropertySettings();
    void SetColour() override;

protected:
    void closeEvent(QCloseEvent* event) override;

private:
    void addProbedPort(qint16 port);
    void setBusy(bool busy);

    hub& owner_;
    QTreeWidget* lstPorts_;
    QComboBox* cboAdapter_;
    QComboBox* cboTheme_;
    QPushButton* cmdSet_[3];
    QLabel* labMessage_;
    QLabel* labAdvice_;
    bool probing_ = false;
};

}  // namespace kv
