// kv700-cli: the headless front end for production benches.
#include "cli/cli_args.h"
#include "cli/cli_run.h"

#include <QCoreApplication>

#include <cstdio>

int main(int argc, char* argv[]) {
    QCoreApplication app(argc, argv);
    const kv::cli::ParseOutcome parsed = kv::cli::ParseArguments(app.arguments().mid(1));
    if (!parsed.ok) {
        const QString text = QStringLiteral("kv700-cli: ") + parsed.error + QStringLiteral("\n\n") +
                             kv::cli::UsageText();
        std::fputs(text.toUtf8().constData(), stderr);
        return kv::cli::ExitUsage;
    }
    return kv::cli::RunCommand(parsed.request);
}
