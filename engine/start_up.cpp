#include "engine/start_up.h"

namespace kv {

namespace {
const QString debugWord = QStringLiteral("Debug");
const QString demoOption = QStringLiteral("--demo");

bool isOption(const QString& argument) {
    return argument.startsWith(QLatin1Char('-'));
}

// A launcher that quotes the path itself passes the quotes on.
QString unquoted(const QString& argument) {
    const bool quoted = argument.size() >= 2 && argument.startsWith(QLatin1Char('"')) &&
                        argument.endsWith(QLatin1Char('"'));
    return quoted ? argument.mid(1, argument.size() - 2) : argument;
}

bool looksLikeModel(const QString& argument) {
    return !isOption(argument) && argument != debugWord && !argument.contains(QLatin1Char('/')) &&
           !argument.contains(QLatin1Char('.'));
}
}  // namespace

bool DebugRequested(const QString& commandLine) {
    return commandLine.size() > 4 && commandLine.contains(debugWord, Qt::CaseSensitive);
}

CommandLine ParseCommandLine(const QStringList& arguments) {
    CommandLine command;
    command.debug = DebugRequested(arguments.join(QLatin1Char(' ')));
    for (int i = 0; i < arguments.size(); ++i) {
        const QString& argument = arguments.at(i);
        if (argument == demoOption) {
            command.demo = true;
            if (i + 1 < arguments.size() && looksLikeModel(arguments.at(i + 1)))
                command.demoModel = arguments.at(++i);
        } else if (argument.startsWith(demoOption + QLatin1Char('='))) {
            command.demo = true;
            command.demoModel = argument.mid(demoOption.size() + 1);
        } else if (!isOption(argument) && argument != debugWord && command.fileToOpen.isEmpty()) {
            command.fileToOpen = unquoted(argument);
        }
    }
    return command;
}

QString ProgramCaption(const QString& version) {
    const QStringList parts = version.split(QLatin1Char('.'));
    const auto part = [&parts](int i) { return i < parts.size() ? parts.at(i).toInt() : 0; };
    return QStringLiteral("KV700 PC Programmer %1%2 r%3")
        .arg(part(0), 2, 10, QLatin1Char('0'))
        .arg(part(1), 2, 10, QLatin1Char('0'))
        .arg(part(2));
}

}  // namespace kv
