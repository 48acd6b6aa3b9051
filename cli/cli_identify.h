#pragma once
// What the identification found out about the module on the adapter.

#include <QString>

namespace kv::cli {

// "Model", "Serial number", "Revision" and "Bus ID" lines from RegVal, tab-separated.
QString IdentityText();

}  // namespace kv::cli
