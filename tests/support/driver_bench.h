#pragma once
// A simulated module on a private COM port, identified by the program, with a
// settings window's run (ModuleRun) to program and read it one tick at a time,
// the frames the module received written out as expected lists, and the
// fields a read must give back.

#include "drivers/module_run.h"
#include "engine/diagnostics.h"
#include "engine/module_connection.h"
#include "model/linearisation.h"
#include "model/register_map.h"
#include "sim/simulator.h"

#include <QTemporaryDir>
#include <QtTest>

#include <initializer_list>
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
    // Several steps of one kind in a row.
    Expect& reads(std::initializer_list<const char*> names) {
        for (const char* name : names)
            read(name);
        return *this;
    }
    Expect& writes(std::initializer_list<const char*> names) {
        for (const char* name : names)
            write(name);
        return *this;
    }
    Expect& fileName(bool reading = false) {
        for (int id = 16; id <= 32; id += 4)
            frames_.push_back({reading ? 'R' : 'W', id, at("File_Name")});
        return *this;
    }
    // Table 1 in 51 parts: bus ID 16 + k carries points k and k + 1.
    Expect& table1(bool reading = false) { return table("Table1", 116, reading); }
    // Table C in 26 parts, bus IDs 16 to 66.
    Expect& tableC() { return table("TableC", 66, false); }
    // After the last register the run reads the serial number to make sure the
    // module is still the one it started on.
    Expect& moduleConfirmed() { return read("Serial_No"); }
    const std::vector<Frame>& frames() const { return frames_; }

private:
    Expect& table(const char* name, int lastId, bool reading) {
        for (int id = 16; id <= lastId; id += 2)
            frames_.push_back({reading ? 'R' : 'W', id, at(name)});
        return *this;
    }
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

    Bench(int typeCode, int subType) : Bench(identity(typeCode, subType)) {}
    explicit Bench(const kv::sim::ModuleIdentity& module) {
        qputenv("KV700_PORT_DIR", portDir.path().toLocal8Bit());
        kv::sim::SimOptions options;
        options.module = module;
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

    // Runs to its end; false when it did not end. The frames it sent are in
    // `sent`, the positions among them of those the module left unanswered in `dropped`.
    bool finish(std::size_t from) {
        const bool ended = tickUntil([this] { return finished; });
        const std::vector<kv::sim::SimLogEntry> log = sim->log();
        sent.clear();
        dropped.clear();
        for (std::size_t i = from; i < log.size(); ++i) {
            if (log[i].kind != kv::sim::SimLogEntry::Request)
                continue;
            if (log[i].outcome == kv::sim::SimLogEntry::Dropped)
                dropped.push_back(sent.size());
            sent.push_back({log[i].command, log[i].busId, log[i].address});
        }
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
    std::vector<std::size_t> dropped;

private:
    static kv::sim::ModuleIdentity identity(int typeCode, int subType) {
        kv::sim::ModuleIdentity module;
        module.typeCode = typeCode;
        module.subType = subType;
        return module;
    }
};

// Table 1 as a curve, so that a table read back from elsewhere shows.
inline void curveTable(kv::SettingsSet& s) {
    for (int i = 0; i <= kv::Table1LastUsed; ++i)
        s.Table1[i] = i * i;
    kv::TableChecksum(s.Table1.data(), kv::Table1LastUsed);
}

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

// A field of the settings record, compared as QCOMPARE compares its type.
struct Field {
    const char* name;
    qint32 kv::SettingsSet::*whole = nullptr;
    float kv::SettingsSet::*single = nullptr;
    QString kv::SettingsSet::*text = nullptr;
};
inline Field field(const char* name, qint32 kv::SettingsSet::*member) {
    return {name, member, nullptr, nullptr};
}
inline Field field(const char* name, float kv::SettingsSet::*member) {
    return {name, nullptr, member, nullptr};
}
inline Field field(const char* name, QString kv::SettingsSet::*member) {
    return {name, nullptr, nullptr, member};
}
#define DRV_FIELD(member) ::drvbench::field(#member, &::kv::SettingsSet::member)

// Compares the named fields of what was read with what was sent; a failure
// names the first field that differs.
inline bool sameFields(const kv::SettingsSet& got, const kv::SettingsSet& sent,
                       std::initializer_list<Field> fields) {
    for (const Field& f : fields) {
        const bool same =
            f.whole
                ? QTest::qCompare(got.*f.whole, sent.*f.whole, f.name, f.name, __FILE__, __LINE__)
            : f.single
                ? QTest::qCompare(got.*f.single, sent.*f.single, f.name, f.name, __FILE__, __LINE__)
                : QTest::qCompare(got.*f.text, sent.*f.text, f.name, f.name, __FILE__, __LINE__);
        if (!same)
            return false;
    }
    return true;
}

}  // namespace drvbench
