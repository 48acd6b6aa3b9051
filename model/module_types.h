#pragma once
// Module type codes (the "Module Type" register) and what follows from them:
// the model text, the register map and the family check of drivers and windows.

#include <QString>

namespace kv {

// Register map of a type code: 1..7, or 99 for a code outside the table.
int GetModMap(qint32 typeCode);

// Model text of a type code and sub-type (the TypInput register); "KV ?" for an unknown code.
QString ModelText(qint32 typeCode, qint16 subType);

// ModelText with the sub-type last read into RegVal. An unknown code also sets
// ModuleMap to 99 and logs "?".
QString DisplayModuleType(qint32 typeCode);

// True when the code's map is the expected family (1..7); otherwise false with
// the model text and " is not <family>!" in message.
bool CheckModType(qint32 typeCode, int family, QString& message);

}  // namespace kv
