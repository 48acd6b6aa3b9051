#include "ui/app/demo_module.h"

#include "sim/simulator.h"

namespace kv {

DemoModule::DemoModule() = default;

DemoModule::~DemoModule() {
    if (simulator_)
        simulator_->stop();
}

bool DemoModule::start(const QString& model, QString& error) {
    sim::SimOptions options;
    if (!model.isEmpty() && !sim::ParseModel(model, options.module)) {
        error =
            QStringLiteral("Unknown model \"%1\". Known models: %2").arg(model, sim::KnownModels());
        return false;
    }
    if (!portDir_.isValid()) {
        error = QStringLiteral("Cannot create a private port folder: ") + portDir_.errorString();
        return false;
    }
    qputenv("KV700_PORT_DIR", portDir_.path().toLocal8Bit());
    simulator_ = std::make_unique<sim::Simulator>(options);
    return simulator_->start(error) && simulator_->publishAsPort(DemoPort, error);
}

QString DemoModule::modelName() const {
    if (!simulator_)
        return {};
    const sim::ModuleIdentity module = simulator_->module();
    return sim::ModelName(module.typeCode, module.subType);
}

}  // namespace kv
