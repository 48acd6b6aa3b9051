#pragma once
// The program-wide diagnostic channel. Every subsystem reports through
// DebugMessage/AddMessage; the main window (or a test) installs the sink that
// turns them into log lines and status texts. Without a sink the lines go to
// Qt's logging categories only.

#include <QByteArray>
#include <QLoggingCategory>
#include <QString>

Q_DECLARE_LOGGING_CATEGORY(lcSerial)
Q_DECLARE_LOGGING_CATEGORY(lcEngine)
Q_DECLARE_LOGGING_CATEGORY(lcModel)
Q_DECLARE_LOGGING_CATEGORY(lcFiles)
Q_DECLARE_LOGGING_CATEGORY(lcDrivers)

namespace kv {

// Levels of the diagnostic log.
enum DiagLevel { DiagSend = 0, DiagReceive = 1, DiagGeneral = 2, DiagSerialStep = 3 };

class DiagnosticSink {
public:
    virtual ~DiagnosticSink() = default;
    virtual void debugMessage(int level, const QString& tag, const QString& text,
                              const QByteArray& data, const QString& kind) = 0;
    virtual void addMessage(const QString& text) = 0;
    // The status line of the main window; a sink without one ignores it.
    virtual void showStatus(const QString& text) { Q_UNUSED(text); }
};

// Installs the sink (nullptr removes it); returns the previous one.
DiagnosticSink* SetDiagnosticSink(DiagnosticSink* sink);

// A level-2 line also goes to the status line as tag, ":", text and data.
void DebugMessage(int level, const QString& tag, const QString& text, const QByteArray& data = {},
                  const QString& kind = {});
void AddMessage(const QString& text);
// The message log's form of a diagnostic line, without its line break.
QString LogLine(int level, const QString& tag, const QString& text, const QByteArray& data,
                const QString& kind);
void ShowStatus(const QString& text);
// The text last put on the status line.
QString StatusText();
// The procedure's name, ": " and the description on the status line.
void FailGeneral(const QString& procedure, const QString& tag, const QString& description);

// Set at start from the command line; without it nothing reaches the message log.
bool DebugFlag();
void SetDebugFlag(bool on);

}  // namespace kv
