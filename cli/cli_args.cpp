#include "cli/cli_args.h"

#include "model/entry_number.h"

#include <QHash>

#include <limits>

namespace kv::cli {

namespace {

struct CommandRow {
    const char* name;
    Command command;
    int positionals;
    QStringList options;  // options of this command besides the global ones
};

const CommandRow commandRows[] = {
    {"probe", Command::Probe, 0, {}},      {"identify", Command::Identify, 0, {}},
    {"read", Command::Read, 0, {"--out"}}, {"program", Command::Program, 1, {}},
    {"regs", Command::Regs, 0, {}},        {"get", Command::Get, 1, {"--id"}},
    {"set", Command::Set, 2, {"--float"}}, {"selftest", Command::SelfTest, 0, {}},
};

struct OptionRow {
    const char* name;
    bool takesValue;
    bool global;
};

const OptionRow optionRows[] = {
    {"--port", true, true},     {"--device", true, true}, {"--adapter", true, true},
    {"--verbose", false, true}, {"--out", true, false},   {"--id", true, false},
    {"--float", false, false},
};

const OptionRow* findOption(const QString& name) {
    for (const OptionRow& row : optionRows)
        if (name == QLatin1String(row.name))
            return &row;
    return nullptr;
}

const CommandRow* findCommand(const QString& name) {
    for (const CommandRow& row : commandRows)
        if (name == QLatin1String(row.name))
            return &row;
    return nullptr;
}

bool wholeNumber(const QString& text, qint64 lowest, qint64 highest, qint64& value) {
    bool ok = false;
    value = text.toLongLong(&ok, 10);
    return ok && value >= lowest && value <= highest;
}

ParseOutcome failure(const QString& error) {
    ParseOutcome outcome;
    outcome.error = error;
    return outcome;
}

// Splits the arguments into options (with their values) and positional words.
bool splitArguments(const QStringList& arguments, QHash<QString, QString>& options,
                    QStringList& words, bool& help, QString& error) {
    for (int i = 0; i < arguments.size(); ++i) {
        const QString& argument = arguments.at(i);
        if (argument == QLatin1String("--help") || argument == QLatin1String("-h")) {
            help = true;
            continue;
        }
        if (!argument.startsWith(QLatin1String("--"))) {
            words << argument;
            continue;
        }
        const qsizetype equals = argument.indexOf(QLatin1Char('='));
        const QString name = equals < 0 ? argument : argument.left(equals);
        const OptionRow* row = findOption(name);
        if (!row) {
            error = QStringLiteral("unknown option %1").arg(name);
            return false;
        }
        if (options.contains(name)) {
            error = QStringLiteral("%1 given twice").arg(name);
            return false;
        }
        QString value;
        if (row->takesValue) {
            if (equals >= 0) {
                value = argument.mid(equals + 1);
            } else if (i + 1 < arguments.size()) {
                value = arguments.at(++i);
            } else {
                error = QStringLiteral("%1 needs a value").arg(name);
                return false;
            }
        } else if (equals >= 0) {
            error = QStringLiteral("%1 takes no value").arg(name);
            return false;
        }
        options.insert(name, value);
    }
    return true;
}

bool readGlobalOptions(const QHash<QString, QString>& options, CliRequest& request,
                       QString& error) {
    qint64 number = 0;
    if (options.contains(QStringLiteral("--port"))) {
        if (options.contains(QStringLiteral("--device"))) {
            error = QStringLiteral("--port and --device exclude each other");
            return false;
        }
        if (!wholeNumber(options.value(QStringLiteral("--port")), 0, 32767, number)) {
            error = QStringLiteral("--port needs a port number from 0 to 32767");
            return false;
        }
        request.port = qint16(number);
    }
    if (options.contains(QStringLiteral("--device"))) {
        request.device = options.value(QStringLiteral("--device"));
        if (request.device.isEmpty()) {
            error = QStringLiteral("--device needs a device path");
            return false;
        }
    }
    if (options.contains(QStringLiteral("--adapter"))) {
        if (!wholeNumber(options.value(QStringLiteral("--adapter")), 0, 1, number)) {
            error = QStringLiteral("--adapter must be 0 or 1");
            return false;
        }
        request.adapter = qint16(number);
    }
    request.verbose = options.contains(QStringLiteral("--verbose"));
    return true;
}

bool readCommandWords(const CommandRow& row, const QStringList& words,
                      const QHash<QString, QString>& options, CliRequest& request, QString& error) {
    qint64 number = 0;
    switch (row.command) {
    case Command::Read:
        request.file = options.value(QStringLiteral("--out"));
        if (request.file.isEmpty()) {
            error = QStringLiteral("read needs --out FILE.kv7");
            return false;
        }
        return true;
    case Command::Program:
        request.file = words.at(0);
        return true;
    case Command::Get:
    case Command::Set:
        if (!wholeNumber(words.at(0), 0, 255, number)) {
            error = QStringLiteral("a register address is a whole number from 0 to 255");
            return false;
        }
        request.address = qint32(number);
        break;
    default:
        return true;
    }
    if (row.command == Command::Get) {
        if (options.contains(QStringLiteral("--id"))) {
            if (!wholeNumber(options.value(QStringLiteral("--id")), 0, 255, number)) {
                error = QStringLiteral("--id needs a bus ID from 0 to 255");
                return false;
            }
            request.busId = qint16(number);
        }
        return true;
    }
    request.asFloat = options.contains(QStringLiteral("--float"));
    const QString text = words.at(1);
    if (request.asFloat) {
        float value = 0;
        if (!ParseDecimal(text, value)) {
            error = QStringLiteral("%1 is not a floating value").arg(text);
            return false;
        }
        request.value = value;
    } else {
        if (!wholeNumber(text, std::numeric_limits<qint32>::min(),
                         std::numeric_limits<qint32>::max(), number)) {
            error = QStringLiteral("%1 is not a 32-bit whole number (use --float for a floating "
                                   "value)")
                        .arg(text);
            return false;
        }
        request.value = double(number);
    }
    return true;
}

}  // namespace

ParseOutcome ParseArguments(const QStringList& arguments) {
    QHash<QString, QString> options;
    QStringList words;
    bool help = false;
    QString error;
    if (!splitArguments(arguments, options, words, help, error))
        return failure(error);
    if (help) {
        ParseOutcome outcome;
        outcome.ok = true;
        return outcome;
    }
    if (words.isEmpty())
        return failure(QStringLiteral("no command given"));
    const CommandRow* row = findCommand(words.first());
    if (!row)
        return failure(QStringLiteral("unknown command %1").arg(words.first()));
    words.removeFirst();
    if (words.size() != row->positionals)
        return failure(QStringLiteral("%1 takes %2 argument(s), not %3")
                           .arg(QLatin1String(row->name))
                           .arg(row->positionals)
                           .arg(words.size()));
    for (auto it = options.cbegin(); it != options.cend(); ++it) {
        if (!findOption(it.key())->global && !row->options.contains(it.key()))
            return failure(
                QStringLiteral("%1 does not apply to %2").arg(it.key(), QLatin1String(row->name)));
    }
    ParseOutcome outcome;
    outcome.request.command = row->command;
    if (!readGlobalOptions(options, outcome.request, error) ||
        !readCommandWords(*row, words, options, outcome.request, error))
        return failure(error);
    outcome.ok = true;
    return outcome;
}

QString UsageText() {
    return QStringLiteral(
        "Usage: kv700-cli [--port N | --device PATH] [--adapter 0|1] [--verbose] COMMAND ...\n"
        "\n"
        "Commands:\n"
        "  probe                      list COM1..COM30 as the connection settings do\n"
        "  identify                   print model text, serial number, revision, bus ID\n"
        "  read --out FILE.kv7        read the module's settings and save them\n"
        "  program FILE.kv7           program the module from a settings file\n"
        "  regs                       read every register of the map: Add, Value, Description\n"
        "  get ADDR [--id N]          read one register: its data field and its value\n"
        "  set ADDR VALUE [--float]   write one register, read it back and print it\n"
        "  selftest                   the adapter self-test (PASS/FAIL text)\n"
        "\n"
        "Options:\n"
        "  --port N       COM port number (COMn links in $KV700_PORT_DIR or the built-in table)\n"
        "  --device PATH  use this serial device as the port\n"
        "  --adapter 0|1  adapter type: 0 QTR490-02, 1 KV705-01 (priming blocks)\n"
        "  --verbose      also write the message log, the engine ticks and the time to stderr\n"
        "  --float        VALUE is a floating value (required for floating registers)\n"
        "\n"
        "Without --port or --device the port is the one the program last connected to (COM1 if\n"
        "none is stored); without --adapter the adapter type likewise (0 if none is stored).\n"
        "Results go to standard output, progress and failures to standard error.\n"
        "Exit status: 0 success, 1 the operation failed, 2 usage error.\n");
}

}  // namespace kv::cli
