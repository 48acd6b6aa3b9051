#include "ui/comset/port_probe.h"

#include "serial/port_path.h"

#include <QFileInfo>

namespace kv {

namespace {
const QString accessDenied = QStringLiteral("/Port file error 13");
}  // namespace

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

}  // namespace kv
