#include "drivers/user_cal_step.h"

#include "model/entry_user_cal.h"
#include "model/module_ranges.h"
#include "model/range_table.h"

namespace kv {

const UserRange Output1Range{
    Output1,
    &RegMap::Out_Rng1,
    &SettingsSet::Out1RngTyp,
    &SettingsSet::Out1EngUnt,
    {&RegMap::Usr_Out1_Z, &RegMap::Usr_Out1_F, &SettingsSet::Out1EngZro, &SettingsSet::Out1EngFul,
     "Out 1"},
    {&RegMap::Sig_Lmt1_Z, &RegMap::Sig_Lmt1_F, &SettingsSet::Out1SigLmZ, &SettingsSet::Out1SigLmF,
     "Limit 1"},
};

const UserRange Output2Range{
    Output2,
    &RegMap::Out_Rng2,
    &SettingsSet::Out2RngTyp,
    &SettingsSet::Out2EngUnt,
    {&RegMap::Usr_Out2_Z, &RegMap::Usr_Out2_F, &SettingsSet::Out2EngZro, &SettingsSet::Out2EngFul,
     "Out 2"},
    {&RegMap::Sig_Lmt2_Z, &RegMap::Sig_Lmt2_F, &SettingsSet::Out2SigLmZ, &SettingsSet::Out2SigLmF,
     "Limit 2"},
};

namespace {

bool isRow(qint32 row) {
    return row >= 0 && row < RangeEntries;
}

void readPair(const RangeDescriptor& row, const UserPair& pair, const RegMap& values,
              SettingsSet& settings, QString& unit, QString& warning) {
    UserCalToEng(row, values.*pair.zeroCount, values.*pair.fullCount, settings.*pair.zero,
                 settings.*pair.full, unit, warning, QLatin1String(pair.label));
}

}  // namespace

bool CalibratePair(const UserRange& range, const UserPair& pair, const SettingsSet& settings,
                   DriverWork& work, QString& text) {
    const qint32 row = settings.*range.rangeField;
    if (!isRow(row)) {
        // The channel prefix without its separator names the channel.
        text = QStringLiteral("Invalid ") + ChannelPrefix(range.channel).chopped(2) +
               QStringLiteral(" Range");
        return false;
    }
    return UsrCalRangeSet(ProgramRangeTable(range.channel)[row], settings.*pair.zero,
                          settings.*pair.full, work.DrvOutZ, work.DrvOutF, text);
}

bool Output1Calibration(StepContext& step, QString& text) {
    return CalibratePair(Output1Range, Output1Range.scale, step.settings, step.work, text);
}

bool Limit1Calibration(StepContext& step, QString& text) {
    return CalibratePair(Output1Range, Output1Range.limits, step.settings, step.work, text);
}

bool Output2Calibration(StepContext& step, QString& text) {
    return CalibratePair(Output2Range, Output2Range.scale, step.settings, step.work, text);
}

bool Limit2Calibration(StepContext& step, QString& text) {
    return CalibratePair(Output2Range, Output2Range.limits, step.settings, step.work, text);
}

bool ReadUserRange(const UserRange& range, const RegMap& values, SettingsSet& settings,
                   QString& warning) {
    const qint32 row = values.*range.rangeRegister;
    settings.*range.rangeField = row;
    if (!isRow(row)) {
        settings.*range.scale.zero = 0.0f;
        settings.*range.scale.full = 0.0f;
        return false;
    }
    const RangeDescriptor& descriptor = ProgramRangeTable(range.channel)[row];
    QString unit;
    readPair(descriptor, range.scale, values, settings, unit, warning);
    if (range.limits.label)
        readPair(descriptor, range.limits, values, settings, unit, warning);
    if (range.unit)
        settings.*range.unit = unit;
    return true;
}

}  // namespace kv
