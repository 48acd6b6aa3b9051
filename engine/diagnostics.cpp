#include "engine/diagnostics.h"

#include "model/codec.h"

Q_LOGGING_CATEGORY(lcSerial, "kv700.serial", QtWarningMsg)
Q_LOGGING_CATEGORY(lcEngine, "kv700.engine", QtWarningMsg)
Q_LOGGING_CATEGORY(lcModel, "kv700.model", QtWarningMsg)
Q_LOGGING_CATEGORY(lcFiles, "kv700.files", QtWarningMsg)
Q_LOGGING_CATEGORY(lcDrivers, "kv700.drivers", QtWarningMsg)

namespace kv {

namespace {
DiagnosticSink* installedSink = nullptr;
bool debugFlag = false;
QString statusText;

const QLoggingCategory& categoryOf(int level) {
    return level == DiagSerialStep ? lcSerial() : lcEngine();
}
}  // namespace

DiagnosticSink* SetDiagnosticSink(DiagnosticSink* sink) {
    DiagnosticSink* previous = installedSink;
    installedSink = sink;
    return previous;
}

void DebugMessage(int level, const QString& tag, const QString& text, const QByteArray& data,
                  const QString& kind) {
    qCDebug(categoryOf(level)).noquote() << level << tag << kind << text << StrToHex(data);
    if (installedSink)
        installedSink->debugMessage(level, tag, text, data, kind);
    if (level == DiagGeneral)
        ShowStatus(tag + QLatin1Char(':') + text + StrToHex(data));
}

QString LogLine(int level, const QString& tag, const QString& text, const QByteArray& data,
                const QString& kind) {
    const QString separator = level == DiagSerialStep ? QString() : QStringLiteral(":");
    return tag + separator + kind + text + StrToHex(data);
}

void AddMessage(const QString& text) {
    qCDebug(lcEngine).noquote() << text;
    if (installedSink)
        installedSink->addMessage(text);
}

void ShowStatus(const QString& text) {
    qCDebug(lcEngine).noquote() << "status:" << text;
    statusText = text;
    if (installedSink)
        installedSink->showStatus(text);
}

void FailGeneral(const QString& procedure, const QString& tag, const QString& description) {
    Q_UNUSED(tag);
    ShowStatus(procedure + QStringLiteral(": ") + description);
}

QString StatusText() {
    return statusText;
}

bool DebugFlag() {
    return debugFlag;
}
void SetDebugFlag(bool on) {
    debugFlag = on;
}

}  // namespace kv
