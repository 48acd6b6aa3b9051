#pragma once
// Reading the connected module's settings into a .kv7 file, and programming
// it from one, through its model's driver like a settings window does.

#include "model/settings_set.h"

#include <QString>

namespace kv::cli {

class ModuleSession;
class StderrSink;

// Loads a settings file for programming; false with the reason ("Failed: ...").
bool LoadSettingsFile(const QString& file, qint32& typeCode, SettingsSet& settings, QString& error);

// Programs `settings` from a file of module type `typeCode`; a file of another
// family is refused with the text of CheckModType. The result is "Programmed".
bool ProgramModule(ModuleSession& session, StderrSink& sink, qint32 typeCode,
                   const SettingsSet& settings, QString& result, QString& error);

// Reads the module and saves the settings; the result is "Saved: " and the file.
bool ReadModule(ModuleSession& session, StderrSink& sink, const QString& file, QString& result,
                QString& error);

}  // namespace kv::cli
