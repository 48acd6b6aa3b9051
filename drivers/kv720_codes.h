#pragma once
// The KV720's input types and the shape and unit codes held in its "Type In
// Unit" register: (unit code + 1) * 16 + (shape code + 1).

#include <QString>

namespace kv {

enum Kv720InputType : qint32 {
    Kv720MilliVolt = 1,
    Kv720Thermocouple = 2,
    Kv720Rtd3Wire = 3,
    Kv720Rtd4Wire = 4,
    Kv720Rtd2Wire = 5,
    Kv720Resistance = 6,
    Kv720Potentiometer = 7,
    Kv720StrainGauge = 8,
};

// Bits of the control flag word (Flag_A).
enum Kv720FlagBit {
    Kv720OffsetBit = 0,       // offset direction chosen by the input calibration
    Kv720ResponseBit = 1,     // the response choice shown as "Slow"
    Kv720LimitsBit = 2,       // signal limits on
    Kv720ReverseBit = 3,      // reverse action
    Kv720VoltageBit = 4,      // the excitation is a voltage source
    Kv720HighBandBit = 5,     // the excitation is in its high band
    Kv720BurnOutBit = 6,      // thermocouple burn-out detection ...
    Kv720BurnOutDownBit = 7,  // ... down scale
};
// Bits of the input channel register (in_ch).
enum Kv720ChannelBit { Kv720DifferentialBit = 2, Kv720RemoteBit = 7 };

constexpr qint32 Kv720UntrimmedGain =
    10000;  // Gain_Factor of a module not trimmed since programming

// The settings window's name of an input type; "" outside 1..8.
QString Kv720InputTypeText(qint32 inputType);
// Shape and unit texts of a code; "" for a code not offered by the type,
// "Shape TYPE ?" and "MU TYPE ?" for a type outside 1..8.
QString Kv720ShapeText(qint32 inputType, int code);
QString Kv720UnitText(qint32 inputType, int code);
// The register value of a unit and shape code pair.
qint32 Kv720TypeInUnit(int unitCode, int shapeCode);
// The codes in a register value (-1 when the digit is 0).
int Kv720UnitCode(qint32 typeInUnit);
int Kv720ShapeCode(qint32 typeInUnit);

}  // namespace kv
