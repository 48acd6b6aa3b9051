#include "model/register_values.h"

#include "engine/diagnostics.h"
#include "model/codec.h"
#include "model/module_types.h"

namespace kv {

std::array<qint16, 4> CalErrors{};
QByteArray LastUnknownData;

namespace {

constexpr int DataLength = 8;
constexpr int PointDigits = 4;
constexpr int ByteDigits = 2;

ModuleCaptionHandler captionHandler;

const QString updateTag = QStringLiteral("UpdateRegValue");

void logFailure(const QString& text) {
    DebugMessage(DiagGeneral, updateTag, text);
}

QByteArray part(const QByteArray& data, int index, int digits) {
    return data.mid(index * digits, digits);
}

bool decode16(int address, const QByteArray& data, qint16& value) {
    if (WireToInt(data, value))
        return true;
    logFailure(
        QStringLiteral("Overflow Address %1 Data %2").arg(address).arg(QString::fromLatin1(data)));
    return false;
}

bool storeValue(const RegisterRow& row, int address, const QByteArray& data) {
    switch (row.field.width()) {
    case RegWidth::Long:
        row.field.storeLong(RegVal, WireToLong(data));
        return false;
    case RegWidth::Single:
        row.field.storeSingle(RegVal, WireToSingle(data));
        return false;
    case RegWidth::Int:
        break;
    }
    qint16 value = 0;
    if (!decode16(address, data, value))
        return true;
    row.field.storeInt(RegVal, value);
    if (row.field.is(&RegMap::TypInput) && captionHandler)
        captionHandler(ModelText(RegVal.Mod_Type, RegVal.TypInput) + QLatin1Char(' '));
    return false;
}

bool storeReading(const RegisterRow& row, int address, const QByteArray& data) {
    qint16 value = 0;
    if (!decode16(address, data, value))
        return true;
    row.field.storeLong(RegVal, value);
    return false;
}

template <std::size_t N>
bool storeTablePart(qint32& lastId, std::array<qint32, N>& points, const PartIds& ids, int id,
                    const QByteArray& data) {
    // A part may carry the last two points (the last used one and the checksum)
    // but never reach past the end of the table.
    const int first = id - ids.first;
    if (id < ids.first || first + 1 >= int(N)) {
        logFailure(QStringLiteral("Update Table wrong ID:") + QString::number(id));
        return true;
    }
    lastId = id;
    points[first] = WireToLong(part(data, 0, PointDigits));
    points[first + 1] = WireToLong(part(data, 1, PointDigits));
    return false;
}

bool storeFileNamePart(int id, const QByteArray& data) {
    const int first = id - FileNameIds.first;
    if (id < FileNameIds.first || id > FileNameIds.last || first % FileNameIds.step != 0) {
        logFailure(QStringLiteral("Update File name wrong ID:") + QString::number(id));
        return true;
    }
    if (RegVal.File_Text.size() != FileNameLength)
        RegVal.File_Text = QString(FileNameLength, QLatin1Char(' '));
    RegVal.File_Name = id;
    for (int i = 0; i < FileNameIds.step; ++i)
        RegVal.File_Text[first + i] = QChar(WireToLong(part(data, i, ByteDigits)));
    return false;
}

void storeErrorBytes(int id, const QByteArray& data) {
    RegVal.Cal_Errors = id;
    for (int i = 0; i < int(CalErrors.size()); ++i)
        CalErrors[i] = qint16(WireToLong(part(data, i, ByteDigits)));
}

}  // namespace

bool UpdateRegValue(int address, const QByteArray& data, int id, int status) {
    if (status != 0)
        return true;
    if (data.size() != DataLength) {
        logFailure(QStringLiteral("Data length Address %1 Data %2")
                       .arg(address)
                       .arg(QString::fromLatin1(data)));
        return true;
    }
    const RegisterRow* row = FindRegister(RegAdd, address);
    if (!row) {
        LastUnknownData = data;
        return false;
    }
    switch (row->role) {
    case RegRole::Value:
    case RegRole::PulseValue:
        return storeValue(*row, address, data);
    case RegRole::Reading16:
        return storeReading(*row, address, data);
    case RegRole::TablePart:
        return row->field.is(&RegMap::Table1)
                   ? storeTablePart(RegVal.Table1, RegVal.Table1_Pts, Table1Ids, id, data)
                   : storeTablePart(RegVal.TableC, RegVal.TableC_Pts, TableCIds, id, data);
    case RegRole::FileNamePart:
        return storeFileNamePart(id, data);
    case RegRole::ErrorBytes:
        storeErrorBytes(id, data);
        return false;
    case RegRole::SpanLimit:
    case RegRole::MapLimit:
        break;
    }
    return true;
}

void SetModuleCaptionHandler(ModuleCaptionHandler handler) {
    captionHandler = std::move(handler);
}

QString EngUnitText(const RegMap& values) {
    QString text;
    for (qint32 code : {values.Eng_Unit1, values.Eng_Unit2, values.Eng_Unit3, values.Eng_Unit4})
        text += code >= 32 && code <= 254 ? QChar(code) : QLatin1Char('?');
    return text;
}

}  // namespace kv
