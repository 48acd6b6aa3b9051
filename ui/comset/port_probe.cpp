#include "ui/comset/port_probe.h"

#include "model/codec.h"
#include "model/module_types.h"
#include "serial/adapter_test.h"
#include "serial/port_path.h"
#include "serial/transact.h"

#include <QFileInfo>

namespace kv {

namespace {
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
    QString device = KvSerialPort::PortDevicePath(port);
    const QFileInfo link(device);
    if (link.isSymLink())
        device = QStringLiteral("%1 -> %2").arg(device, link.symLinkTarget());
    return ProbeDeniedAccess(error) ? device + QStringLiteral(" (no permission)") : device;
}

bool ProbeDeniedAccess(const QString& error) {
    return error == accessDenied;
}

QString PermissionAdvice(qint16 port) {
    const QString path = KvSerialPort::PortDevicePath(port);
    const QString target = QFileInfo(path).canonicalFilePath();
    const QString device = target.isEmpty() ? path : target;
    QString group = QFileInfo(device).group();
    // A device without a group of its own is usually given to "dialout" by the system.
    if (group.isEmpty() || group == QLatin1String("root"))
        group = QStringLiteral("dialout");
    return QStringLiteral("You may not use %1. Add yourself to the group \"%2\" "
                          "(sudo adduser $USER %2), then log out and in again.")
        .arg(device, group);
}

std::optional<QString> ProbePort(qint16 port, qint16 connector, QString& error) {
    QByteArray reply;
    bool portFault = false;
    error.clear();
    const bool replied = KvSerialPort::Transact(port, KvSerialPort::AdapterTestMessage(), connector,
                                                false, reply, error, portFault);
    return ProbeEntryText(port, replied, reply, error);
}

}  // namespace kv
