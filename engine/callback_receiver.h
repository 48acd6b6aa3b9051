#pragma once
// What every window that talks to a module implements: the engine calls it
// back, found by its tag, once its request has completed or been given up.

#include <QString>

namespace kv {

class CallbackReceiver {
public:
    virtual ~CallbackReceiver() = default;
    // A read has completed (the value is in RegVal), or a read was given up
    // (RegVal keeps the previous value).
    virtual void cbGet(qint32 address, qint16 busId) = 0;
    // A write (or a kind-2 read) has completed with "" and true, or was given up
    // with "Too many retries:" and the last error, and false.
    virtual void cbSet(qint32 address, qint16 busId, const QString& text, bool ok) = 0;
};

}  // namespace kv
