#pragma once
// Collects diagnostic lines while installed, for tests that check what was logged.

#include "engine/diagnostics.h"

#include <QStringList>

struct CapturedLine {
    int level;
    QString tag;
    QString text;
    QByteArray data;
    QString kind;
};

class DiagnosticCapture : public kv::DiagnosticSink {
public:
    DiagnosticCapture() { previous_ = kv::SetDiagnosticSink(this); }
    ~DiagnosticCapture() override { kv::SetDiagnosticSink(previous_); }

    void debugMessage(int level, const QString& tag, const QString& text, const QByteArray& data,
                      const QString& kind) override {
        lines.push_back({level, tag, text, data, kind});
        entries << tag + QLatin1Char(':') + text;
    }
    void addMessage(const QString& text) override {
        messages << text;
        entries << text;
    }

    bool hasText(const QString& text) const {
        for (const CapturedLine& line : lines)
            if (line.text == text)
                return true;
        return false;
    }

    std::vector<CapturedLine> lines;
    QStringList messages;
    QStringList entries;  // "tag:text" for diagnostic lines and plain log messages, in order

private:
    kv::DiagnosticSink* previous_;
};
