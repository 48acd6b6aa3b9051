#pragma once
// Conversion between degrees Celsius and the user's engineering temperature unit.
// Only the last character of the trimmed unit text counts: "degC", "°C" and "C"
// are all Celsius, "F" Fahrenheit, "K" kelvin; any other text is refused.

#include <QString>

namespace kv {

bool DegC_ToDegEng(double& value, const QString& unit, double celsius, QString& message);
bool DegEngToDegC(double value, const QString& unit, double& celsius, QString& message);

// A temperature difference (a span) in the user's unit: no offset applied.
bool DegC_SpanToDegEng(double& value, const QString& unit, double celsius, QString& message);

}  // namespace kv
