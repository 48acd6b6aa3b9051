#pragma once
// Small helpers shared by the family redraws of the live panel.

#include "ui/live/live_view.h"

#include <QString>

namespace kv::live {

inline const QString Unknown = QStringLiteral("?? ");
inline const QString CrLf = QStringLiteral("\r\n");

// Numbers as the panel shows them: a picture pattern such as "0.00".
QString Fixed(double value, const char* pattern);
// Upper-case hexadecimal of the 32-bit pattern, as a register dump shows it.
QString Hex(qint32 value);
bool Bit(qint16 flags, int bit);
bool InRange(qint32 value, qint32 low, qint32 high);

// Input on the engineering scale of a second-generation module:
// (Eng_In_F - Eng_In_Z) x reading / 10000 + Eng_In_Z.
float EngineeringInput(const RegMap& val);

// The input panel cannot be drawn: error, summary and "?? ".
void FailInput(InputView& input, const QString& error, const QString& summary = {});
void FailOutput(OutputView& output, const QString& error, const QString& summary);
// An input range code the family does not have: nothing can be shown or projected.
void FailInputRange(LiveView& view);
// The input value with its units, or "?? " and the fault when it is not a number.
void ShowInputValue(InputView& input, float value, const QString& units);

// Output calibration of a range row in engineering units, and the signal limits.
struct OutputScale {
    float zero = 0;
    float full = 0;
    bool limitsOn = false;
    float lowLimit = 0;
    float highLimit = 0;
    QString units;
};

// Shows a projected output against its limits: with signal limits on, the
// value is held at the limit it passes; without, the range limits are only
// reported. Either way the lit indicator names the side.
void ShowProjection(OutputView& output, float projected, const OutputScale& scale);

// An output range row as the module is calibrated for it: on the KV720 output 1
// carries the module's own output calibration counts instead of the row's.
RangeDescriptor CalibratedOutputRow(const LiveSource& source, int channel, qint32 range);

// Text of an arithmetic fault that made `value` unusable, or empty.
QString ArithmeticFault(double value);

}  // namespace kv::live
