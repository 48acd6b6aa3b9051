#pragma once
// The small modeless "Please Wait" box the main window shows during longer operations.

#include "ui/common/themed_window.h"

#include <QDialog>

class QLabel;

namespace kv {

class PleaseWait : public QDialog, public ThemedWindow {
    Q_OBJECT
public:
    explicit PleaseWait(QWidget* owner);

    QString message() const;
    void setMessage(const QString& text);
    void SetColour() override;

private:
    QLabel* labMessage_;
};

}  // namespace kv
