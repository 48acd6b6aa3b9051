#include "cli/cli_run.h"

#include "cli/cli_identify.h"
#include "cli/cli_output.h"
#include "cli/cli_port.h"
#include "cli/cli_probe.h"
#include "cli/cli_registers.h"
#include "cli/cli_session.h"
#include "cli/cli_settings_runs.h"
#include "serial/adapter_test.h"

namespace kv::cli {

namespace {

struct Context {
    const CliRequest& request;
    const PortChoice& port;
    StderrSink& sink;
    qint32 fileType = 0;  // program: the loaded file's module type and settings
    SettingsSet fileSettings;
};

bool help(Context&, QString& result, QString&) {
    result = UsageText();
    return true;
}

bool probe(Context& context, QString& result, QString&) {
    result = ProbePorts(context.port.connector());
    return true;
}

bool selfTest(Context& context, QString& result, QString& error) {
    const KvSerialPort::AdapterTestOutcome outcome =
        KvSerialPort::TestAdapter(context.port.port(), KvSerialPort::AdapterTestMessage());
    if (!outcome.passed) {
        error = outcome.report;
        return false;
    }
    result = outcome.report + QLatin1Char('\n');
    return true;
}

bool identify(Context&, ModuleSession&, QString& result, QString&) {
    result = IdentityText();
    return true;
}

bool regs(Context& context, ModuleSession& session, QString& result, QString& error) {
    return ReadAllRegisters(session, context.sink, result, error);
}

bool get(Context& context, ModuleSession& session, QString& result, QString& error) {
    return GetRegister(session, context.request, result, error);
}

bool set(Context& context, ModuleSession& session, QString& result, QString& error) {
    return SetRegister(session, context.request, result, error);
}

bool loadProgramFile(Context& context, QString& error) {
    return LoadSettingsFile(context.request.file, context.fileType, context.fileSettings, error);
}

bool program(Context& context, ModuleSession& session, QString& result, QString& error) {
    return ProgramModule(session, context.sink, context.fileType, context.fileSettings, result,
                         error);
}

bool read(Context& context, ModuleSession& session, QString& result, QString& error) {
    return ReadModule(session, context.sink, context.request.file, result, error);
}

using Preparation = bool (*)(Context&, QString&);
using PortCommand = bool (*)(Context&, QString&, QString&);
using ModuleCommand = bool (*)(Context&, ModuleSession&, QString&, QString&);

struct CommandRun {
    Command command;
    PortCommand onPort;      // works on the port directly
    ModuleCommand onModule;  // works through the engine on the identified module
    Preparation before;      // runs before the port is touched
};

// clang-format off
const CommandRun commandRuns[] = {
    {Command::Help,     help,     nullptr,  nullptr},
    {Command::Probe,    probe,    nullptr,  nullptr},
    {Command::SelfTest, selfTest, nullptr,  nullptr},
    {Command::Identify, nullptr,  identify, nullptr},
    {Command::Regs,     nullptr,  regs,     nullptr},
    {Command::Get,      nullptr,  get,      nullptr},
    {Command::Set,      nullptr,  set,      nullptr},
    {Command::Read,     nullptr,  read,     nullptr},
    {Command::Program,  nullptr,  program,  loadProgramFile},
};
// clang-format on

const CommandRun& runFor(Command command) {
    for (const CommandRun& row : commandRuns)
        if (row.command == command)
            return row;
    return commandRuns[0];  // every command has its row; help is the harmless answer
}

bool runOnModule(Context& context, ModuleCommand command, QString& result, QString& error) {
    ModuleSession session(context.port.port(), context.port.connector());
    const bool ok = session.open(error) && command(context, session, result, error);
    // Closing the connection is no progress of the run.
    context.sink.setProgressShown(false);
    context.sink.verboseLine(
        QStringLiteral("Engine ticks: %1 in %2 ms").arg(session.ticks()).arg(session.elapsedMs()));
    return ok;
}

}  // namespace

int RunCommand(const CliRequest& request) {
    StderrSink sink(request.verbose);
    PortChoice port;
    QString result;
    QString error;
    Context context{request, port, sink, 0, {}};
    const CommandRun& run = runFor(request.command);
    bool ok = (!run.before || run.before(context, error)) && port.resolve(request, error);
    if (ok && run.onPort) {
        sink.setProgressShown(request.verbose);
        ok = run.onPort(context, result, error);
    } else if (ok) {
        ok = runOnModule(context, run.onModule, result, error);
    }
    sink.endProgress();
    if (!ok) {
        sink.notice(error);
        return ExitFailure;
    }
    PrintResult(result);
    return ExitSuccess;
}

}  // namespace kv::cli
