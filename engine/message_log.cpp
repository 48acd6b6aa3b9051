#include "engine/message_log.h"

namespace kv {

MessageLog::MessageLog(QObject* parent) : QObject(parent) {
    previous_ = SetDiagnosticSink(this);
}

MessageLog::~MessageLog() {
    SetDiagnosticSink(previous_);
}

void MessageLog::setOption(int option, bool on) {
    if (option >= 0 && option < int(options_.size()))
        options_[option] = on;
}

bool MessageLog::option(int option) const {
    return option >= 0 && option < int(options_.size()) && options_[option];
}

void MessageLog::clear() {
    text_.clear();
    emit logChanged();
}

void MessageLog::statusTick() {
    if (statusCounter_ < StatusVisibleTicks && ++statusCounter_ == StatusVisibleTicks) {
        statusVisible_ = false;
        emit statusVisibilityChanged(false);
    }
}

void MessageLog::resetStatusCounter() {
    statusCounter_ = 0;
    if (!statusVisible_) {
        statusVisible_ = true;
        emit statusVisibilityChanged(true);
    }
}

void MessageLog::debugMessage(int level, const QString& tag, const QString& text,
                              const QByteArray& data, const QString& kind) {
    if (DebugFlag() && level >= DiagSend && level <= DiagSerialStep && options_[level])
        append(LogLine(level, tag, text, data, kind) + QLatin1Char('\n'));
}

void MessageLog::addMessage(const QString& text) {
    if (DebugFlag())
        append(text);
}

void MessageLog::showStatus(const QString& text) {
    status_ = text;
    emit statusChanged(text);
    resetStatusCounter();
}

void MessageLog::append(const QString& text) {
    if (text_.size() > LogLimit)
        text_.remove(0, LogDropped);
    text_ += text;
    emit logChanged();
}

}  // namespace kv
