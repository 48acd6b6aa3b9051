#include "cli/cli_probe.h"

#include "engine/port_probe.h"

namespace kv::cli {

QString ProbePorts(qint16 connector) {
    QString list;
    for (qint16 port = FirstProbedPort; port <= LastProbedPort; ++port) {
        QString error;
        if (const std::optional<QString> entry = ProbePort(port, connector, error))
            list += *entry + QLatin1Char('\n');
    }
    return list;
}

}  // namespace kv::cli
