#include "model/linearisation.h"

#include "model/sensors.h"
#include "model/temperature_units.h"

#include <cmath>

namespace kv {

namespace {

constexpr double MinimumSpan = 30.0;  // °C
// Engineering values come from 32-bit fields: a limit typed exactly (1123.15 K)
// may arrive a few hundred-thousandths of a degree beyond it.
constexpr double LimitTolerance = 1e-3;  // °C
constexpr double FirstPointFloor = -1000.0;
constexpr double WirePointMaximum = 65535.0;  // a point travels as 16 bits

bool Fail(QString& message, const QString& text) {
    message = text;
    return false;
}

QString Shown(double value, const QString& unit) {
    return QString::number(value) + QLatin1Char(' ') + unit;
}

// "FAIL TYPE K maximum is:1372 degC", the limit shown in the user's unit.
bool LimitFailure(QString& message, const QString& sensorText, const QString& which, double limit,
                  const QString& unit) {
    double shown = 0.0;
    DegC_ToDegEng(shown, unit, limit, message);
    return Fail(message, QStringLiteral("FAIL ") + sensorText + which + Shown(shown, unit));
}

}  // namespace

qint32 TableChecksumOf(const qint32* points, int lastUsed) {
    quint32 sum = 0;
    for (int i = 0; i <= lastUsed; ++i)
        sum ^= quint32(points[i]);
    return qint32(~sum & 0xFFFFu);
}

void TableChecksum(qint32* points, int lastUsed) {
    points[lastUsed + 1] = TableChecksumOf(points, lastUsed);
}

bool BuildSensorTable(Table1Data& table, double& inputZero, double& inputFull, double engZero,
                      double engFull, const QString& sensorText, const QString& engUnit,
                      QString& message) {
    Sensor sensor;
    if (!SensorFromText(sensorText, sensor))
        return Fail(message, QStringLiteral("FAIL engineering unit not found"));
    if (engFull < engZero)
        return Fail(message, QStringLiteral("FAIL input must be rising"));

    double zero = 0.0;
    double full = 0.0;
    if (!DegEngToDegC(engZero, engUnit, zero, message))
        return false;
    if (!DegEngToDegC(engFull, engUnit, full, message))
        return false;
    const double span = full - zero;
    if (span < MinimumSpan - LimitTolerance) {
        double shown = 0.0;
        DegC_SpanToDegEng(shown, engUnit, MinimumSpan, message);
        return Fail(message, QStringLiteral("FAIL minimum span is ") + Shown(shown, engUnit));
    }

    double minimum = 0.0;
    double maximum = 0.0;
    const double valueZero = SensorValue(sensor, zero, minimum, maximum, message);
    if (valueZero == SensorFailValue)
        return false;
    if (zero < minimum - LimitTolerance)
        return LimitFailure(message, sensorText, QStringLiteral(" minimum is:"), minimum, engUnit);
    if (full > maximum + LimitTolerance)
        return LimitFailure(message, sensorText, QStringLiteral(" maximum is:"), maximum, engUnit);
    const double valueFull = SensorValue(sensor, full, minimum, maximum, message);

    Table1Data built = table;
    double previous = FirstPointFloor;
    for (int i = 0; i <= Table1LastUsed; ++i) {
        const double t = zero + i * span / Table1LastUsed;
        const double x = SensorValue(sensor, t, minimum, maximum, message);
        const double point =
            std::nearbyint((x - valueZero) / (valueFull - valueZero) * Table1FullScale);
        if (point < previous)
            return Fail(message, QStringLiteral("FAIL Table output MUST always increase in value"));
        built[i] = qint32(point);
        previous = point;
    }
    TableChecksum(built.data(), Table1LastUsed);
    table = built;
    inputZero = valueZero;
    inputFull = valueFull;
    return true;
}

bool BuildTableC(TableCData& table, double inputZero, double inputFull, const QString& sensorText,
                 QString& message, qint32 countA, qint32 countB) {
    Sensor sensor;
    if (!SensorFromText(sensorText, sensor) || sensor.kind != SensorKind::Thermocouple)
        return Fail(message, QStringLiteral("FAIL ") + sensorText + QStringLiteral(" not found"));
    if (inputFull == inputZero)
        return Fail(message, QStringLiteral("FAIL TableC input range is zero"));

    const double counts = double(countA) - double(countB);
    TableCData built = table;
    double previous = FirstPointFloor;
    for (int t = 0; t <= TableCLastUsed; ++t) {
        double minimum = 0.0;
        double maximum = 0.0;
        const double emf = ThermocoupleEmf(t, sensor.type, minimum, maximum, message);
        if (emf == SensorFailValue)
            return false;
        const double point = std::nearbyint(emf / (inputFull - inputZero) * counts * 10.0);
        if (point < previous)
            return Fail(message,
                        QStringLiteral("FAIL TableC output MUST always increase in value"));
        if (point > WirePointMaximum)
            return Fail(message, QStringLiteral("FAIL TableC output MUST be below 65536"));
        built[t] = qint32(point);
        previous = point;
    }
    TableChecksum(built.data(), TableCLastUsed);
    table = built;
    return true;
}

}  // namespace kv
