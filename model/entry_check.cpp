#include "model/entry_check.h"

#include "model/entry_number.h"

namespace kv {

namespace {

LabelColour colourFor(bool ok) {
    return ok ? LabelColour::Normal : LabelColour::Error;
}

// A user zero/full rule that failed: its message and the labels it marks.
struct RangeRule {
    bool failed;
    QString message;
    LabelMarks marks;
};

}  // namespace

double LowestZero(const RangeDescriptor& range) {
    return double(range.minimum) - 0.05 * double(range.maximum);
}

double HighestFull(const RangeDescriptor& range) {
    return 1.05 * double(range.maximum);
}

bool CheckNumeric(const QString& text, QString& message, const QString& fieldName) {
    double value = 0;
    if (ParseDecimal(text, value))
        return true;
    QString withPoints = text;
    withPoints.replace(QLatin1Char(','), QLatin1Char('.'));
    QString withoutCommas = text;
    withoutCommas.remove(QLatin1Char(','));
    if (text.contains(QLatin1Char(',')) &&
        (ParseDecimal(withPoints, value) || ParseDecimal(withoutCommas, value)))
        message +=
            fieldName + QStringLiteral(" Must use a \".\" not a \",\" when entering decimals. ");
    else
        message += (fieldName.isEmpty() ? QStringLiteral(" Value") : fieldName) +
                   QStringLiteral(" Must Be Numeric ");
    return false;
}

bool CheckLimits(const EntryField& field, double minimum, double maximum, QString& message) {
    double value = 0;
    if (!ParseDecimal(field.text, value)) {
        message.clear();
        CheckNumeric(field.text, message, field.name);
        return false;
    }
    if (value < minimum) {
        message = field.text.trimmed() + QStringLiteral(" < ") + GeneralText(minimum);
        return false;
    }
    if (value > maximum) {
        message = field.text.trimmed() + QStringLiteral(" > ") + GeneralText(maximum);
        return false;
    }
    return true;
}

bool CheckOrder(const EntryField& first, const EntryField& second, QString& message,
                LabelMarks& marks) {
    double firstValue = 0;
    double secondValue = 0;
    const bool firstNumeric = ParseDecimal(first.text, firstValue);
    const bool secondNumeric = ParseDecimal(second.text, secondValue);
    if (!firstNumeric || !secondNumeric) {
        message.clear();
        if (!firstNumeric) {
            CheckNumeric(first.text, message, first.name);
            marks.first = LabelColour::Error;
        }
        if (!secondNumeric) {
            CheckNumeric(second.text, message, second.name);
            marks.second = LabelColour::Error;
        }
        return false;
    }
    if (secondValue < firstValue) {
        message = second.name + QStringLiteral(" must be > ") + first.name;
        marks = {LabelColour::Error, LabelColour::Error};
        return false;
    }
    return true;
}

bool CheckPair(const EntryField& first, const EntryField& second, double minimum, double maximum,
               QString& message, LabelMarks& marks) {
    QString firstMessage;
    QString secondMessage;
    const bool firstOk = CheckLimits(first, minimum, maximum, firstMessage);
    const bool secondOk = CheckLimits(second, minimum, maximum, secondMessage);
    marks = {colourFor(firstOk), colourFor(secondOk)};
    if (!firstOk || !secondOk) {
        message = firstOk ? secondMessage : firstMessage;
        return false;
    }
    return CheckOrder(first, second, message, marks);
}

bool UserRangeCheck(const RangeTable& table, int rangeNumber, const QString& zeroText,
                    const QString& fullText, UserRange& range, QString& message,
                    LabelMarks& marks) {
    if (rangeNumber < 0 || rangeNumber >= RangeEntries) {
        message = QStringLiteral("Failed to get range details");
        return false;
    }
    const RangeDescriptor& entry = table[rangeNumber];
    float zero = 0;
    float full = 0;
    if (!ParseDecimal(zeroText, zero)) {
        marks.first = LabelColour::Error;
        message = QStringLiteral("Min not unmeric");
        return false;
    }
    if (!ParseDecimal(fullText, full)) {
        marks.second = LabelColour::Error;
        message = QStringLiteral("Max not unmeric");
        return false;
    }
    constexpr LabelColour N = LabelColour::Normal;
    constexpr LabelColour E = LabelColour::Error;
    const RangeRule rules[] = {
        {zero < 0, QStringLiteral("Min < 0"), {E, N}},
        {zero < LowestZero(entry),
         QStringLiteral("Min < ") + GeneralText(LowestZero(entry)),
         {E, N}},
        {zero > entry.maximum, QStringLiteral("Min Too High"), {E, N}},
        {full < entry.minimum, QStringLiteral("Max Too Low"), {N, E}},
        {full > HighestFull(entry),
         QStringLiteral("Max > ") + GeneralText(HighestFull(entry)),
         {N, LabelColour::Red}},
        {zero == full, QStringLiteral("Cannot be the same"), {E, E}},
    };
    for (const RangeRule& rule : rules) {
        if (rule.failed) {
            message = rule.message;
            marks = rule.marks;
            return false;
        }
    }
    marks = {N, N};
    range = {zero, full, entry.unit};
    return true;
}

}  // namespace kv
