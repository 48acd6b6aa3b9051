#pragma once
// One exclusive, configured serial device, open for a single exchange.
// Closing (on destruction) always releases exclusivity first, so a device
// that another process keeps open does not stay locked for the next open.

#include <QString>

namespace kv::KvSerialPort {

class PortHandle {
public:
    PortHandle() = default;
    ~PortHandle() { close(); }
    PortHandle(const PortHandle&) = delete;
    PortHandle& operator=(const PortHandle&) = delete;

    bool isOpen() const { return fd_ >= 0; }
    int fd() const { return fd_; }
    void close();

    // Writes all `size` bytes or gives up after 200 ms. Returns false with errno
    // in `error` on a failed write; `written` tells how many bytes went out.
    bool writeBlock(const char* data, int size, int& written, int& error);

    // Reads up to `size` bytes: returns as soon as `size` have arrived, 10 ms after
    // the last byte, or 10 ms + 1 ms per byte after the call, whichever is first.
    // Returns false with errno in `error` on a failed read; 0 bytes is no error.
    bool readBlock(char* data, int size, int& count, int& error);

private:
    friend bool OpenPort(qint16 port, PortHandle& handle, QString& error);
    int fd_ = -1;
};

// Opens COM `port` exclusively at 115200 8N1, raw, no flow control, DTR and RTS
// inactive. Error texts: "%" no such device, "/Port is use" held by another
// program, "/Port file error N" anything else, "SetCommState failed:N" when the
// line settings are refused. A failed open leaves nothing open.
bool OpenPort(qint16 port, PortHandle& handle, QString& error);

}  // namespace kv::KvSerialPort
