#include "drivers/module_run.h"

#include "drivers/driver_list.h"
#include "drivers/step_runner.h"
#include "engine/diagnostics.h"
#include "engine/module_connection.h"
#include "engine/request_engine.h"
#include "model/module_types.h"
#include "model/register_map.h"
#include "model/register_text.h"

namespace kv {

namespace {
const QString tryAgain = QStringLiteral("Please try again !!");
const QString subTag = QStringLiteral("?");
constexpr qint16 RunBusId = 16;
}  // namespace

ModuleRun::ModuleRun(ModuleConnection& connection, const QString& tag, QObject* parent)
    : QObject(parent), connection_(connection), tag_(tag) {
    connection_.engine().registerReceiver(tag_, this);
    // Closing, reopening and a swapped module all rebuild the module controls.
    connect(&connection_, &ModuleConnection::moduleControlsChanged, this,
            &ModuleRun::checkConnection);
}

ModuleRun::~ModuleRun() {
    if (active_)
        connection_.engine().setReserved(false);
    connection_.engine().unregisterReceiver(tag_);
}

bool ModuleRun::startProgramming(const DriverDescriptor& driver, const SettingsSet& settings,
                                 QString& error) {
    if (active_) {
        error = tryAgain;
        return false;
    }
    settings_ = settings;
    return start(RunKind::Programming, driver, error);
}

bool ModuleRun::startReading(const DriverDescriptor& driver, const SettingsSet& initial,
                             QString& error) {
    if (active_) {
        error = tryAgain;
        return false;
    }
    settings_ = initial;
    return start(RunKind::Reading, driver, error);
}

bool ModuleRun::start(RunKind kind, const DriverDescriptor& driver, QString& error) {
    RequestEngine& engine = connection_.engine();
    if (!engine.ReserveSomeTime()) {
        error = tryAgain;
        emit statusChanged(error);
        ShowStatus(error);
        return false;
    }
    kind_ = kind;
    driver_ = &driver;
    startMap_ = ModuleMap;
    startSerial_ = RegVal.Serial_No;
    confirming_ = false;
    warning_.clear();
    const bool programming = kind == RunKind::Programming;
    const QString status = programming ? QStringLiteral("Programming..")
                                       : QStringLiteral("Read program from connected module . . .");
    if (!engine.R_CB(RegAdd.Mod_Type, RunBusId, tag_, programming ? CallbackSet : CallbackGet,
                     error)) {
        engine.setReserved(false);
        emit statusChanged(error);
        return false;
    }
    active_ = true;
    emit statusChanged(status);
    ShowStatus(status);
    emit progress(GetRegDescription(RegAdd.Mod_Type, RunBusId), 0, stepCount());
    return true;
}

void ModuleRun::cbSet(qint32 address, qint16 busId, const QString& text, bool ok) {
    if (!active_ || kind_ != RunKind::Programming)
        return;
    if (!ok) {
        fail(address, busId, text);
        return;
    }
    step(address, busId);
}

void ModuleRun::cbGet(qint32 address, qint16 busId) {
    if (!active_ || kind_ != RunKind::Reading)
        return;
    // A read the engine gave up on is called back too, with the old value in RegVal.
    if (connection_.engine().state() != StateRun) {
        fail(address, busId, QStringLiteral("Too many retries:"));
        return;
    }
    step(address, busId);
}

const DriverDescriptor* ModuleRun::currentDriver(const char* RunTexts::*unknownMap,
                                                 QString& error) const {
    const DriverDescriptor* driver = WindowDriverForMap(*driver_, ModuleMap);
    if (!driver)
        error = QLatin1String(driver_->run.*unknownMap);
    return driver;
}

void ModuleRun::step(qint32 address, qint16 busId) {
    if (confirming_) {
        confirm(address, busId);
        return;
    }
    const bool programming = kind_ == RunKind::Programming;
    QString text;
    const DriverDescriptor* driver =
        currentDriver(programming ? &RunTexts::unknownMapProgram : &RunTexts::unknownMapRead, text);
    if (!driver) {
        end(false, text);
        return;
    }
    RequestEngine& engine = connection_.engine();
    const RegField& last = programming ? driver->lastProgrammed : driver->lastRead;
    if (address == last.address(RegAdd)) {
        // Before anything is reported done, make sure the module that answered
        // the last step is the one the run started on.
        confirming_ = true;
        if (!engine.R_CB(RegAdd.Serial_No, RunBusId, tag_, programming ? CallbackSet : CallbackGet,
                         text))
            fail(address, busId, text);
        return;
    }
    QString requester = tag_;
    const qint16 kind = programming ? DispatchProgram : DispatchRead;
    if (!Dispatch(*driver, engine, kind, requester, settings_, address, busId, text)) {
        fail(address, busId, text);
        return;
    }
    // A step that succeeds without a new request would leave the run waiting for ever.
    if (engine.state() == StateRun) {
        fail(address, busId, QStringLiteral("No request queued"));
        return;
    }
    emit progress(GetRegDescription(address, busId), driver->work->DrvStep + 1, stepCount());
}

void ModuleRun::confirm(qint32 address, qint16 busId) {
    confirming_ = false;
    if (address != RegAdd.Serial_No || RegVal.Serial_No != startSerial_) {
        fail(address, busId, QStringLiteral("Module changed"));
        return;
    }
    if (kind_ == RunKind::Programming) {
        settings_.MinorTrim = 0;
        succeed(QLatin1String(driver_->run.programmed));
        return;
    }
    // The warning goes with the map the read was made for.
    QString text;
    const DriverDescriptor* reader = currentDriver(&RunTexts::unknownMapWarning, text);
    if (!reader) {
        end(false, text);
        return;
    }
    QString requester = tag_;
    Dispatch(*reader, connection_.engine(), DispatchWarning, requester, settings_, address, busId,
             warning_);
    succeed(ModelText(RegVal.Mod_Type, RegVal.TypInput) + QStringLiteral(" Settings Read.."));
}

void ModuleRun::fail(qint32 address, qint16 busId, const QString& reason) {
    QString text = reason;
    if (kind_ == RunKind::Reading)
        text = GetRegDescription(address, busId) + QStringLiteral(" - ") + reason +
               QStringLiteral(" FAIL");
    else if (!reason.startsWith(QLatin1String("PROGRAM FAIL ")))
        text = QStringLiteral("PROGRAM FAIL ") + GetRegDescription(address, busId) +
               QStringLiteral(": ") + reason;
    end(false, text);
}

void ModuleRun::succeed(const QString& text) {
    emit progress(text, stepCount(), stepCount());
    end(true, text);
}

void ModuleRun::end(bool ok, const QString& text) {
    active_ = false;
    connection_.engine().setReserved(false);
    if (!ok) {
        const char* suffix = kind_ == RunKind::Programming ? ".cbSet" : ".cbGet";
        DebugMessage(DiagGeneral, QLatin1String(driver_->run.window) + QLatin1String(suffix), text,
                     {}, subTag);
    }
    emit statusChanged(text);
    ShowStatus(text);
    emit finished(ok, text);
}

void ModuleRun::checkConnection() {
    if (!active_)
        return;
    const RequestEngine& engine = connection_.engine();
    const qint32 address = engine.awaitedAddress();
    if (!engine.connected() || engine.state() == StateClosed)
        fail(address, RunBusId, QStringLiteral("COM closed"));
    else if (engine.state() == StateOpening || engine.state() == StateModuleType ||
             ModuleMap != startMap_)
        fail(address, RunBusId, QStringLiteral("Module changed"));
}

int ModuleRun::stepCount() const {
    const StepTable& order =
        kind_ == RunKind::Programming ? driver_->programOrder : driver_->readOrder;
    return order.count + 1;
}

}  // namespace kv
