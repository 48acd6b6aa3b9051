#include "ui/live/kv720_input_names.h"

#include <QStringList>

namespace kv {

namespace {

struct InputCodes {
    int firstType;
    int lastType;
    const char* shapes;  // by shape code, "|"-separated
    const char* units;   // by unit code
};

// The settings editor's lists for each input type, in list order.
constexpr InputCodes codes[] = {
    {1, 1, "Linear|Table", "mV"},
    {2, 2, "Type B|Type E|Type J|Type K|Type N|Type R|Type S|Type T", "°C|°F|°K"},
    {3, 5, "pt100.|pt1000.", "°C|°F|°K"},
    {6, 6, "Linear|Table", "ohm|kohm"},
    {7, 7, "Linear|Table", "%Pot"},
    {8, 8, "Linear|Table", "mV"},
};

QString entry(const char* list, int code) {
    const QStringList entries = QString::fromUtf8(list).split(QLatin1Char('|'));
    return code >= 0 && code < entries.size() ? entries[code] : QString();
}

}  // namespace

Kv720InputNames Kv720Names(int inputType, qint16 typeInUnit) {
    const int unitCode = ((typeInUnit >> 4) & 0xF) - 1;
    const int shapeCode = (typeInUnit & 0xF) - 1;
    for (const InputCodes& row : codes)
        if (inputType >= row.firstType && inputType <= row.lastType)
            return {entry(row.shapes, shapeCode), entry(row.units, unitCode)};
    return {QStringLiteral("Shape TYPE ?"), QStringLiteral("MU TYPE ?")};
}

}  // namespace kv
