#pragma once
// modKV7146v1: the driver of the first-version KV714 (one output) and KV716
// (two outputs). One dispatcher per model; both share the driver's working
// values and steps.

#include "drivers/driver_descriptor.h"

namespace kv {

class RequestEngine;

const DriverDescriptor& Kv714v1Driver();
const DriverDescriptor& Kv716v1Driver();

bool GS714v1(RequestEngine& engine, qint16 kind, QString& requester, SettingsSet& settings,
             qint32 id, qint16 busId, QString& text);
bool GS716v1(RequestEngine& engine, qint16 kind, QString& requester, SettingsSet& settings,
             qint32 id, qint16 busId, QString& text);

}  // namespace kv
