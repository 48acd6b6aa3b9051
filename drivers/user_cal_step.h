#pragma once
// The user calibration of the range-table models: a range register, the range
// field of the settings record, and one or two pairs of user counts (the
// range's zero and full scale, and the signal limits) with the engineering
// fields they stand for. Programming turns a pair of fields into the counts the
// next two writes carry; reading turns the counts back.

#include "drivers/driver_descriptor.h"

#include <QString>

namespace kv {

struct UserPair {
    qint32 RegMap::*zeroCount;
    qint32 RegMap::*fullCount;
    float SettingsSet::*zero;
    float SettingsSet::*full;
    const char* label;  // names the pair in warnings: "Out 1", "Limit 1"
};

struct UserRange {
    int channel;  // RangeChannel
    qint32 RegMap::*rangeRegister;
    qint32 SettingsSet::*rangeField;
    QString SettingsSet::*unit;  // nullptr: the unit is not kept
    UserPair scale;
    UserPair limits;  // label nullptr: the channel has no signal limits
};

extern const UserRange Output1Range;  // Out_Rng1 and its user counts and signal limits
extern const UserRange Output2Range;

// The pair's fields, in the units of the row that the record's range field
// names in the channel's program-wide range table, into DrvOutZ and DrvOutF.
// False with the reason otherwise.
bool CalibratePair(const UserRange& range, const UserPair& pair, const SettingsSet& settings,
                   DriverWork& work, QString& text);

// Step hooks: the output pairs of the record into DrvOutZ and DrvOutF.
bool Output1Calibration(StepContext& step, QString& text);
bool Limit1Calibration(StepContext& step, QString& text);
bool Output2Calibration(StepContext& step, QString& text);
bool Limit2Calibration(StepContext& step, QString& text);

// The range field and the engineering pairs back from the values read. A pair
// whose counts do not convert reads as zeros with a warning ("Out 1 ..., ").
// False when the range register names no row; the scale pair is then zero.
bool ReadUserRange(const UserRange& range, const RegMap& values, SettingsSet& settings,
                   QString& warning);

}  // namespace kv
