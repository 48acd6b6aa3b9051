#pragma once
// The .kv7 settings file: one module's SettingsSet, one `"key",value` line per
// field in a fixed order, lines ending in CR LF.

#include "model/settings_set.h"

#include <QByteArray>
#include <QString>

namespace kv {

// Appends ".kv7" unless the name already ends in ".kv7" in any letter case.
void ApplyKv7Extension(QString& fileName);

// Writes record to fileName (extension rule applied; the caller sees the final
// name). The previous file stays intact unless the new one was written
// completely. Texts that the format cannot hold (a double quote, a line break,
// a character beyond Latin-1) and values that are not finite numbers refuse the
// save. On failure fileName becomes the reason.
bool SaveKVdef(QString& fileName, const SettingsSet& record);

// Loads fileName (extension rule applied) into into: fields found in the file
// are set, the others keep their values; unknown keys go to into.LoadNote and
// the log. typeCode becomes the file's ModTypeSet. False when the file has no
// non-zero ModTypeSet or cannot be read; fileName then becomes the reason
// followed by a blank and the file name. Fields read before a failure stay.
bool RestoreKVdef(QString& fileName, qint32& typeCode, SettingsSet& into);
// The same into RestoredSet().
bool RestoreKVdef(QString& fileName, qint32& typeCode);

// A settings window takes over the record loaded last, load note included.
void CopyRestoredSet(SettingsSet& record);

// One line of the file.
void WF(QByteArray& out, const QString& key, qint32 value);
void WF(QByteArray& out, const QString& key, float value);
void WF(QByteArray& out, const QString& key, const QString& value);

}  // namespace kv
