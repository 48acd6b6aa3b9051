#include "drivers/kv720_codes.h"

namespace kv {

namespace {

constexpr int MaxShapes = 8;
constexpr int MaxUnits = 3;

struct InputCodes {
    qint32 firstType;
    qint32 lastType;
    const char* shapes[MaxShapes];
    const char* units[MaxUnits];
};

// clang-format off
const InputCodes inputCodes[] = {
    {1, 1, {"Linear", "Table"}, {"mV"}},
    {8, 8, {"Linear", "Table"}, {"mV"}},
    {2, 2, {"Type B", "Type E", "Type J", "Type K", "Type N", "Type R", "Type S", "Type T"},
           {"°C", "°F", "°K"}},
    {3, 5, {"pt100.", "pt1000."}, {"°C", "°F", "°K"}},
    {6, 6, {"Linear", "Table"}, {"ohm", "kohm"}},
    {7, 7, {"Linear", "Table"}, {"%Pot"}},
};

const char* const inputTypeTexts[] = {
    "mV Transmitter", "Thermocouple Transmitter", "RTDT 3W Transmitter", "RTDT 4W Transmitter",
    "RTDT 2W Transmitter", "Resistance 2W Transmitter", "Potentiometer",
    "Strain Gauge Transmitter",
};
// clang-format on

const InputCodes* codesOf(qint32 inputType) {
    for (const InputCodes& codes : inputCodes)
        if (inputType >= codes.firstType && inputType <= codes.lastType)
            return &codes;
    return nullptr;
}

QString textAt(const char* const* texts, int count, int code) {
    if (code < 0 || code >= count || !texts[code])
        return {};
    return QString::fromUtf8(texts[code]);
}

}  // namespace

QString Kv720InputTypeText(qint32 inputType) {
    if (inputType < Kv720MilliVolt || inputType > Kv720StrainGauge)
        return {};
    return QLatin1String(inputTypeTexts[inputType - 1]);
}

QString Kv720ShapeText(qint32 inputType, int code) {
    const InputCodes* codes = codesOf(inputType);
    return codes ? textAt(codes->shapes, MaxShapes, code) : QStringLiteral("Shape TYPE ?");
}

QString Kv720UnitText(qint32 inputType, int code) {
    const InputCodes* codes = codesOf(inputType);
    return codes ? textAt(codes->units, MaxUnits, code) : QStringLiteral("MU TYPE ?");
}

qint32 Kv720TypeInUnit(int unitCode, int shapeCode) {
    return (unitCode + 1) * 16 + (shapeCode + 1);
}

int Kv720UnitCode(qint32 typeInUnit) {
    return ((typeInUnit >> 4) & 0xF) - 1;
}

int Kv720ShapeCode(qint32 typeInUnit) {
    return (typeInUnit & 0xF) - 1;
}

}  // namespace kv
