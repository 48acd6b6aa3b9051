#pragma once
// One simulated module: 256 registers of its family, the multi-part registers
// (file name, tables, calibration errors) addressed by bus ID, the live
// measurements, and the minor trim.

#include "model/register_map.h"
#include "sim/sim_factory.h"
#include "sim/sim_frame.h"
#include "sim/sim_models.h"

#include <QByteArray>
#include <chrono>
#include <memory>
#include <optional>
#include <vector>

namespace kv::sim {

class SimModule {
public:
    explicit SimModule(const ModuleIdentity& identity);

    struct Answer {
        QByteArray data;  // 8 characters
        char status = StatusDone;
    };
    // Carries out a read or a write; the answer holds the register afterwards.
    Answer handle(const Request& request);

    const ModuleIdentity& identity() const { return identity_; }
    int family() const { return family_; }

    // The value a read answers now: multi-part registers as their first part.
    qint32 value(int address) const;
    void setValue(int address, qint32 value);

    QByteArray fileName() const { return image_.fileName; }
    std::vector<qint32> table1() const { return image_.table1; }
    std::vector<qint32> tableC() const { return image_.tableC; }
    std::vector<int> calErrors() const { return image_.calErrors; }
    void setCalErrors(const std::vector<int>& errors);

    void setTrimVerdict(std::optional<qint32> verdict) { trimVerdict_ = verdict; }
    void holdReading(std::optional<qint32> reading) { heldReading_ = reading; }

    // A different module put on the adapter, keeping the test settings.
    std::unique_ptr<SimModule> replacedBy(const ModuleIdentity& identity) const;

private:
    enum class Part { None, FileName, Table1, TableC, CalErrors };
    Part partAt(int address) const;
    bool isLive(int address) const;
    bool isReadOnly(int address) const;
    bool isSixteenBit(int address) const;

    Answer readPart(Part part, int busId) const;
    Answer writePart(Part part, int busId, const QByteArray& data);
    void trim(qint32 code);

    // Stored registers; an address the family lacks reads 0 and takes nothing.
    qint32 reg(int address) const;
    void setReg(int address, qint32 value);

    qint32 reading() const;
    qint32 liveValue(int address) const;
    double seconds() const;

    ModuleIdentity identity_;
    int family_;
    RegMap map_;
    FactoryImage image_;
    std::chrono::steady_clock::time_point born_;
    std::optional<qint32> trimVerdict_;
    std::optional<qint32> heldReading_;
};

}  // namespace kv::sim
