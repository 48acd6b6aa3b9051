#pragma once
// Opening a document with the application the desktop associates with it.

#include <QString>

namespace kv {

// True when the desktop took the document. Otherwise `path` becomes the
// reason, a blank and the path ("file not found /opt/kv700/guide.pdf").
bool ShellOpen(QString& path);

}  // namespace kv
