#include "cli/cli_output.h"

#include <cstdio>
#include <unistd.h>

namespace kv::cli {

namespace {
void writeErr(const QString& text) {
    const QByteArray bytes = text.toUtf8();
    std::fwrite(bytes.constData(), 1, size_t(bytes.size()), stderr);
    std::fflush(stderr);
}
}  // namespace

StderrSink::StderrSink(bool verbose) : verbose_(verbose), terminal_(isatty(STDERR_FILENO) != 0) {
    previous_ = SetDiagnosticSink(this);
}

StderrSink::~StderrSink() {
    endProgress();
    SetDiagnosticSink(previous_);
}

void StderrSink::progress(const QString& text) {
    if (text == lastProgress_)
        return;  // "Delay Read" and friends repeat on every tick
    lastProgress_ = text;
    if (terminal_ && !verbose_) {
        writeErr(QStringLiteral("\r\x1b[K") + text);
        lineOpen_ = true;
        return;
    }
    writeErr(text + QLatin1Char('\n'));
}

void StderrSink::endProgress() {
    if (lineOpen_)
        writeErr(QStringLiteral("\n"));
    lineOpen_ = false;
}

void StderrSink::notice(const QString& text) {
    const bool shown = text == lastProgress_;
    endProgress();
    if (!shown)
        writeErr(text + QLatin1Char('\n'));
}

void StderrSink::verboseLine(const QString& text) {
    if (verbose_)
        writeLine(text);
}

void StderrSink::writeLine(const QString& text) {
    endProgress();
    writeErr(text + QLatin1Char('\n'));
}

void StderrSink::debugMessage(int level, const QString& tag, const QString& text,
                              const QByteArray& data, const QString& kind) {
    verboseLine(LogLine(level, tag, text, data, kind));
}

void StderrSink::addMessage(const QString& text) {
    verboseLine(text.trimmed());
}

void StderrSink::showStatus(const QString& text) {
    if (progressShown_)
        progress(text);
}

void PrintResult(const QString& text) {
    const QByteArray bytes = text.toUtf8();
    std::fwrite(bytes.constData(), 1, size_t(bytes.size()), stdout);
    std::fflush(stdout);
}

}  // namespace kv::cli
