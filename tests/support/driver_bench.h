#pragma once
// A simulated module on a private COM port, identified by the program, with a
// settings window's run (ModuleRun) to program and read it one tick at a time,
// and the frames the module received written out as expected lists.

#include "drivers/module_run.h"
#include "engine/diagnostics.h"
#include "engine/module_connection.h"
#include "model/register_map.h"
#include "sim/simulator.h"

#include <QTemporaryDir>
#include <QtTest>

#include <memory>
#include <vector>

namespace drvbench {

constexpr int Port = 7;

// One request as the module received it.
struct Frame {
    char command;
    int busId;
    int address;
    bool operator==(const Frame& other) const {
        return command == other.command && busId == other.busId && address == other.address;
    }
};

inline QString describe(const Frame& frame) {
    return QStringLiteral("%1 %2 id %3").arg(frame.command).arg(frame.address).arg(frame.busId);
}

// Address of a register by its member name in a map; -1 when the name is unknown.
inline int addressOf(const char* name, int map) {
    for (const kv::RegisterRow& row : kv::AllRegisters())
        if (qstrcmp(row.field.name(), name) == 0)
            return row.addressIn(map);
    return -1;
}

// Builds an expected frame list in the notation of an order table.
class Expect {
public:
    explicit Expect(int map) : map_(map) {}
    // R_CB
    Expect& read(const char* name, int busId = 16) {
        frames_.push_back({'R', busId, at(name)});
        return *this;
    }
    // W_DataOK: one write
    Expect& data(const char* name, int busId = 16) {
        frames_.push_back({'W', busId, at(name)});
        return *this;
    }
    // W_DelayCB: the write and its read-back
    Expect& write(const char* name) {
        data(name);
        return read(name);
    }
    Expect& fileName(bool reading = false) {
        for (int id = 16; id <= 32; id += 4)
            frames_.push_back({reading ? 'R' : 'W', id, at("File_Name")});
        return *this;
    }
    // Table 1 in 51 parts: bus ID 16 + k carries points k and k + 1.
    Expect& table1(bool reading = false) {
        for (int id = 16; id <= 116; id += 2)
            frames_.push_back({reading ? 'R' : 'W', id, at("Table1")});
        return *this;
    }
    // After the last register the run reads the serial number to make sure the
    // module is still the one it started on.
    Expect& moduleConfirmed() { return read("Serial_No"); }
    const std::vector<Frame>& frames() const { return frames_; }

private:
    int at(const char* name) const {
        const int address = addressOf(name, map_);
        if (address < 0)
            qFatal("%s is not in map %d", name, map_);
        return address;
    }
    int map_;
    std::vector<Frame> frames_;
};

struct Bench {
    QTemporaryDir portDir;
    std::unique_ptr<kv::sim::Simulator> sim;
    kv::ModuleConnection connection;
    kv::ModuleRun run{connection, QStringLiteral("MCT00042")};
    bool finished = false;
    bool ok = false;
    QString result;

    explicit Bench(int typeCode, int subType) {
        qputenv("KV700_PORT_DIR", portDir.path().toLocal8Bit());
        kv::sim::SimOptions options;
        options.module.typeCode = typeCode;
        options.module.subType = subType;
        sim = std::make_unique<kv::sim::Simulator>(options);
        QString error;
        if (!sim->start(error) || !sim->publishAsPort(Port, error))
            qWarning() << "simulator:" << error;
        connection.engine().setPort(Port);
        connection.OpenCom(true, error);
        QObject::connect(&run, &kv::ModuleRun::finished, [this](bool success, const QString& text) {
            finished = true;
            ok = success;
            result = text;
        });
    }

    template <typename Done>
    bool tickUntil(Done done, int ticks = 20000) {
        for (int i = 0; i < ticks && !done(); ++i)
            connection.tick();
        return done();
    }

    // Identified, and the live polling off so that only the runs talk to the module.
    bool ready() {
        if (!tickUntil([] { return kv::StatusText() == QLatin1String("Run Mode"); }))
            return false;
        connection.setPollingSuspended(true);
        return tickUntil([this] { return connection.engine().state() == kv::StateRun; });
    }

    // Runs to its end; false when it did not end. The frames it sent are in `sent`.
    bool finish(std::size_t from) {
        const bool ended = tickUntil([this] { return finished; });
        const std::vector<kv::sim::SimLogEntry> log = sim->log();
        sent.clear();
        for (std::size_t i = from; i < log.size(); ++i)
            if (log[i].kind == kv::sim::SimLogEntry::Request)
                sent.push_back({log[i].command, log[i].busId, log[i].address});
        return ended;
    }

    bool program(const kv::DriverDescriptor& driver, const kv::SettingsSet& settings) {
        finished = false;
        const std::size_t from = sim->log().size();
        QString error;
        if (!run.startProgramming(driver, settings, error)) {
            result = error;
            return false;
        }
        return finish(from) && ok;
    }

    bool read(const kv::DriverDescriptor& driver, const kv::SettingsSet& initial) {
        finished = false;
        const std::size_t from = sim->log().size();
        QString error;
        if (!run.startReading(driver, initial, error)) {
            result = error;
            return false;
        }
        return finish(from) && ok;
    }

    std::vector<Frame> sent;
};

// Compares the frames sent with the expected ones, naming the first difference.
inline bool sameFrames(const std::vector<Frame>& sent, const std::vector<Frame>& expected,
                       QString& difference) {
    for (std::size_t i = 0; i < std::max(sent.size(), expected.size()); ++i) {
        const QString got = i < sent.size() ? describe(sent[i]) : QStringLiteral("nothing");
        const QString want =
            i < expected.size() ? describe(expected[i]) : QStringLiteral("nothing");
        if (got != want) {
            difference = QStringLiteral("frame %1: sent %2, expected %3").arg(i + 1).arg(got, want);
            return false;
        }
    }
    return true;
}

}  // namespace drvbench
