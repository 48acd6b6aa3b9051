#pragma once
// The demonstration: a simulated module on a pseudo-terminal inside this
// process, reachable as a COM port of a private port folder, so the user's
// own port links and stored port stay untouched.

#include <QString>
#include <QTemporaryDir>

#include <memory>

namespace kv {

namespace sim {
class Simulator;
}

constexpr qint16 DemoPort = 1;
constexpr qint16 DemoConnector = 0;  // the simulated adapter needs no priming

class DemoModule {
public:
    DemoModule();
    ~DemoModule();

    // `model` as "KV720-20" or a type code ("7" or "7:5"); empty for the
    // simulator's own choice. Points this process's port folder at a private one.
    bool start(const QString& model, QString& error);
    // The model text of the simulated module.
    QString modelName() const;

private:
    QTemporaryDir portDir_;
    std::unique_ptr<sim::Simulator> simulator_;
};

}  // namespace kv
