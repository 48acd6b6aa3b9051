#include "cli/cli_registers.h"

#include "cli/cli_output.h"
#include "cli/cli_session.h"
#include "engine/request_engine.h"
#include "model/codec.h"
#include "model/register_map.h"
#include "model/register_text.h"

namespace kv::cli {

namespace {
bool plainValue(const RegisterRow& row) {
    return row.access != RegAccess::Hidden &&
           (row.role == RegRole::Value || row.role == RegRole::Reading16 ||
            row.role == RegRole::PulseValue);
}

QString addressText(qint32 address) {
    return QStringLiteral("%1").arg(address, 3, 10, QLatin1Char('0'));
}
}  // namespace

QList<qint32> ListedAddresses() {
    QList<qint32> addresses;
    auto add = [&addresses](qint32 first, qint32 last) {
        for (qint32 address = first; address <= last; ++address)
            if (!GetRegDescription(address, DefaultBusId).isEmpty())
                addresses << address;
    };
    add(RegAdd.Lowest_Reg, RegAdd.Highest_Reg);
    add(RegAdd.Com_Power, RegAdd.Mod_Type);
    return addresses;
}

QString RegisterTable() {
    QString table = QStringLiteral("Add\tValue\tDescription\n");
    for (qint32 address : ListedAddresses())
        table += addressText(address) + QLatin1Char('\t') + RegValueText(address).text +
                 QLatin1Char('\t') + GetRegDescription(address, DefaultBusId) + QLatin1Char('\n');
    return table;
}

QString DataAndValue(qint32 address, qint16 busId, const QByteArray& data) {
    const RegisterRow* row = FindRegister(RegAdd, address);
    const QString value = row && busId == DefaultBusId && plainValue(*row)
                              ? RegValueText(address).text
                              : QString::number(WireToLong(data));
    return QString::fromLatin1(data) + QLatin1Char('\t') + value + QLatin1Char('\n');
}

QString SetRefusal(qint32 address, bool asFloat) {
    const RegisterValueText current = RegValueText(address);
    if (!current.writable)
        return QStringLiteral("Register %1 is not writable").arg(address);
    if (current.kind == FloatValue && !asFloat)
        return QStringLiteral("Register %1 holds a floating value: give --float").arg(address);
    if (current.kind == IntegerValue && asFloat)
        return QStringLiteral("Register %1 holds a whole number: leave out --float").arg(address);
    return {};
}

bool ReadAllRegisters(ModuleSession& session, StderrSink& sink, QString& result, QString& error) {
    const QList<qint32> addresses = ListedAddresses();
    // The step lines name each register; the engine's status would repeat them.
    sink.setProgressShown(false);
    for (int k = 0; k < addresses.size(); ++k) {
        const qint32 address = addresses.at(k);
        sink.progress(QStringLiteral("Register %1 of %2: %3 %4")
                          .arg(k + 1)
                          .arg(addresses.size())
                          .arg(addressText(address), GetRegDescription(address, DefaultBusId)));
        if (!session.read(address, DefaultBusId, error))
            return false;
    }
    result = RegisterTable();
    return true;
}

bool GetRegister(ModuleSession& session, const CliRequest& request, QString& result,
                 QString& error) {
    if (!session.read(request.address, request.busId, error))
        return false;
    result = DataAndValue(request.address, request.busId, session.dataField());
    return true;
}

bool SetRegister(ModuleSession& session, const CliRequest& request, QString& result,
                 QString& error) {
    error = SetRefusal(request.address, request.asFloat);
    if (!error.isEmpty())
        return false;
    const QVariant value =
        request.asFloat ? QVariant(float(request.value)) : QVariant(qint32(request.value));
    const qint16 type = request.asFloat ? ValueSingle : ValueLong;
    if (!session.writeAndReadBack(request.address, value, type, error))
        return false;
    result = DataAndValue(request.address, DefaultBusId, session.dataField());
    return true;
}

}  // namespace kv::cli
