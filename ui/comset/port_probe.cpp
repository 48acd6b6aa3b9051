#include "ui/comset/port_probe.h"

#include "model/codec.h"
#include "model/module_types.h"
#include "serial/port_path.h"
#include "serial/transact.h"

#include <QFileInfo>

namespace kv {

namespace {
const QByteArray moduleTypeRead = QByteArray("R") + char(16) + char(255) + "30303030" + "F";
const QString accessDenied = QStringLiteral("/Port file error 13");
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

QString ProbeDeviceNote(qint16 port, const QString& error) {
    const QString device = KvSerialPort::PortDevicePath(port);
    if (error != accessDenied)
        return device;
    QString group = QFileInfo(device).group();
    if (group.isEmpty() || group == QLatin1String("root"))
        group = QStringLiteral("dialout");
    return QStringLiteral("%1 - no permission: add yourself to the group \"%2\" "
                          "(sudo adduser $USER %2) and log in again")
        .arg(device, group);
}

std::optional<QString> ProbePort(qint16 port, qint16 connector, QString& error) {
    QByteArray reply;
    bool portFault = false;
    error.clear();
    const bool replied =
        KvSerialPort::Transact(port, moduleTypeRead, connector, false, reply, error, portFault);
    return ProbeEntryText(port, replied, reply, error);
}

}  // namespace kv
