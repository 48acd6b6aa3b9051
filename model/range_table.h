#pragma once
// Range descriptors and the four program-wide range tables (Input 1, Output 1,
// Input 2, Output 2), rebuilt whenever a module is identified.

#include <QString>
#include <array>

namespace kv {

struct RangeDescriptor {
    qint32 countMin = 0;  // module's raw count at the range minimum
    qint32 countMax = 0;  // module's raw count at the range maximum
    float minimum = 0.0f;
    float maximum = 20.0f;
    QString unit = QStringLiteral("??");
    QString description = QStringLiteral("No Function");
};

constexpr int RangeEntries = 17;  // range numbers 0..16
using RangeTable = std::array<RangeDescriptor, RangeEntries>;

enum RangeChannel { Input1 = 1, Output1 = 2, Input2 = 3, Output2 = 4 };

// The program-wide table of a channel (1..4); any other channel yields Input 1's.
RangeTable& ProgramRangeTable(int channel);

}  // namespace kv
