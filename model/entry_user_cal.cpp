#include "model/entry_user_cal.h"

#include "model/entry_check.h"
#include "model/entry_format.h"
#include "model/entry_number.h"

namespace kv {

namespace {

// A count is rounded after adding a half, as the modules' own calibration
// tools do; programmed modules depend on the exact counts this gives.
bool engineeringToCount(const RangeDescriptor& range, float value, qint32& count) {
    const double fraction =
        (double(value) - range.minimum) / (double(range.maximum) - double(range.minimum));
    return RoundToLong(fraction * (double(range.countMax) - range.countMin) + range.countMin + 0.5,
                       count);
}

bool countToEngineering(const RangeDescriptor& range, qint32 count, float& value) {
    const double exact = (double(range.maximum) - range.minimum) *
                             (double(count) - range.countMin) /
                             (double(range.countMax) - range.countMin) +
                         range.minimum;
    return ParseDecimal(FormatNumber(exact, QStringLiteral("0.00")), value);
}

}  // namespace

bool UsrCalRangeSet(const RangeDescriptor& range, float zero, float full, qint32& zeroCount,
                    qint32& fullCount, QString& message) {
    const QString prefix = QStringLiteral("UsrCalRangeSet: ");
    if (range.countMin == 0 || range.countMax == 0) {
        message = prefix + QStringLiteral("Update Calibration Values");
        return false;
    }
    const struct {
        bool failed;
        QString text;
    } rules[] = {
        {zero < LowestZero(range), QStringLiteral("Min < ") + GeneralText(LowestZero(range))},
        {zero > range.maximum, QStringLiteral("Min Too High")},
        {full < range.minimum, QStringLiteral("Max Too Low")},
        {full > HighestFull(range), QStringLiteral("Max > ") + GeneralText(HighestFull(range))},
        {zero == full, QStringLiteral("Cannot be the same")},
        {range.minimum == range.maximum, QStringLiteral("Range minimum equals its maximum")},
    };
    for (const auto& rule : rules) {
        if (rule.failed) {
            message = prefix + rule.text;
            return false;
        }
    }
    qint32 zeroResult = 0;
    qint32 fullResult = 0;
    if (!engineeringToCount(range, zero, zeroResult) ||
        !engineeringToCount(range, full, fullResult)) {
        message = prefix + QStringLiteral("Count out of range");
        return false;
    }
    if (zeroResult < 0) {
        message = QStringLiteral("Output Zero too low");
        return false;
    }
    zeroCount = zeroResult;
    fullCount = fullResult;
    return true;
}

bool GetUserCal(const RangeDescriptor& range, qint32 zeroCount, qint32 fullCount, float& zero,
                float& full, QString& message, const QString& name) {
    if (range.countMin == 0 || range.countMax == 0) {
        message = name + QStringLiteral(" Invalid Cal Values");
        return false;
    }
    if (zeroCount == 0 || fullCount == 0) {
        message = name + QStringLiteral(" Invalid User Cal");
        return false;
    }
    if (range.countMin == range.countMax) {
        message = name + QStringLiteral(" Get User Cal Error: Division by zero");
        return false;
    }
    float zeroValue = 0;
    float fullValue = 0;
    if (!countToEngineering(range, zeroCount, zeroValue) ||
        !countToEngineering(range, fullCount, fullValue)) {
        message = name + QStringLiteral(" Get User Cal Error: Overflow");
        return false;
    }
    zero = zeroValue;
    full = fullValue;
    return true;
}

bool UserCalToEng(const RangeDescriptor& range, qint32 zeroCount, qint32 fullCount, float& zero,
                  float& full, QString& unit, QString& errors, const QString& name) {
    QString message;
    if (GetUserCal(range, zeroCount, fullCount, zero, full, message, name)) {
        unit = range.unit;
        return true;
    }
    errors += message + QStringLiteral(", ");
    unit = QStringLiteral("??");
    zero = 0;
    full = 0;
    return false;
}

}  // namespace kv
