#pragma once
// Standard error of kv700-cli: the status texts as progress while a run goes,
// the message log with --verbose, and the failure text at the end. Standard
// output carries nothing but the result.

#include "engine/diagnostics.h"

#include <QString>

namespace kv::cli {

class StderrSink : public DiagnosticSink {
public:
    explicit StderrSink(bool verbose);
    ~StderrSink() override;
    StderrSink(const StderrSink&) = delete;
    StderrSink& operator=(const StderrSink&) = delete;

    // Whether status texts are shown as progress (runs on a module) or not
    // (the probe and the self-test, which report through their result).
    void setProgressShown(bool on) { progressShown_ = on; }
    void progress(const QString& text);
    // Ends the progress line and writes a failure or a warning on its own line.
    void notice(const QString& text);
    // A line that only --verbose shows.
    void verboseLine(const QString& text);
    void endProgress();

    void debugMessage(int level, const QString& tag, const QString& text, const QByteArray& data,
                      const QString& kind) override;
    void addMessage(const QString& text) override;
    void showStatus(const QString& text) override;

private:
    void writeLine(const QString& text);

    bool verbose_;
    bool progressShown_ = true;
    bool terminal_;  // progress overwrites one line on a terminal
    bool lineOpen_ = false;
    QString lastProgress_;
    DiagnosticSink* previous_;
};

// The result on standard output.
void PrintResult(const QString& text);

}  // namespace kv::cli
