#include "model/sensors.h"

#include "model/thermocouple_data.h"

#include <cmath>

namespace kv {

namespace {

// Callendar-Van Dusen coefficients of IEC 60751:2008 (ITS-90).
constexpr double RtdA = 3.9083E-3;
constexpr double RtdB = -5.775E-7;
constexpr double RtdC = -4.183E-12;  // below 0 °C only
constexpr double RtdMinimum = -200.0;
constexpr double RtdMaximum = 850.0;

const EmfPolynomial& PieceFor(const ThermocoupleData& type, double celsius) {
    int piece = 0;
    while (piece + 1 < type.pieceCount && celsius >= type.pieces[piece + 1].from)
        ++piece;
    return type.pieces[piece];
}

// Coefficients are evaluated in double precision: the cryogenic pieces of types
// E and T cancel terms of 1e5 mV, which 32-bit arithmetic turns into errors of
// tens of microvolts and tables that no longer rise.
double Evaluate(const EmfPolynomial& piece, double celsius) {
    double emf = 0.0;
    for (auto c = piece.c.rbegin(); c != piece.c.rend(); ++c)
        emf = emf * celsius + *c;
    if (piece.magneticTerm) {
        const MagneticTerm& k = TypeKMagneticTerm;
        emf += k.a0 * std::exp(k.a1 * (celsius - k.a2) * (celsius - k.a2));
    }
    return emf;
}

}  // namespace

bool SensorFromText(const QString& text, Sensor& sensor) {
    const QString upper = text.trimmed().toUpper();
    if (upper.contains(QLatin1String("TYPE"))) {
        sensor = Sensor{SensorKind::Thermocouple, upper.back(), 0, QStringLiteral("mV")};
        return true;
    }
    if (upper.contains(QLatin1String("PT100"))) {
        const int nominal = upper.contains(QLatin1String("PT1000")) ? 1000 : 100;
        sensor =
            Sensor{SensorKind::ResistanceThermometer, QChar(), nominal, QStringLiteral("ohms")};
        return true;
    }
    return false;
}

double ThermocoupleEmf(double celsius, QChar type, double& minimum, double& maximum,
                       QString& message) {
    message.clear();
    const ThermocoupleData* data = FindThermocouple(type.toUpper());
    if (!data) {
        message = QStringLiteral("? Type:") + type;
        return SensorFailValue;
    }
    minimum = data->minimum;
    maximum = data->maximum;
    if (celsius < data->linearBelow)
        return celsius * TypeBLinearSlope;
    return Evaluate(PieceFor(*data, celsius), celsius);
}

double RtdResistance(double celsius, int nominal, double& minimum, double& maximum) {
    minimum = RtdMinimum;
    maximum = RtdMaximum;
    const double r0 = nominal == 1000 ? 1000.0 : 100.0;
    const double t = celsius;
    double ratio = 1.0 + RtdA * t + RtdB * t * t;
    if (t < 0.0)
        ratio += RtdC * (t - 100.0) * t * t * t;
    return r0 * ratio;
}

double SensorValue(const Sensor& sensor, double celsius, double& minimum, double& maximum,
                   QString& message) {
    if (sensor.kind == SensorKind::ResistanceThermometer) {
        message.clear();
        return RtdResistance(celsius, sensor.nominal, minimum, maximum);
    }
    return ThermocoupleEmf(celsius, sensor.type, minimum, maximum, message);
}

}  // namespace kv
