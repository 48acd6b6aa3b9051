#include "ui/hub/please_wait.h"

#include "ui/common/colour_palette.h"

#include <QLabel>
#include <QVBoxLayout>

namespace kv {

PleaseWait::PleaseWait(QWidget* owner) : QDialog(owner), labMessage_(new QLabel(this)) {
    setObjectName(QStringLiteral("PleaseWait"));
    setWindowTitle(QStringLiteral("Please Wait"));
    setModal(false);
    labMessage_->setObjectName(QStringLiteral("labMessage"));
    labMessage_->setText(QStringLiteral(". . ."));
    labMessage_->setAlignment(Qt::AlignCenter);
    labMessage_->setWordWrap(true);
    labMessage_->setMinimumWidth(320);
    auto* layout = new QVBoxLayout(this);
    layout->setContentsMargins(24, 20, 24, 20);
    layout->addWidget(labMessage_);
    SetColour();
}

QString PleaseWait::message() const {
    return labMessage_->text();
}

void PleaseWait::setMessage(const QString& text) {
    labMessage_->setText(text);
}

void PleaseWait::SetColour() {
    ApplyBaseColours(this);
}

}  // namespace kv
