#pragma once
// Register commands over an open session: the whole map as the register
// viewer copies it, and one register read or written like the viewer does.

#include "cli/cli_args.h"

#include <QByteArray>
#include <QList>
#include <QString>

namespace kv::cli {

class ModuleSession;
class StderrSink;

// The addresses the register viewer lists for the connected module, in its order.
QList<qint32> ListedAddresses();

// "Add<TAB>Value<TAB>Description" and one row per listed address from RegVal.
QString RegisterTable();

// A register's data field and its value: the map's reading of the value for a
// register of its own at bus ID 16, the field as a 32-bit integer otherwise.
QString DataAndValue(qint32 address, qint16 busId, const QByteArray& data);

// Why `set` must not write the register (not a writable register of the map, or
// --float that disagrees with the register's kind); "" when it may.
QString SetRefusal(qint32 address, bool asFloat);

bool ReadAllRegisters(ModuleSession& session, StderrSink& sink, QString& result, QString& error);
bool GetRegister(ModuleSession& session, const CliRequest& request, QString& result,
                 QString& error);
bool SetRegister(ModuleSession& session, const CliRequest& request, QString& result,
                 QString& error);

}  // namespace kv::cli
