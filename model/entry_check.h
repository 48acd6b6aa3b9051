#pragma once
// The rules that decide whether a number typed into a settings window is
// acceptable, with the messages that say why not. The windows colour each
// field's label from the marks a check returns.

#include "model/range_table.h"

#include <QString>

namespace kv {

// What a check asks of a field's label.
enum class LabelColour {
    Keep,    // leave the colour the label has
    Normal,  // the theme's normal label colour
    Error,   // the theme's error colour
    Red,     // pure red, whatever the theme
};

// Labels of the two fields a check looks at, in the order they are passed.
struct LabelMarks {
    LabelColour first = LabelColour::Keep;
    LabelColour second = LabelColour::Keep;
};

// A field's text as typed and its name for messages.
struct EntryField {
    QString text;
    QString name;
};

// True when the text is a number written with "." as its decimal point.
// Otherwise appends to message fieldName and why (" Must use a "." ..." for a
// comma, " Must Be Numeric " for anything else; " Value" stands in for an
// empty fieldName there) and returns false.
bool CheckNumeric(const QString& text, QString& message, const QString& fieldName = {});

// Bounds included. The field's label is Error exactly when this returns false.
bool CheckLimits(const EntryField& field, double minimum, double maximum, QString& message);

// False when the second number is smaller than the first: both labels Error.
bool CheckOrder(const EntryField& first, const EntryField& second, QString& message,
                LabelMarks& marks);

// CheckLimits on both fields (both labels coloured), then CheckOrder.
bool CheckPair(const EntryField& first, const EntryField& second, double minimum, double maximum,
               QString& message, LabelMarks& marks);

// A user zero/full-scale pair accepted for a range, in its range's unit.
struct UserRange {
    float zero = 0;
    float full = 0;
    QString unit;
};

// Checks a zero/full pair typed for entry rangeNumber of a channel's range
// table (the caller fills the table for the module's map and channel). Marks:
// first = zero label, second = full label.
bool UserRangeCheck(const RangeTable& table, int rangeNumber, const QString& zeroText,
                    const QString& fullText, UserRange& range, QString& message, LabelMarks& marks);

// The widest user range a descriptor allows: zero down to min - 0.05 * max,
// full scale up to 1.05 * max.
double LowestZero(const RangeDescriptor& range);
double HighestFull(const RangeDescriptor& range);

}  // namespace kv
