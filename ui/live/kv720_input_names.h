#pragma once
// Names of a KV720 input: the sensor (or shape) and the measuring unit coded
// in Type_In_Unit, each code stored plus one, the unit in the high hexadecimal
// digit and the sensor or shape in the low one.

#include <QString>

namespace kv {

struct Kv720InputNames {
    QString sensor;  // "Type K", "pt100.", "Linear", ...; empty for a code not in the list
    QString unit;    // "°C", "mV", "ohm", ...; empty for a code not in the list
};

// Input type (TypInput) 1..8 and Type_In_Unit; another input type gives
// "Shape TYPE ?" and "MU TYPE ?".
Kv720InputNames Kv720Names(int inputType, qint16 typeInUnit);

}  // namespace kv
