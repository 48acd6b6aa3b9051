#include "cli/cli_probe.h"

#include "cli/cli_args.h"
#include "model/codec.h"
#include "model/module_types.h"
#include "model/register_map.h"
#include "serial/frame.h"
#include "serial/transact.h"

namespace kv::cli {

QString ProbeEntry(qint16 port, bool answered, const QByteArray& reply, const QString& error) {
    const QString name = QStringLiteral("Com%1").arg(port);
    if (answered)
        return name + QLatin1Char(' ') + DisplayModuleType(WireToLong(reply.mid(3, 8)));
    if (error.startsWith(QLatin1Char('%')))
        return {};
    if (error.startsWith(QLatin1Char('/')))
        return name + error;
    return name;
}

QString ProbePorts(qint16 connector) {
    const QByteArray message =
        KvSerialPort::ReadMessage(DefaultBusId, RegMapFor(NoModuleMap).Mod_Type);
    QString list;
    for (qint16 port = FirstProbedPort; port <= LastProbedPort; ++port) {
        QByteArray reply;
        QString error;
        bool portFault = false;
        const bool answered =
            KvSerialPort::Transact(port, message, connector, false, reply, error, portFault);
        const QString entry = ProbeEntry(port, answered, reply, error);
        if (!entry.isEmpty())
            list += entry + QLatin1Char('\n');
    }
    return list;
}

}  // namespace kv::cli
