#pragma once
// Conversion between a user calibration in engineering units and the module's
// raw counts, through the counts a module reports for each of its ranges.

#include "model/range_table.h"

#include <QString>

namespace kv {

// Engineering zero and full scale of a range to the module counts that stand
// for them. Fails when the range's counts are not known yet, when the values
// lie outside what the range allows, or when the zero count would be negative.
bool UsrCalRangeSet(const RangeDescriptor& range, float zero, float full, qint32& zeroCount,
                    qint32& fullCount, QString& message);

// The inverse: module counts to engineering values, rounded to two decimals.
// Messages start with name.
bool GetUserCal(const RangeDescriptor& range, qint32 zeroCount, qint32 fullCount, float& zero,
                float& full, QString& message, const QString& name);

// GetUserCal that also gives the range's unit. On failure the message and ", "
// are appended to errors, the unit is "??" and both values are zero.
bool UserCalToEng(const RangeDescriptor& range, qint32 zeroCount, qint32 fullCount, float& zero,
                  float& full, QString& unit, QString& errors, const QString& name);

}  // namespace kv
