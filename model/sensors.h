#pragma once
// Temperature sensor characteristics: thermocouple emf and platinum resistance
// thermometer resistance as functions of the temperature in °C.

#include <QString>

namespace kv {

// Returned in place of a sensor value for a sensor that is not known.
constexpr double SensorFailValue = 50000.0;

enum class SensorKind { Thermocouple, ResistanceThermometer };

struct Sensor {
    SensorKind kind = SensorKind::Thermocouple;
    QChar type;            // thermocouple letter, not checked against the known types
    int nominal = 100;     // resistance thermometer: ohms at 0 °C
    QString measuredUnit;  // "mV" or "ohms"
};

// Reads a sensor from its settings text, in any letter case: a text containing
// "TYPE" is a thermocouple named by its last non-blank character; otherwise one
// containing "PT1000" or "PT100" is a resistance thermometer. False for any other text.
bool SensorFromText(const QString& text, Sensor& sensor);

// Emf in mV with the reference junction at 0 °C, and the type's valid range in °C.
// An unknown type returns SensorFailValue with "? Type:" and the letter, and leaves
// the range untouched. Outside the valid range the nearest piece is extended.
double ThermocoupleEmf(double celsius, QChar type, double& minimum, double& maximum,
                       QString& message);

// Resistance in ohms of a Pt100, or of a Pt1000 when nominal is 1000; the range is
// -200 to 850 °C.
double RtdResistance(double celsius, int nominal, double& minimum, double& maximum);

// The measured value (mV or ohms) of either kind of sensor.
double SensorValue(const Sensor& sensor, double celsius, double& minimum, double& maximum,
                   QString& message);

}  // namespace kv
