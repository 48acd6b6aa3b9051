#pragma once
// Texts for the outcome of opening a document with the application the desktop
// associates with it (the adapter's user guide).

#include <QString>

namespace kv {

// Results of 33 and above are success.
constexpr int ShellOpenSuccess = 33;

// The message for a failed open's result code: "file not found" for 2, ...
QString ShellOpenMessage(int result);
// What replaces the document path after a failed open: message, blank, path.
QString ShellOpenFailure(int result, const QString& path);

}  // namespace kv
