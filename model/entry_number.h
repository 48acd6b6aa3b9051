#pragma once
// Reading and writing numbers the same way on every machine: "." is the only
// decimal separator and the user's locale is never consulted.

#include <QString>

namespace kv {

// A decimal number as users type it and settings files hold it: optional sign,
// digits with an optional "." fraction, optional exponent, blanks around it.
// Group separators, commas, hexadecimal, "inf" and "nan" are not numbers.
bool ParseDecimal(const QString& text, double& value);
// The same as a 32-bit floating value; false when the magnitude exceeds its range
// (values too small for it become zero).
bool ParseDecimal(const QString& text, float& value);

// Nearest integer with an exact half going to the even neighbour; false when the
// value is not finite or outside the 32-bit range.
bool RoundToLong(double value, qint32& result);

// General form of a computed value: up to 15 significant digits, exponent only
// for very small or large magnitudes ("3", "0.75", "1e-05").
QString GeneralText(double value);
// Shortest text that reads back as the same 32-bit floating value.
QString GeneralText(float value);

}  // namespace kv
