#pragma once
// Where settings files go by default and the names proposed for them.

#include <QString>

namespace kv {

// The folder the file dialogs start in, ending in "/": $KV700_HOME when set,
// otherwise ~/ORVE/KV700/. Saving into it creates it.
QString DefaultFolder();
// The production tester's folder for the files it saves on its own.
QString AutoSaveFolder();

// Name proposed by "Save to File": model text, "-" and the record's
// 20-character FileName, blanks included.
QString ProposedSaveName(const QString& modelText, const QString& fileName);
// Full path of a file the production tester saves.
QString AutoSavePath(const QString& modelText, const QString& testerPart);

// Characters that cannot appear in a file name on any platform ("/", "\",
// ":", "*", "?", double quote, "<", ">", "|", control characters) become "_",
// so a module's name never turns into a different folder or an invalid name.
QString FileNameSafe(const QString& name);

}  // namespace kv
