#pragma once
// Reference functions of the letter-designated thermocouple types, as data.

#include <QChar>
#include <array>

namespace kv {

// One polynomial piece of a reference function, valid from `from` °C up to the
// next piece. Coefficients c0..c14; unused high orders stay zero.
struct EmfPolynomial {
    double from;
    std::array<double, 15> c;
    bool magneticTerm;  // type K above 0 °C adds a0 * exp(a1 * (t - a2)^2)
};

struct ThermocoupleData {
    char letter;
    double minimum;  // valid range in °C
    double maximum;
    double linearBelow;  // below this the emf is the straight line of type B
    int pieceCount;
    std::array<EmfPolynomial, 3> pieces;
};

// Coefficients of the type K magnetic-ordering term.
struct MagneticTerm {
    double a0;
    double a1;
    double a2;
};
extern const MagneticTerm TypeKMagneticTerm;

// Type B below its first break point: t / 50 * 0.003 mV.
constexpr double TypeBLinearSlope = 0.003 / 50.0;

// nullptr for a letter that names no supported type.
const ThermocoupleData* FindThermocouple(QChar letter);

}  // namespace kv
