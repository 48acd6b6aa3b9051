#include "model/temperature_units.h"

#include <algorithm>

namespace kv {

namespace {

// engineering = celsius * numerator / denominator + offset
struct TemperatureUnit {
    char letter;
    double numerator;
    double denominator;
    double offset;
};

const TemperatureUnit Units[] = {
    {'C', 1.0, 1.0, 0.0},
    {'F', 9.0, 5.0, 32.0},
    {'K', 1.0, 1.0, 273.15},
};

const TemperatureUnit* FindUnit(const QString& unit) {
    const QString trimmed = unit.trimmed();
    if (trimmed.isEmpty())
        return nullptr;
    const QChar last = trimmed.back();
    const auto* end = std::end(Units);
    const auto* found = std::find_if(std::begin(Units), end, [last](const TemperatureUnit& u) {
        return last == QLatin1Char(u.letter);
    });
    return found == end ? nullptr : found;
}

}  // namespace

bool DegC_ToDegEng(double& value, const QString& unit, double celsius, QString& message) {
    if (!DegC_SpanToDegEng(value, unit, celsius, message))
        return false;
    value += FindUnit(unit)->offset;
    return true;
}

bool DegEngToDegC(double value, const QString& unit, double& celsius, QString& message) {
    message.clear();
    const TemperatureUnit* u = FindUnit(unit);
    if (!u) {
        message = QStringLiteral("DegEngToDegC ? EngUnt ") + unit;
        return false;
    }
    celsius = (value - u->offset) * u->denominator / u->numerator;
    return true;
}

bool DegC_SpanToDegEng(double& value, const QString& unit, double celsius, QString& message) {
    message.clear();
    const TemperatureUnit* u = FindUnit(unit);
    if (!u) {
        message = QStringLiteral("DegC_ToDegEng: ? EngUnt ") + unit;
        return false;
    }
    value = celsius * u->numerator / u->denominator;
    return true;
}

}  // namespace kv
