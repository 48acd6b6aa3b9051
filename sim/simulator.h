#pragma once
// The module simulator: one module on a programming adapter, answering the
// program over a pseudo-terminal from its own thread. Tests run it in-process;
// kv700-sim runs it as a program. Every method is safe to call from any thread
// while the simulator runs.

#include "sim/sim_faults.h"
#include "sim/sim_models.h"

#include <QByteArray>
#include <QString>

#include <memory>
#include <optional>
#include <vector>

namespace kv::sim {

struct SimOptions {
    ModuleIdentity module;
    int adapter = 0;           // 1: answers only after priming blocks (the KV705 type)
    int adapterDecayMs = 100;  // how long a type-1 adapter keeps sending after its self-test
    SimFaults faults;
    std::optional<qint32> trimVerdict;  // forced Minor_Cal verdict
    std::optional<qint32> heldReading;  // Input_Reading held still instead of moving
    quint32 seed = 1;                   // for the noise bytes
};

struct SimLogEntry {
    enum Kind { Request, Ignored };
    enum Outcome { Answered, Dropped, Dead };
    Kind kind = Request;
    qint64 sequence = 0;  // running number, kept when old entries leave a full log
    qint64 msec = 0;      // since the simulator started
    // Request: the frame as decoded, and what became of its reply.
    char command = 0;
    int busId = 0;
    int address = 0;
    QByteArray data;
    Outcome outcome = Answered;
    // Ignored: bytes on the line that formed no valid frame.
    QByteArray bytes;
};

class Simulator {
public:
    explicit Simulator(SimOptions options = {});
    ~Simulator();
    Simulator(const Simulator&) = delete;
    Simulator& operator=(const Simulator&) = delete;

    // Opens the pseudo-terminal and starts answering.
    bool start(QString& error);
    // Stops the thread, removes the port link and closes the pseudo-terminal.
    void stop();
    bool isRunning() const;

    QString slavePath() const;
    // Makes the simulator COM port `port` through the program's port folder.
    bool publishAsPort(int port, QString& error);
    QString portLinkPath() const;

    // The most recent entries (up to 10000; older ones are dropped in blocks).
    std::vector<SimLogEntry> log() const;
    int frameCount() const;    // valid request frames received
    int ignoredBytes() const;  // bytes that formed no valid frame
    int primingBytes() const;  // priming bytes received

    ModuleIdentity module() const;
    // What a read of `address` would answer now (bus ID 16 for multi-part registers).
    qint32 registerValue(int address) const;
    // Sets a register as the factory would, read-only ones included; measured values
    // follow holdReading instead, multi-part registers their own setters.
    void setRegisterValue(int address, qint32 value);
    QByteArray fileName() const;  // the 20 characters of the stored file name
    std::vector<qint32> table1() const;
    std::vector<qint32> tableC() const;
    std::vector<int> calErrors() const;  // signed bytes
    void setCalErrors(const std::vector<int>& errors);

    // Faults and module changes while running; frame numbers restart at 1.
    void setFaults(const SimFaults& faults);
    SimFaults faults() const;
    // Puts another module on the adapter at once.
    void swapModule(const ModuleIdentity& identity);
    void setTrimVerdict(std::optional<qint32> verdict);
    void holdReading(std::optional<qint32> reading);
    // Holds the port as another program would; the program's open finds it busy.
    bool setPortBusy(bool busy, QString& error);

private:
    struct State;
    std::unique_ptr<State> d;
};

}  // namespace kv::sim
