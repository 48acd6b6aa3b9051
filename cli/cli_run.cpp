#include "cli/cli_run.h"

#include "cli/cli_identify.h"
#include "cli/cli_output.h"
#include "cli/cli_port.h"
#include "cli/cli_probe.h"
#include "cli/cli_registers.h"
#include "cli/cli_session.h"
#include "serial/adapter_test.h"

namespace kv::cli {

namespace {

struct Context {
    const CliRequest& request;
    const PortChoice& port;
    StderrSink& sink;
};

bool probe(Context& context, QString& result, QString&) {
    result = ProbePorts(context.port.connector());
    return true;
}

bool selfTest(Context& context, QString& result, QString& error) {
    const KvSerialPort::AdapterTestOutcome outcome =
        KvSerialPort::TestAdapter(context.port.port(), KvSerialPort::AdapterTestMessage());
    (outcome.passed ? result : error) = outcome.report;
    if (outcome.passed)
        result += QLatin1Char('\n');
    return outcome.passed;
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

using PortCommand = bool (*)(Context&, QString&, QString&);
using ModuleCommand = bool (*)(Context&, ModuleSession&, QString&, QString&);

struct CommandRun {
    Command command;
    PortCommand onPort;      // works on the port directly
    ModuleCommand onModule;  // works through the engine on the identified module
};

const CommandRun commandRuns[] = {
    {Command::Probe, probe, nullptr},       {Command::SelfTest, selfTest, nullptr},
    {Command::Identify, nullptr, identify}, {Command::Regs, nullptr, regs},
    {Command::Get, nullptr, get},           {Command::Set, nullptr, set},
};

bool runOnModule(Context& context, ModuleCommand command, QString& result, QString& error) {
    ModuleSession session(context.port.port(), context.port.connector());
    const bool ok = session.open(error) && command(context, session, result, error);
    // Closing the connection is no progress of the run.
    context.sink.setProgressShown(false);
    context.sink.verboseLine(QStringLiteral("Engine ticks: %1").arg(session.ticks()));
    return ok;
}

}  // namespace

int RunCommand(const CliRequest& request) {
    StderrSink sink(request.verbose);
    PortChoice port;
    QString result;
    QString error;
    bool ok = port.resolve(request, error);
    if (ok) {
        Context context{request, port, sink};
        const CommandRun* run = nullptr;
        for (const CommandRun& row : commandRuns)
            if (row.command == request.command)
                run = &row;
        if (!run) {
            error = QStringLiteral("This command is not available yet");
            ok = false;
        } else if (run->onPort) {
            sink.setProgressShown(request.verbose);
            ok = run->onPort(context, result, error);
        } else {
            ok = runOnModule(context, run->onModule, result, error);
        }
    }
    sink.endProgress();
    if (!ok) {
        sink.failure(error);
        return ExitFailure;
    }
    PrintResult(result);
    return ExitSuccess;
}

}  // namespace kv::cli
