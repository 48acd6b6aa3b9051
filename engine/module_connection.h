#pragma once
// The main window's side of the engine, without widgets: connecting and
// disconnecting, identifying the module on the adapter, the live polling that
// notices a swapped module, and the timer that drives it all. The main window
// and the command-line tool both sit on top of it.

#include "engine/callback_receiver.h"
#include "engine/request_engine.h"

#include <QObject>
#include <QTimer>

namespace kv {

// Bus-ID phase marks of the identification reads.
enum IdentificationPhase : qint16 { PhaseModuleType = 50, PhaseCalibration = 49, PhaseUpdate = 48 };

constexpr int StartUpIntervalMs = 1;
constexpr int RunIntervalMs = 10;
constexpr int PollCycleEnd = 77;

class ModuleConnection : public QObject, public CallbackReceiver {
    Q_OBJECT
public:
    explicit ModuleConnection(QObject* parent = nullptr);

    RequestEngine& engine() { return engine_; }

    // Connects or disconnects the engine; the port itself is opened by each exchange.
    bool OpenCom(bool connect, QString& error);
    bool busy() const { return busy_; }

    // The main window's timer tick: one engine step, then one polling step.
    void tick();
    void startTimer(int intervalMs);
    void stopTimer() { timer_.stop(); }
    bool timerActive() const { return timer_.isActive(); }

    // "No Def": suspends the live polling.
    void setPollingSuspended(bool on) { pollingSuspended_ = on; }
    bool pollingSuspended() const { return pollingSuspended_; }

    // Identification, and the replies of the main window's own reads.
    void cbGet(qint32 address, qint16 busId) override;
    void cbSet(qint32 address, qint16 busId, const QString& text, bool ok) override;

signals:
    void connectionChanged(bool connected);  // the connection buttons follow it
    void startUpTick();                      // a tick while the program is still starting up
    void ticked();                           // a tick of the running program (status counter)
    void moduleTextChanged(const QString& model);
    void moduleControlsChanged();  // ModuleMap changed: the live panel rebuilds
    void runMode();                // identification finished
    void waitBox(bool show, const QString& text);
    void beep();

private:
    void identify();
    void onModuleType();
    void onCalibrationValue(qint32 address);
    void onRegisterUpdate(qint32 address);
    void requestNext(qint32 address);
    void failIdentification(const QString& text);
    void poll();

    RequestEngine engine_;
    QTimer timer_;
    bool busy_ = false;
    bool pollingSuspended_ = false;
    qint16 phase_ = PhaseModuleType;
};

}  // namespace kv
