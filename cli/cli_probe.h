#pragma once
// The port probe of the connection settings: one module-type read on each of
// COM1 to COM30, listed the way the settings window lists them.

#include <QString>

namespace kv::cli {

// Probes every port with the given adapter type; one entry per line.
QString ProbePorts(qint16 connector);

}  // namespace kv::cli
