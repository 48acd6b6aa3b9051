#pragma once
// Port numbers stay the program's 16-bit COM numbers; this maps one to a device.

#include <QString>

namespace kv::KvSerialPort {

// Folder of user-made links comN -> device: $KV700_PORT_DIR, else
// $XDG_CONFIG_HOME/kv700/ports, else ~/.config/kv700/ports.
QString PortDirectory();

// Device path of COM port N: <port dir>/comN when that link exists (even dangling,
// so a vanished simulator reads as a missing port rather than falling through to
// real hardware), else COM1-10 -> /dev/ttyUSB0-9, COM11-20 -> /dev/ttyACM0-9,
// COM21-30 -> /dev/ttyS0-9. Empty for any other N.
QString PortDevicePath(qint16 port);

}  // namespace kv::KvSerialPort
