#pragma once
// One programming or reading run of the connected module, as a settings window
// or the command-line tool starts it. The run reserves the engine, asks for the
// module type (the pseudo-address 1 of the settings windows), forwards every
// later callback to the model's dispatcher, and after the model's last
// register reads the serial number once more: only the module the run started
// on counts as programmed or read. It fails on a failed step, on a request the
// engine gave up, when the connection goes away or the module was changed.
// Every end releases the engine and emits finished() exactly once.

#include "drivers/driver_descriptor.h"
#include "engine/callback_receiver.h"
#include "model/settings_set.h"

#include <QObject>
#include <QString>

namespace kv {

class ModuleConnection;

enum class RunKind { Programming, Reading };

class ModuleRun : public QObject, public CallbackReceiver {
    Q_OBJECT
public:
    // Registers the run with the connection's engine under `tag` (a settings
    // window's "MCT..." tag), so the engine's callbacks for that tag arrive here.
    ModuleRun(ModuleConnection& connection, const QString& tag, QObject* parent = nullptr);
    ~ModuleRun() override;

    QString tag() const { return tag_; }

    // Programs `settings` with `driver` (or the driver of the same window that
    // ModuleMap designates). False with the reason when the run cannot start
    // ("Please try again !!" while the engine is reserved or busy).
    bool startProgramming(const DriverDescriptor& driver, const SettingsSet& settings,
                          QString& error);
    // Reads the connected module into a copy of `initial`; fields that the
    // model's reading order does not restore keep their values.
    bool startReading(const DriverDescriptor& driver, const SettingsSet& initial, QString& error);

    bool active() const { return active_; }
    RunKind kind() const { return kind_; }
    // The record as the driver completed it (programming) or as read (reading).
    const SettingsSet& settings() const { return settings_; }
    // Warnings the last reading run collected ("Invalid Output 1 Range, "); empty when none.
    QString warning() const { return warning_; }

    void cbGet(qint32 address, qint16 busId) override;
    void cbSet(qint32 address, qint16 busId, const QString& text, bool ok) override;

signals:
    // The texts of the window's status line: "Programming..", "Programmed", ...
    void statusChanged(const QString& text);
    // After each acknowledged step: the register handled, step k of n (k = n at the end).
    void progress(const QString& registerText, int step, int steps);
    // The run ended: "Programmed" (or the model's text), the module text and
    // "Settings Read..", or the failure text naming the register.
    void finished(bool ok, const QString& text);

private:
    bool start(RunKind kind, const DriverDescriptor& driver, QString& error);
    void step(qint32 address, qint16 busId);
    void confirm(qint32 address, qint16 busId);
    // Ends the run with a failure text that names the register.
    void fail(qint32 address, qint16 busId, const QString& reason);
    void succeed(const QString& text);
    void end(bool ok, const QString& text);
    void checkConnection();
    const DriverDescriptor* currentDriver(const char* RunTexts::*unknownMap, QString& error) const;
    int stepCount() const;

    ModuleConnection& connection_;
    QString tag_;
    bool active_ = false;
    RunKind kind_ = RunKind::Programming;
    const DriverDescriptor* driver_ = nullptr;
    int startMap_ = 0;
    qint32 startSerial_ = 0;
    bool confirming_ = false;  // the last register is done; the serial number is being read
    SettingsSet settings_;
    QString warning_;
};

}  // namespace kv
