#pragma once
// The shared steps of every driver: the dispatcher (kinds 1 reading, 2
// programming, 3 warning hand-over), one programming step (cbSet) and one
// reading step (cbGet), each looking up the acknowledged register in the
// driver's order and queuing exactly one request.

#include "drivers/driver_descriptor.h"

#include <QString>

namespace kv {

class RequestEngine;

enum DispatchKind : qint16 { DispatchRead = 1, DispatchProgram = 2, DispatchWarning = 3 };

// The dispatcher of a driver (GS720, ...). Stores requester in DrvRequester first.
// Kind 3 copies a non-empty DrvWarning into text and returns false.
bool Dispatch(const DriverDescriptor& driver, RequestEngine& engine, qint16 kind,
              QString& requester, SettingsSet& settings, qint32 id, qint16 busId, QString& text);

// One programming step: true when the next request was queued; false with the
// reason ("PROGRAM FAIL " + register description + ": " + why) otherwise.
bool ProgramStep(const DriverDescriptor& driver, RequestEngine& engine, qint32 id, qint16 busId,
                 QString& text, SettingsSet& settings);
// One reading step, same contract without the prefix.
bool ReadStep(const DriverDescriptor& driver, RequestEngine& engine, qint32 id, qint16 busId,
              QString& text, SettingsSet& settings);

// Pauses the queue for `seconds`, showing "Delay " and the text on the status
// line. No events are processed meanwhile.
void AddDelay(double seconds, const QString& text);

}  // namespace kv
