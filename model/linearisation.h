#pragma once
// The linearisation tables held in a module. Table 1 gives, for each hundredth of
// the output, the input position in ten-thousandths of the input span; table C
// gives the thermocouple voltage at 0..50 °C in tenths of an input count. Each
// table is closed by a 16-bit checksum stored after its last used point.

#include "model/settings_set.h"

#include <QString>
#include <array>

namespace kv {

constexpr int Table1LastUsed = 100;  // checksum at point 101
constexpr int TableCLastUsed = 50;   // checksum at point 51; point 52 unused
constexpr qint32 Table1FullScale = 10000;

using Table1Data = std::array<qint32, Table1Points>;
using TableCData = std::array<qint32, TableCPoints>;

// Complement of points[0] ^ ... ^ points[lastUsed], low 16 bits (0..65535).
qint32 TableChecksumOf(const qint32* points, int lastUsed);
// Stores that checksum at points[lastUsed + 1].
void TableChecksum(qint32* points, int lastUsed);

// Table 1 for a temperature sensor ("TYPE K", "PT100", ...) over the engineering
// range engZero..engFull in engUnit. Returns the sensor's values at both ends in
// its measured unit (mV or ohms). On failure the table and both ends are untouched.
bool BuildSensorTable(Table1Data& table, double& inputZero, double& inputFull, double engZero,
                      double engFull, const QString& sensorText, const QString& engUnit,
                      QString& message);

// Table C of a thermocouple for the input range inputZero..inputFull (mV), scaled
// by the count difference countA - countB. Point 52 is left as it was.
bool BuildTableC(TableCData& table, double inputZero, double inputFull, const QString& sensorText,
                 QString& message, qint32 countA, qint32 countB);

}  // namespace kv
