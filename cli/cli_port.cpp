#include "cli/cli_port.h"

#include "engine/app_settings.h"

#include <QFile>
#include <QFileInfo>

namespace kv::cli {

bool PortChoice::resolve(const CliRequest& request, QString& error) {
    // Without a choice on the command line the bench uses what the program last connected to.
    const StoredProperties stored = LoadProperties(DefaultPort, DefaultAdapter);
    connector_ = request.adapter.value_or(stored.connector);
    port_ = request.port.value_or(stored.commPort);
    if (request.device.isEmpty())
        return true;
    folder_ = std::make_unique<QTemporaryDir>();
    if (!folder_->isValid()) {
        error = QStringLiteral("Cannot make a port folder: ") + folder_->errorString();
        return false;
    }
    const QString link = folder_->filePath(QStringLiteral("com%1").arg(DevicePort));
    // A device that does not exist stays a dangling link, so the exchange reports
    // the missing port itself.
    if (!QFile::link(QFileInfo(request.device).absoluteFilePath(), link)) {
        error = QStringLiteral("Cannot link %1 as COM%2").arg(request.device).arg(DevicePort);
        return false;
    }
    qputenv("KV700_PORT_DIR", QFile::encodeName(folder_->path()));
    port_ = DevicePort;
    return true;
}

}  // namespace kv::cli
