#include "sim/sim_cli.h"

#include <QCommandLineParser>

#include <limits>

namespace kv::sim {

namespace {
struct NumberOption {
    const char* name;
    const char* valueName;
    const char* description;
    int SimCommandLine::*target;  // exactly one of target, faultTarget, optionTarget
    int SimFaults::*faultTarget;
    int SimOptions::*optionTarget;
    int minimum;
};

// clang-format off
const NumberOption numberOptions[] = {
    {"port", "N", "Publish as COM port N (default 1).", &SimCommandLine::port, nullptr, nullptr, 1},
    {"adapter", "0|1", "Adapter type: 1 answers only after priming blocks (default 0).", nullptr, nullptr, &SimOptions::adapter, 0},
    {"adapter-decay", "MS", "How long adapter type 1 keeps sending after its self-test (default 100).", nullptr, nullptr, &SimOptions::adapterDecayMs, 0},
    {"drop-every", "N", "Drop the reply to every n-th frame.", nullptr, &SimFaults::dropEvery, nullptr, 0},
    {"drop-frame", "K", "Drop the reply to frame k.", nullptr, &SimFaults::dropFrame, nullptr, 0},
    {"corrupt-every", "N", "Wrong check characters on every n-th reply.", nullptr, &SimFaults::corruptEvery, nullptr, 0},
    {"noise", "BYTES", "Random bytes before every reply.", nullptr, &SimFaults::noiseBytes, nullptr, 0},
    {"split", "BYTES", "Send replies in pieces of this many bytes.", nullptr, &SimFaults::splitBytes, nullptr, 0},
    {"split-gap", "MS", "Pause between the pieces of a split reply (default 15).", nullptr, &SimFaults::splitGapMs, nullptr, 0},
    {"latency", "MS", "Pause before every reply.", nullptr, &SimFaults::latencyMs, nullptr, 0},
    {"dead-after", "N", "Answer only the first n frames.", nullptr, &SimFaults::deadAfter, nullptr, 0},
    {"swap-after", "N", "After frame n another module is on the adapter (see --swap-model, --swap-serial).", nullptr, &SimFaults::swapAfter, nullptr, 0},
};
// clang-format on

// "2.3" is major 2, minor 3; a plain number is the register value itself.
bool readRevision(const QString& text, qint32& revision, QString& error) {
    const QStringList parts = text.split(QLatin1Char('.'));
    bool okMajor = false;
    bool okMinor = true;
    const int major = parts[0].toInt(&okMajor);
    const int minor = parts.size() == 2 ? parts[1].toInt(&okMinor) : 0;
    if (!okMajor || !okMinor || parts.size() > 2 || major < 0 || minor < 0 || minor > 255 ||
        (parts.size() == 2 && major > 255)) {
        error = QStringLiteral("--revision: \"%1\" is neither a number nor major.minor").arg(text);
        return false;
    }
    revision = parts.size() == 2 ? major * 256 + minor : major;
    return true;
}

void addOptions(QCommandLineParser& parser) {
    parser.setApplicationDescription(QStringLiteral(
        "Simulates one module on a programming adapter, on a pseudo-terminal published as a "
        "COM port of the program. Runs until interrupted."));
    parser.addHelpOption();
    parser.addOptions({
        {QStringLiteral("print-path"),
         QStringLiteral("Print the device path instead of publishing a COM port.")},
        {QStringLiteral("model"),
         QStringLiteral("Module model, e.g. KV720-20, KV714-22, KV718-1A, or a type code with "
                        "optional sub-type, e.g. 7:3 (default KV720-20)."),
         QStringLiteral("MODEL")},
        {QStringLiteral("serial"), QStringLiteral("Serial number (default 100001)."),
         QStringLiteral("N")},
        {QStringLiteral("revision"),
         QStringLiteral("Revision as major.minor or register value (default 2.3)."),
         QStringLiteral("REV")},
        {QStringLiteral("bus-id"),
         QStringLiteral("Value of the module's bus ID register (default 1)."), QStringLiteral("N")},
        {QStringLiteral("swap-model"),
         QStringLiteral("Model put on the adapter by --swap-after (default: the same)."),
         QStringLiteral("MODEL")},
        {QStringLiteral("swap-serial"),
         QStringLiteral("Serial number of the swapped-in module (default: serial + 1)."),
         QStringLiteral("N")},
        {QStringLiteral("busy"),
         QStringLiteral("Hold the port as another program would, so that opening it fails.")},
        {QStringLiteral("trim-verdict"),
         QStringLiteral("Answer every minor trim with this verdict (0 done, 200 out of range)."),
         QStringLiteral("V")},
        {QStringLiteral("hold-reading"),
         QStringLiteral("Hold Input_Reading at this value instead of sweeping."),
         QStringLiteral("N")},
        {QStringLiteral("seed"), QStringLiteral("Seed of the noise bytes (default 1)."),
         QStringLiteral("N")},
        {QStringLiteral("log"), QStringLiteral("Print every frame received.")},
    });
    for (const NumberOption& option : numberOptions)
        parser.addOption({QLatin1String(option.name), QLatin1String(option.description),
                          QLatin1String(option.valueName)});
}

bool readModel(const QCommandLineParser& parser, const QString& name, ModuleIdentity& identity,
               QString& error) {
    if (!parser.isSet(name))
        return true;
    if (ParseModel(parser.value(name), identity))
        return true;
    error = QStringLiteral("--%1: unknown model \"%2\"; known: %3")
                .arg(name, parser.value(name), KnownModels());
    return false;
}

bool readInteger(const QCommandLineParser& parser, const QString& name, qint64 minimum,
                 qint64& value, QString& error) {
    if (!parser.isSet(name))
        return true;
    bool ok = false;
    const qint64 read = parser.value(name).toLongLong(&ok, 0);
    if (!ok || read < minimum || read > std::numeric_limits<qint32>::max()) {
        error = QStringLiteral("--%1: \"%2\" is not a usable number").arg(name, parser.value(name));
        return false;
    }
    value = read;
    return true;
}
}  // namespace

bool ParseSimArguments(const QStringList& arguments, SimCommandLine& command, QString& error) {
    QCommandLineParser parser;
    addOptions(parser);
    if (!parser.parse(arguments)) {
        error = parser.errorText();
        return false;
    }
    if (!parser.positionalArguments().isEmpty()) {
        error = QStringLiteral("unexpected argument \"%1\"").arg(parser.positionalArguments()[0]);
        return false;
    }
    command.help = parser.isSet(QStringLiteral("help"));
    command.printPath = parser.isSet(QStringLiteral("print-path"));
    command.portBusy = parser.isSet(QStringLiteral("busy"));
    command.logFrames = parser.isSet(QStringLiteral("log"));

    SimOptions& options = command.options;
    for (const NumberOption& option : numberOptions) {
        const QString name = QLatin1String(option.name);
        if (!parser.isSet(name))
            continue;
        qint64 value = 0;
        if (!readInteger(parser, name, option.minimum, value, error))
            return false;
        if (option.target)
            command.*option.target = int(value);
        if (option.faultTarget)
            options.faults.*option.faultTarget = int(value);
        if (option.optionTarget)
            options.*option.optionTarget = int(value);
    }
    if (options.adapter > 1) {
        error = QStringLiteral("--adapter: only 0 and 1 exist");
        return false;
    }

    ModuleIdentity& module = options.module;
    if (!readModel(parser, QStringLiteral("model"), module, error))
        return false;
    qint64 serial = module.serial;
    qint64 busId = module.busId;
    if (!readInteger(parser, QStringLiteral("serial"), 0, serial, error) ||
        !readInteger(parser, QStringLiteral("bus-id"), 0, busId, error))
        return false;
    module.serial = qint32(serial);
    module.busId = qint32(busId);
    if (parser.isSet(QStringLiteral("revision")) &&
        !readRevision(parser.value(QStringLiteral("revision")), module.revision, error))
        return false;

    options.faults.swapTo = module;
    options.faults.swapTo.serial = module.serial + 1;
    if (!readModel(parser, QStringLiteral("swap-model"), options.faults.swapTo, error))
        return false;
    qint64 swapSerial = options.faults.swapTo.serial;
    if (!readInteger(parser, QStringLiteral("swap-serial"), 0, swapSerial, error))
        return false;
    options.faults.swapTo.serial = qint32(swapSerial);

    qint64 number = 0;
    if (parser.isSet(QStringLiteral("trim-verdict"))) {
        if (!readInteger(parser, QStringLiteral("trim-verdict"), 0, number, error))
            return false;
        options.trimVerdict = qint32(number);
    }
    if (parser.isSet(QStringLiteral("hold-reading"))) {
        if (!readInteger(parser, QStringLiteral("hold-reading"), std::numeric_limits<qint32>::min(),
                         number, error))
            return false;
        options.heldReading = qint32(number);
    }
    number = options.seed;
    if (!readInteger(parser, QStringLiteral("seed"), 0, number, error))
        return false;
    options.seed = quint32(number);
    return true;
}

QString SimHelpText() {
    QCommandLineParser parser;
    addOptions(parser);
    return parser.helpText() +
           QStringLiteral("\nModels: %1\nThe port folder is $KV700_PORT_DIR, else "
                          "$XDG_CONFIG_HOME/kv700/ports, else ~/.config/kv700/ports.\n")
               .arg(KnownModels());
}

QString DescribeLogEntry(const SimLogEntry& entry) {
    const QString time = QStringLiteral("%1 ms").arg(entry.msec, 8);
    if (entry.kind == SimLogEntry::Ignored)
        return QStringLiteral("%1  ignored %2 bytes:%3")
            .arg(time)
            .arg(entry.bytes.size())
            .arg(QString::fromLatin1(entry.bytes.toHex(' ')).prepend(QLatin1Char(' ')));
    static const char* const outcomes[] = {"", " (reply dropped)", " (no answer)"};
    return QStringLiteral("%1  %2 bus %3 address %4 data %5%6")
        .arg(time, QString(QLatin1Char(entry.command)))
        .arg(entry.busId, 3)
        .arg(entry.address, 3)
        .arg(QString::fromLatin1(entry.data), QLatin1String(outcomes[entry.outcome]));
}

}  // namespace kv::sim
