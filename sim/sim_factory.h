#pragma once
// The state a simulated module leaves the factory in: calibration of every
// range, the factory calibration of the KV720 and KV760 sources, and user
// settings that make the live display show something sensible.

#include "sim/sim_models.h"

#include <QByteArray>
#include <array>
#include <vector>

namespace kv::sim {

constexpr int RegisterCount = 256;

struct FactoryImage {
    std::array<qint32, RegisterCount> registers{};
    QByteArray fileName;         // 20 characters
    std::vector<qint32> table1;  // 102 points, checksum at 101
    std::vector<qint32> tableC;  // 53 points, checksum at 51
    std::vector<int> calErrors;  // 84 signed bytes
};

FactoryImage FactoryState(const ModuleIdentity& identity);

// The checksum the program expects after the used points 0..last of a table.
qint32 TableCheck(const std::vector<qint32>& points, int last);

}  // namespace kv::sim
