#pragma once
// The command line of kv700-sim, read into simulator options.

#include "sim/simulator.h"

#include <QString>
#include <QStringList>

namespace kv::sim {

struct SimCommandLine {
    SimOptions options;
    int port = 1;
    bool printPath = false;  // print the device instead of publishing a COM port
    bool portBusy = false;
    bool logFrames = false;
    bool help = false;
};

// `arguments` includes the program name first. False with a message for
// anything it cannot use.
bool ParseSimArguments(const QStringList& arguments, SimCommandLine& command, QString& error);
QString SimHelpText();

// One line of the frame log for a person watching.
QString DescribeLogEntry(const SimLogEntry& entry);

}  // namespace kv::sim
