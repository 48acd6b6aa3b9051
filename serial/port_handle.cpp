#include "serial/port_handle.h"

#include "serial/port_path.h"

#include <QElapsedTimer>

#include <cerrno>
#include <fcntl.h>
#include <poll.h>
#include <sys/file.h>
#include <sys/ioctl.h>
#include <termios.h>
#include <unistd.h>

namespace kv::KvSerialPort {

namespace {
constexpr int WriteTotalMs = 200;
constexpr int ReadIntervalMs = 10;
constexpr int ReadTotalConstantMs = 10;
constexpr int ReadTotalPerByteMs = 1;

QString openErrorText(int error) {
    switch (error) {
    case ENOENT:
    case ENODEV:
    case ENXIO:
        return QStringLiteral("%");
    case EBUSY:
    case EWOULDBLOCK:
        return QStringLiteral("/Port is use");
    default:
        return QStringLiteral("/Port file error %1").arg(error);
    }
}

bool configureLine(int fd) {
    termios tio{};
    tcgetattr(fd, &tio);  // only the write decides, as on the original driver
    cfmakeraw(&tio);
    tio.c_cflag &= ~(CSIZE | PARENB | CSTOPB | CRTSCTS);
    tio.c_cflag |= CS8 | CLOCAL | CREAD;
    tio.c_iflag &= ~(IXON | IXOFF | IXANY | INPCK);
    tio.c_cc[VMIN] = 0;
    tio.c_cc[VTIME] = 0;
    cfsetispeed(&tio, B115200);
    cfsetospeed(&tio, B115200);
    return tcsetattr(fd, TCSANOW, &tio) == 0;
}

int remainingMs(const QElapsedTimer& clock, qint64 deadlineMs) {
    const qint64 left = deadlineMs - clock.elapsed();
    return left > 0 ? int(left) : 0;
}
}  // namespace

void PortHandle::close() {
    if (fd_ < 0)
        return;
    ioctl(fd_, TIOCNXCL);
    flock(fd_, LOCK_UN);
    ::close(fd_);
    fd_ = -1;
}

bool OpenPort(qint16 port, PortHandle& handle, QString& error) {
    handle.close();
    const QString path = PortDevicePath(port);
    if (path.isEmpty()) {
        error = QStringLiteral("%");
        return false;
    }
    const int fd =
        ::open(path.toLocal8Bit().constData(), O_RDWR | O_NOCTTY | O_NONBLOCK | O_CLOEXEC);
    if (fd < 0) {
        error = openErrorText(errno);
        return false;
    }
    // TIOCEXCL keeps ordinary users out; the advisory lock also keeps out a second
    // program running as root, which TIOCEXCL does not.
    if (flock(fd, LOCK_EX | LOCK_NB) != 0) {
        const int lockError = errno;
        ::close(fd);
        error = openErrorText(lockError);
        return false;
    }
    handle.fd_ = fd;
    ioctl(fd, TIOCEXCL);
    if (!configureLine(fd)) {
        error = QStringLiteral("SetCommState failed:%1").arg(errno);
        handle.close();
        return false;
    }
    // The adapter uses no handshake lines; a pseudo-terminal has none to clear.
    int lines = TIOCM_DTR | TIOCM_RTS;
    ioctl(fd, TIOCMBIC, &lines);
    // Bytes left over from an earlier exchange (a late reply) must not be taken
    // as the answer to this one.
    tcflush(fd, TCIFLUSH);
    return true;
}

bool PortHandle::writeBlock(const char* data, int size, int& written, int& error) {
    written = 0;
    QElapsedTimer clock;
    clock.start();
    while (written < size) {
        const ssize_t n = ::write(fd_, data + written, size_t(size - written));
        if (n > 0) {
            written += int(n);
            continue;
        }
        if (n < 0 && errno != EAGAIN && errno != EINTR) {
            error = errno;
            return false;
        }
        const int wait = remainingMs(clock, WriteTotalMs);
        if (wait == 0)
            break;
        pollfd p{fd_, POLLOUT, 0};
        poll(&p, 1, wait);
    }
    return true;
}

bool PortHandle::readBlock(char* data, int size, int& count, int& error) {
    count = 0;
    QElapsedTimer clock;
    clock.start();
    const qint64 totalDeadline = ReadTotalConstantMs + qint64(ReadTotalPerByteMs) * size;
    qint64 intervalDeadline = totalDeadline;
    while (count < size) {
        const int wait = remainingMs(clock, qMin(totalDeadline, intervalDeadline));
        pollfd p{fd_, POLLIN, 0};
        const int ready = poll(&p, 1, wait);
        if (ready < 0 && errno != EINTR) {
            error = errno;
            return false;
        }
        if (ready == 0)
            break;  // time-out: whatever arrived is the result
        if (ready < 0)
            continue;
        const ssize_t n = ::read(fd_, data + count, size_t(size - count));
        if (n < 0) {
            if (errno == EINTR || (errno == EAGAIN && !(p.revents & (POLLHUP | POLLERR))))
                continue;
            if (errno == EAGAIN)
                break;
            error = errno;
            return false;
        }
        if (n == 0) {
            // Hang-up with nothing to read: nothing more will arrive in this read.
            if (p.revents & POLLHUP)
                break;
            continue;
        }
        count += int(n);
        intervalDeadline = clock.elapsed() + ReadIntervalMs;
    }
    return true;
}

}  // namespace kv::KvSerialPort
