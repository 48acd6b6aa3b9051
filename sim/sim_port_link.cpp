#include "sim/sim_port_link.h"

#include "serial/port_path.h"

#include <QDir>
#include <QFile>
#include <QFileInfo>

#include <cerrno>
#include <cstring>
#include <fcntl.h>
#include <sys/file.h>
#include <unistd.h>

namespace kv::sim {

bool PortLink::publish(int port, const QString& device, QString& error) {
    remove();
    const QString dir = KvSerialPort::PortDirectory();
    if (!QDir().mkpath(dir)) {
        error = QStringLiteral("cannot create the port folder %1").arg(dir);
        return false;
    }
    const QString link = dir + QStringLiteral("/com%1").arg(port);
    const QFileInfo existing(link);
    if (existing.isSymLink() || existing.exists()) {
        if (existing.exists()) {
            error = QStringLiteral("%1 already leads to %2; remove it if it is stale")
                        .arg(link, existing.symLinkTarget());
            return false;
        }
        QFile::remove(link);
    }
    if (symlink(device.toLocal8Bit().constData(), link.toLocal8Bit().constData()) != 0) {
        error = QStringLiteral("cannot create %1: %2")
                    .arg(link, QString::fromLocal8Bit(strerror(errno)));
        return false;
    }
    link_ = link;
    target_ = device;
    return true;
}

void PortLink::remove() {
    if (link_.isEmpty())
        return;
    if (QFileInfo(link_).symLinkTarget() == QFileInfo(target_).absoluteFilePath())
        QFile::remove(link_);
    link_.clear();
    target_.clear();
}

bool PortLock::hold(const QString& device, QString& error) {
    if (held())
        return true;
    const int fd = ::open(device.toLocal8Bit().constData(), O_RDWR | O_NOCTTY | O_CLOEXEC);
    if (fd < 0 || flock(fd, LOCK_EX | LOCK_NB) != 0) {
        error = QStringLiteral("cannot hold %1: %2")
                    .arg(device, QString::fromLocal8Bit(strerror(errno)));
        if (fd >= 0)
            ::close(fd);
        return false;
    }
    fd_ = fd;
    return true;
}

void PortLock::release() {
    if (fd_ < 0)
        return;
    flock(fd_, LOCK_UN);
    ::close(fd_);
    fd_ = -1;
}

}  // namespace kv::sim
