#include "serial/port_path.h"

#include <QDir>
#include <QFileInfo>

namespace kv::KvSerialPort {

namespace {
struct BuiltInRange {
    int first;
    int last;
    const char* prefix;
};
constexpr BuiltInRange builtInPorts[] = {
    {1, 10, "/dev/ttyUSB"},
    {11, 20, "/dev/ttyACM"},
    {21, 30, "/dev/ttyS"},
};
}  // namespace

QString PortDirectory() {
    const QString own = qEnvironmentVariable("KV700_PORT_DIR");
    if (!own.isEmpty())
        return own;
    QString config = qEnvironmentVariable("XDG_CONFIG_HOME");
    if (config.isEmpty())
        config = QDir::homePath() + QStringLiteral("/.config");
    return config + QStringLiteral("/kv700/ports");
}

QString PortDevicePath(qint16 port) {
    const QString link = PortDirectory() + QStringLiteral("/com%1").arg(port);
    const QFileInfo info(link);
    if (info.isSymLink() || info.exists())
        return link;
    for (const BuiltInRange& range : builtInPorts) {
        if (port >= range.first && port <= range.last)
            return QString::fromLatin1(range.prefix) + QString::number(port - range.first);
    }
    return {};
}

}  // namespace kv::KvSerialPort
