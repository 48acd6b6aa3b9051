#include "engine/module_connection.h"

#include "engine/diagnostics.h"
#include "model/codec.h"
#include "model/module_ranges.h"
#include "model/module_types.h"
#include "model/register_map.h"

namespace kv {

namespace {
const QString hubTag = QStringLiteral("hub");
constexpr qint32 LowestDefined = 16;  // addresses up to this are "not defined" for polling

bool defined(double address) {
    return address > LowestDefined;
}

// One step of the live-polling cycle: the register read at a counter value,
// or the fallback when the family lacks it.
struct PollStep {
    int counter;
    double (*first)(const RegMap&);
    double (*second)(const RegMap&);
};

constexpr PollStep pollCycle[] = {
    {10, [](const RegMap& a) { return double(a.Sw_In2); },
     [](const RegMap& a) { return double(a.Pulse_Valley); }},
    {20, [](const RegMap& a) { return double(a.Sw_Out1); },
     [](const RegMap& a) { return double(a.Pulse_Peak); }},
    {30, [](const RegMap& a) { return double(a.Sw_Out2); },
     [](const RegMap& a) { return double(a.Pulse_Valley_Raw); }},
    {40, [](const RegMap& a) { return double(a.Pulse_Peak_Raw); },
     [](const RegMap& a) { return double(a.Mod_Type); }},
    {50, [](const RegMap& a) { return double(a.Trig_Level_RT); },
     [](const RegMap& a) { return double(a.Serial_No); }},
    {60, [](const RegMap& a) { return double(a.Serial_No); }, nullptr},
    {PollCycleEnd, [](const RegMap& a) { return double(a.Sw_In1); },
     [](const RegMap& a) { return double(a.In_Freq); }},
};

// The address to poll at `counter` (already advanced), or -1 for no read.
// May move the counter (the jump to 75 and the reset at the cycle's end).
qint32 pollAddress(qint16& counter, const RegMap& a) {
    if (counter % 10 == 5 && counter <= 75)
        return a.Input_Reading;
    for (const PollStep& step : pollCycle) {
        if (step.counter != counter)
            continue;
        if (counter == PollCycleEnd)
            counter = 0;
        if (defined(step.first(a)))
            return qint32(qRound(step.first(a)));
        if (step.second && defined(step.second(a)))
            return qint32(qRound(step.second(a)));
        if (step.counter == 50) {
            counter = 75;
            return a.Input_Reading;
        }
        return -1;
    }
    return -1;
}
}  // namespace

ModuleConnection::ModuleConnection(QObject* parent) : QObject(parent) {
    engine_.setHubReceiver(this);
    timer_.setInterval(StartUpIntervalMs);
    connect(&timer_, &QTimer::timeout, this, &ModuleConnection::tick);
    connect(&engine_, &RequestEngine::disconnectRequested, this, [this] {
        QString error;
        OpenCom(false, error);
    });
    connect(&engine_, &RequestEngine::moduleSwapped, this, [this] {
        SetRegMap(RegAdd, NoModuleMap);
        emit moduleControlsChanged();
    });
    connect(&engine_, &RequestEngine::beep, this, &ModuleConnection::beep);
}

void ModuleConnection::startTimer(int intervalMs) {
    timer_.setInterval(intervalMs);
    timer_.start();
}

bool ModuleConnection::OpenCom(bool connect, QString& error) {
    Q_UNUSED(error);
    timer_.stop();
    busy_ = true;
    // A new connection may meet another module: start from no family.
    SetRegMap(RegAdd, NoModuleMap);
    ModuleMap = NoModuleMap;
    engine_.setConnected(connect);
    emit connectionChanged(connect);
    emit moduleControlsChanged();
    busy_ = false;
    if (connect) {
        ShowStatus(QStringLiteral("COM Port Opened"));
        startTimer(RunIntervalMs);
    } else {
        ShowStatus(StatusText() + QStringLiteral(" >> COM closed"));
        emit waitBox(false, QString());
    }
    return true;
}

void ModuleConnection::tick() {
    timer_.stop();
    if (engine_.state() == StateStartUp) {
        emit startUpTick();
        if (engine_.state() == StateStartUp)
            timer_.start();
        return;
    }
    engine_.Communicate();
    emit ticked();
    poll();
    if (engine_.connected())
        timer_.start();
}

void ModuleConnection::poll() {
    if (pollingSuspended_ || engine_.state() != StateRun || engine_.reserved())
        return;
    emit waitBox(false, QString());
    qint16& counter = engine_.delayCounter();
    ++counter;
    const qint32 address = pollAddress(counter, RegAdd);
    if (address <= LowestDefined)
        return;
    QString error;
    if (!engine_.PollRead(address, error))
        AddMessage(error);
}

void ModuleConnection::cbGet(qint32 address, qint16 busId) {
    if (engine_.state() == StateModuleType) {
        identify();
        return;
    }
    switch (busId) {
    case PhaseModuleType:
        if (address == RegAdd.Mod_Type)
            onModuleType();
        else
            failIdentification(
                QStringLiteral("Unknown address:%1 Rturn ID%2").arg(address).arg(busId));
        return;
    case PhaseCalibration:
        onCalibrationValue(address);
        return;
    case PhaseUpdate:
        onRegisterUpdate(address);
        return;
    case 16:
        // The read-back of a remote-output write: the value is already in RegVal
        // and on the live display; nothing failed.
        return;
    default:
        failIdentification(
            QStringLiteral("cbGet Unknown address:%1 Rturn ID%2").arg(address).arg(busId));
    }
}

void ModuleConnection::cbSet(qint32 address, qint16 busId, const QString& text, bool ok) {
    Q_UNUSED(address);
    Q_UNUSED(busId);
    if (!ok)
        ShowStatus(text);
}

void ModuleConnection::identify() {
    engine_.setState(StateRun);
    engine_.setLastState(StateRun);
    emit waitBox(true, QString());
    phase_ = PhaseModuleType;
    requestNext(RegAdd.Mod_Type);
}

void ModuleConnection::onModuleType() {
    emit moduleTextChanged(DisplayModuleType(RegVal.Mod_Type));
    if (ModuleMap == UnknownModuleMap) {
        engine_.setState(StateUnknownModule);
        ShowStatus(QStringLiteral("Debug module"));
        return;
    }
    ModuleMap = GetModMap(RegVal.Mod_Type);
    SetRegMap(RegAdd, ModuleMap);
    BuildRangeTables(RegAdd, ModuleMap);
    if (ModuleMap != Kv720Map && RegAdd.Rng_First > 0) {
        phase_ = PhaseCalibration;
        ShowStatus(QStringLiteral("Get Calibration Values"));
        requestNext(RegAdd.Rng_First);
        return;
    }
    phase_ = PhaseUpdate;
    ShowStatus(QStringLiteral("Update Registers"));
    requestNext(RegAdd.Lowest_Reg);
}

void ModuleConnection::onCalibrationValue(qint32 address) {
    if (address != engine_.awaitedAddress()) {
        emit beep();
        return;
    }
    const RangeRegister info = GetRangeInfo(address, ModuleMap);
    if (info.channel >= Input1 && info.channel <= Output2) {
        RangeTable& table = ProgramRangeTable(info.channel);
        ShowStatus(ChannelPrefix(info.channel) + table[info.range].description);
        const qint32 count = WireToLong(engine_.lastReplyData());
        qint32 RangeDescriptor::*end =
            info.oddHalf ? &RangeDescriptor::countMax : &RangeDescriptor::countMin;
        table[info.range].*end = count;
        // The loop-powered 4-20 mA input shares the counts of the plain one.
        if (info.channel == Input1 && info.range == 3 &&
            (ModuleMap == Kv716v1Map || ModuleMap == Kv716v2Map))
            table[4].*end = count;
    }
    if (address < RegAdd.Rng_Last) {
        requestNext(address + 1);
        return;
    }
    phase_ = PhaseUpdate;
    ShowStatus(QStringLiteral("Update Registers"));
    requestNext(RegAdd.Rng_First);
}

void ModuleConnection::onRegisterUpdate(qint32 address) {
    if (address != engine_.awaitedAddress()) {
        failIdentification(
            QStringLiteral("cbGet address:%1 Return ID%2").arg(address).arg(PhaseUpdate));
        return;
    }
    if (address < RegAdd.Highest_Reg) {
        requestNext(address + 1);
        return;
    }
    engine_.setState(StateRun);
    ShowStatus(QStringLiteral("Run Mode"));
    emit moduleControlsChanged();
    emit runMode();
}

void ModuleConnection::requestNext(qint32 address) {
    QString error;
    if (!engine_.R_CB(address, phase_, hubTag, CallbackHub, error))
        failIdentification(error);
}

void ModuleConnection::failIdentification(const QString& text) {
    FailGeneral(QStringLiteral("Hub.cbGet"), hubTag, text);
}

}  // namespace kv
