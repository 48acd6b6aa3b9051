#include "engine/port_probe.h"

#include "model/codec.h"
#include "model/module_types.h"
#include "serial/adapter_test.h"
#include "serial/transact.h"

namespace kv {

namespace {
constexpr int DataStart = 3;
constexpr int DataLength = 8;
}  // namespace

std::optional<QString> ProbeEntryText(qint16 port, bool replied, const QByteArray& reply,
                                      const QString& error) {
    const QString name = QStringLiteral("Com%1").arg(port);
    if (replied)
        return name + QLatin1Char(' ') +
               DisplayModuleType(WireToLong(reply.mid(DataStart, DataLength)));
    if (error.startsWith(QLatin1Char('%')))
        return std::nullopt;
    if (error.startsWith(QLatin1Char('/')))
        return name + error;
    return name;
}

std::optional<QString> ProbePort(qint16 port, qint16 connector, QString& error) {
    QByteArray reply;
    bool portFault = false;
    error.clear();
    // The self-test's request is the read of the module type on bus 16.
    const bool replied = KvSerialPort::Transact(port, KvSerialPort::AdapterTestMessage(), connector,
                                                false, reply, error, portFault);
    return ProbeEntryText(port, replied, reply, error);
}

}  // namespace kv
