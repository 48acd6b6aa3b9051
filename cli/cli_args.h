#pragma once
// The command line of kv700-cli, read into one request without touching
// anything else, so that every usage error is found before a port is opened.

#include "serial/frame.h"

#include <QString>
#include <QStringList>

#include <optional>

namespace kv::cli {

enum class Command { Help, Probe, Identify, Read, Program, Regs, Get, Set, SelfTest };

constexpr qint16 DefaultBusId = KvSerialPort::OrdinaryBusId;

struct CliRequest {
    Command command = Command::Help;
    std::optional<qint16> port;     // --port
    QString device;                 // --device
    std::optional<qint16> adapter;  // --adapter
    bool verbose = false;           // --verbose: the message log and the tick count on stderr
    QString file;                   // read --out FILE, program FILE
    qint32 address = 0;             // get, set
    qint16 busId = DefaultBusId;    // get --id
    double value = 0;               // set
    bool asFloat = false;           // set --float
};

struct ParseOutcome {
    bool ok = false;
    CliRequest request;
    QString error;  // what is wrong, without the usage text
};

// `arguments` without the program name.
ParseOutcome ParseArguments(const QStringList& arguments);

QString UsageText();

}  // namespace kv::cli
