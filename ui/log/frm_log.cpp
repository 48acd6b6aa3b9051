#include "ui/log/frm_log.h"

#include "engine/message_log.h"
#include "ui/common/colour_palette.h"

#include <QFontDatabase>
#include <QHBoxLayout>
#include <QPlainTextEdit>
#include <QPushButton>
#include <QScrollBar>
#include <QTextCursor>
#include <QVBoxLayout>

namespace kv {

frmLog::frmLog(MessageLog& log, QWidget* parent)
    : TabWindow(QStringLiteral("Debug Log"), parent), log_(log), txtLog_(new QPlainTextEdit(this)) {
    setWindowTitle(QStringLiteral("Log"));
    txtLog_->setObjectName(QStringLiteral("txtLog"));
    txtLog_->setReadOnly(true);
    txtLog_->setLineWrapMode(QPlainTextEdit::NoWrap);
    txtLog_->setFont(QFontDatabase::systemFont(QFontDatabase::FixedFont));

    auto* cmdClear = new QPushButton(QStringLiteral("Clear"), this);
    cmdClear->setObjectName(QStringLiteral("cmdClear"));
    cmdClear->setToolTip(QStringLiteral("Empty the message log"));
    connect(cmdClear, &QPushButton::clicked, &log_, &MessageLog::clear);

    auto* buttons = new QHBoxLayout;
    buttons->addStretch();
    buttons->addWidget(cmdClear);
    auto* layout = new QVBoxLayout(this);
    layout->addWidget(txtLog_, 1);
    layout->addLayout(buttons);

    connect(&log_, &MessageLog::logChanged, this, &frmLog::showLog);
    showLog();
    SetColour();
}

void frmLog::showLog() {
    const QString text = log_.text();
    QScrollBar* bar = txtLog_->verticalScrollBar();
    const bool atEnd = bar->value() == bar->maximum();
    // Appending only the new tail keeps a busy log cheap to show.
    if (!shown_.isEmpty() && text.size() > shown_.size() && text.startsWith(shown_)) {
        QTextCursor cursor(txtLog_->document());
        cursor.movePosition(QTextCursor::End);
        cursor.insertText(text.mid(shown_.size()));
    } else {
        txtLog_->setPlainText(text);
    }
    shown_ = text;
    if (atEnd)
        bar->setValue(bar->maximum());
}

void frmLog::SetColour() {
    ApplyBaseColours(this);
}

}  // namespace kv
