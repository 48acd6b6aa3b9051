#pragma once
// Storing received registers into RegVal, and the values kept beside it.

#include "model/register_map.h"

#include <QByteArray>
#include <QString>
#include <array>
#include <functional>

namespace kv {

// The four bytes of the last "Calibration Errors" part received.
extern std::array<qint16, 4> CalErrors;
// Data text of the last register received whose address is in no member.
extern QByteArray LastUnknownData;

// Stores one received register (8-character data text, the reply's bus ID and
// status) into RegVal. Returns true when nothing was stored: status not 0, a
// malformed data text, a value that does not fit its member, or a part ID that
// the multi-part register does not have (the last three are logged).
bool UpdateRegValue(int address, const QByteArray& data, int id, int status);

// Receives the model text and a blank whenever the sub-type (TypInput) arrives;
// the main window shows it as its module caption.
using ModuleCaptionHandler = std::function<void(const QString&)>;
void SetModuleCaptionHandler(ModuleCaptionHandler handler);

// The 4-character engineering unit held in Eng_Unit1..Eng_Unit4 of a value record.
QString EngUnitText(const RegMap& values);

}  // namespace kv
