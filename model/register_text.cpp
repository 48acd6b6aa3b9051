#include "model/register_text.h"

#include "engine/diagnostics.h"
#include "model/module_ranges.h"
#include "model/register_map.h"

namespace kv {

namespace {

constexpr qint32 PulseInputType = 9;  // KV760: the only type that names its pulse registers

bool namedBeforeRanges(const RegisterRow& row) {
    switch (row.role) {
    case RegRole::Value:
    case RegRole::Reading16:
    case RegRole::TablePart:
    case RegRole::FileNamePart:
        return true;
    case RegRole::PulseValue:
        return RegVal.Mod_Type == PulseInputType;
    case RegRole::SpanLimit:
    case RegRole::MapLimit:
    case RegRole::ErrorBytes:
        break;
    }
    return false;
}

bool namedAfterRanges(const RegisterRow& row) {
    return row.role == RegRole::MapLimit || row.role == RegRole::ErrorBytes;
}

QString describe(const RegisterRow& row, int id) {
    const QString text = QLatin1String(row.description);
    switch (row.role) {
    case RegRole::TablePart:
        return text + QString::number(id - 15);
    case RegRole::FileNamePart:
        return text + QString::number(id);
    default:
        return text;
    }
}

const RegisterRow* rowAt(int address, bool (*wanted)(const RegisterRow&)) {
    for (const RegisterRow& row : AllRegisters())
        if (wanted(row) && row.field.address(RegAdd) == address)
            return &row;
    return nullptr;
}

bool insideRangeSpan(int address) {
    return RegAdd.Rng_First >= 0 && address >= RegAdd.Rng_First && address <= RegAdd.Rng_Last;
}

void logAddress(const char* procedure, int address) {
    DebugMessage(DiagGeneral, QLatin1String(procedure),
                 QStringLiteral(" Address") + QString::number(address));
}

QString valueText(const RegisterRow& row) {
    const double value = row.field.value(RegVal);
    return row.field.width() == RegWidth::Single ? QString::number(value, 'g', 7)
                                                 : QString::number(qint64(value));
}

}  // namespace

QString GetRegDescription(int address, int id) {
    if (address == -1)
        return QStringLiteral("Address Not Defined");
    if (const RegisterRow* row = rowAt(address, namedBeforeRanges))
        return describe(*row, id);
    if (insideRangeSpan(address))
        return GetRangeDescription(address);
    if (const RegisterRow* row = rowAt(address, namedAfterRanges))
        return describe(*row, id);
    logAddress("GetRegDescription", address);
    return QStringLiteral("Address") + QString::number(address);
}

QString GetRangeDescription(int address) {
    const QString unknown = QStringLiteral("Unknown Range at ") + QString::number(address);
    if (!insideRangeSpan(address)) {
        logAddress("GetRangeDescription", address);
        return unknown;
    }
    const RangeRegister info = GetRangeInfo(address, ModuleMap);
    if (info.channel == 0)
        return unknown;
    return ChannelPrefix(info.channel) + ProgramRangeTable(info.channel)[info.range].description;
}

RegisterValueText RegValueText(int address) {
    RegisterValueText result;
    const RegisterRow* row = address >= 0 ? FindRegister(RegAdd, address) : nullptr;
    if (!row || row->access == RegAccess::Hidden) {
        result.text = QString::number(address) + QStringLiteral("??");
        return result;
    }
    result.text = valueText(*row);
    result.writable = row->access == RegAccess::Writable;
    result.kind = row->field.width() == RegWidth::Single ? FloatValue : IntegerValue;
    return result;
}

}  // namespace kv
