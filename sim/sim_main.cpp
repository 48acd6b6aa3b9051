// kv700-sim: one simulated module on a programming adapter, reachable by the
// program as a COM port until interrupted.
#include "sim/sim_cli.h"
#include "sim/simulator.h"

#include <QCoreApplication>
#include <QTextStream>

#include <csignal>
#include <ctime>

using namespace kv::sim;

int main(int argc, char* argv[]) {
    // Stop signals are taken by sigtimedwait below; blocked before any thread exists.
    sigset_t stopSignals;
    sigemptyset(&stopSignals);
    for (int signal : {SIGINT, SIGTERM, SIGHUP})
        sigaddset(&stopSignals, signal);
    pthread_sigmask(SIG_BLOCK, &stopSignals, nullptr);

    QCoreApplication application(argc, argv);
    const QStringList arguments = application.arguments();
    QTextStream out(stdout);
    QTextStream err(stderr);

    SimCommandLine command;
    QString error;
    if (!ParseSimArguments(arguments, command, error)) {
        err << "kv700-sim: " << error << "\n"
            << "Try kv700-sim --help.\n";
        return 2;
    }
    if (command.help) {
        out << SimHelpText();
        return 0;
    }

    Simulator simulator(command.options);
    if (!simulator.start(error) ||
        (!command.printPath && !simulator.publishAsPort(command.port, error)) ||
        (command.portBusy && !simulator.setPortBusy(true, error))) {
        err << "kv700-sim: " << error << "\n";
        return 1;
    }
    const ModuleIdentity module = simulator.module();
    if (command.printPath) {
        out << simulator.slavePath() << "\n";
    } else {
        out << "COM" << command.port << ": " << simulator.portLinkPath() << " -> "
            << simulator.slavePath() << "\n";
    }
    out << ModelName(module.typeCode, module.subType) << ", serial " << module.serial
        << ", adapter type " << command.options.adapter << "\n";
    out.flush();

    qint64 shown = 0;
    const timespec poll{0, 200 * 1000 * 1000};
    while (sigtimedwait(&stopSignals, nullptr, &poll) < 0) {
        if (!command.logFrames)
            continue;
        for (const SimLogEntry& entry : simulator.log()) {
            if (entry.sequence < shown)
                continue;
            out << DescribeLogEntry(entry) << "\n";
            shown = entry.sequence + 1;
        }
        out.flush();
    }
    simulator.stop();
    return 0;
}
