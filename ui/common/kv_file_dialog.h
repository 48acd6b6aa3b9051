#pragma once
// Choosing a settings file to open, set up the same way for every caller.

#include <QString>

class QWidget;

namespace kv {

// True when the user chose an existing file; `fileName` (in: proposed name)
// becomes its path. False when cancelled; `fileName` is then unchanged.
bool OpenDialog(QString& fileName, QWidget* owner);

// Runs the open dialog and loads the chosen file into RestoredSet. False with
// "Cancelled operation", "Invalid file name" or the loader's reason in `fileName`.
bool OpenKVFile(QString& fileName, qint32& typeCode, QWidget* owner);

}  // namespace kv
