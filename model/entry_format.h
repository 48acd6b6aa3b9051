#pragma once
// Number and value texts shown to the user; "." is always the decimal point.

#include <QString>
#include <QVariant>

namespace kv {

// Formats value with a classic picture pattern: "0" a digit always shown, "#" a
// digit shown only when significant, "." the decimal point, "E+00"/"E-00" an
// exponent of at least that many digits whose sign is always shown ("E+") or
// only when negative ("E-"). Examples: "0.00", "#0.0###", "0.00E+00".
QString FormatNumber(double value, const QString& pattern);

// Display text of a value, its format chosen by magnitude; false with
// "AUStxt Value: ..." when the value cannot be shown (not finite).
bool AUStxt(float value, QString& text);

// Firmware revision display: high byte ".", low byte as three digits (515 gives
// "2.003"). A text that is not an integer is returned as it is.
QString RevisionText(const QString& numberText);

// Display text of any value: empty for none, "NO "/"YES" for false/true and the
// 16-bit integers 0/-1, numbers in general form, texts up to their first
// carriage return and at most 70 characters.
QString VarToText(const QVariant& value);

}  // namespace kv
