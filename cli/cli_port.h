#pragma once
// Which COM port and adapter type a command uses. A device named with --device
// becomes a COM port of its own through a private port folder of this process.

#include "cli/cli_args.h"

#include <QTemporaryDir>

#include <memory>

namespace kv::cli {

constexpr qint16 DefaultPort = 1;
constexpr qint16 DefaultAdapter = 0;
constexpr qint16 DevicePort = 1;  // the number a --device is reached by

class PortChoice {
public:
    // Sets up the port; false with a reason when the private folder cannot be made.
    bool resolve(const CliRequest& request, QString& error);
    qint16 port() const { return port_; }
    qint16 connector() const { return connector_; }

private:
    qint16 port_ = DefaultPort;
    qint16 connector_ = DefaultAdapter;
    std::unique_ptr<QTemporaryDir> folder_;
};

}  // namespace kv::cli
