#pragma once
// The message log and the status line, without widgets: which diagnostic lines
// reach the log, the log's size limit, and when the status line hides.

#include "engine/diagnostics.h"

#include <QObject>
#include <array>

namespace kv {

// Debug-panel options: which lines reach the log.
enum LogOption { LogSend = 0, LogReceive = 1, LogGeneral = 2, LogSerialSteps = 3, LogDescribe = 4 };

constexpr int LogLimit = 30000;  // characters kept before the oldest are dropped
constexpr int LogDropped = 999;  // characters dropped at a time
constexpr int StatusVisibleTicks = 301;

class MessageLog : public QObject, public DiagnosticSink {
    Q_OBJECT
public:
    explicit MessageLog(QObject* parent = nullptr);
    ~MessageLog() override;

    void setOption(int option, bool on);
    bool option(int option) const;

    QString text() const { return text_; }
    void clear();

    QString status() const { return status_; }
    bool statusVisible() const { return statusVisible_; }
    // One timer tick: the status line hides after StatusVisibleTicks quiet ticks.
    void statusTick();
    // The status line visible again for a full StatusVisibleTicks, its text unchanged.
    void resetStatusCounter();

    void debugMessage(int level, const QString& tag, const QString& text, const QByteArray& data,
                      const QString& kind) override;
    void addMessage(const QString& text) override;
    void showStatus(const QString& text) override;

signals:
    void logChanged();
    void statusChanged(const QString& text);
    void statusVisibilityChanged(bool visible);

private:
    void append(const QString& text);

    std::array<bool, 5> options_{};
    QString text_;
    QString status_;
    int statusCounter_ = 0;
    bool statusVisible_ = true;
    DiagnosticSink* previous_ = nullptr;
};

}  // namespace kv
