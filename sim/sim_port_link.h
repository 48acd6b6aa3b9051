#pragma once
// Making the simulator reachable as a COM port, and holding that port busy.

#include <QString>

namespace kv::sim {

// Publishes a device as COM port N by the link <port dir>/comN -> device, in the
// folder where the program looks for its ports. The link is removed again on
// destruction, unless something else has replaced it meanwhile.
class PortLink {
public:
    PortLink() = default;
    ~PortLink() { remove(); }
    PortLink(const PortLink&) = delete;
    PortLink& operator=(const PortLink&) = delete;

    // Refuses to replace a link that still leads to an existing device (another
    // simulator, or a real adapter); a dangling one is replaced.
    bool publish(int port, const QString& device, QString& error);
    void remove();
    QString linkPath() const { return link_; }

private:
    QString link_;
    QString target_;
};

// Holds an exclusive advisory lock on a device, as another program holding the
// port would: the program's exclusive open then finds the port busy.
class PortLock {
public:
    PortLock() = default;
    ~PortLock() { release(); }
    PortLock(const PortLock&) = delete;
    PortLock& operator=(const PortLock&) = delete;

    bool hold(const QString& device, QString& error);
    void release();
    bool held() const { return fd_ >= 0; }

private:
    int fd_ = -1;
};

}  // namespace kv::sim
