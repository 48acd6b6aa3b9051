#include "drivers/step_runner.h"

#include "engine/diagnostics.h"
#include "engine/request_engine.h"
#include "model/linearisation.h"
#include "model/module_types.h"
#include "model/register_text.h"
#include "model/table_transfer.h"

#include <QThread>
#include <QVariant>

namespace kv {

namespace {

const QString subTag = QStringLiteral("?");
constexpr qint16 FirstBusId = 16;

struct TableData {
    int lastUsed;
    const qint32* written;  // the settings record's table
    const qint32* read;     // the parts received into RegVal
};

bool tableOf(const RegField& reg, const SettingsSet& settings, TableData& table, QString& text) {
    if (reg.isSameAs(KV_REG(Table1))) {
        table = {Table1LastUsed, settings.Table1.data(), RegVal.Table1_Pts.data()};
        return true;
    }
    if (reg.isSameAs(KV_REG(TableC))) {
        table = {TableCLastUsed, settings.TableC.data(), RegVal.TableC_Pts.data()};
        return true;
    }
    text = QStringLiteral("? table ") + QLatin1String(reg.name());
    return false;
}

bool acknowledges(const StepRow& row, const StepContext& step) {
    const int address = row.ack.reg.address(RegAdd);
    return address >= 0 && address == step.id && (!row.ack.when || row.ack.when(step));
}

void valueOf(const StepContext& step, const ValueSource& source, QVariant& value, qint16& type) {
    type = ValueLong;
    switch (source.kind) {
    case ValueSource::SettingLong:
        value = step.settings.*source.settingLong;
        return;
    case ValueSource::SettingSingle:
        value = step.settings.*source.settingSingle;
        type = ValueSingle;
        return;
    case ValueSource::WorkInt:
        value = step.work.*source.workInt;
        return;
    case ValueSource::WorkLong:
        value = step.work.*source.workLong;
        return;
    case ValueSource::Computed:
        value = source.computed.value(RegVal);
        if (source.computed.isSingle())
            type = ValueSingle;
        return;
    case ValueSource::TextChar: {
        const QString& text = step.settings.*source.text;
        value = source.index < text.size() ? qint32(text.at(source.index).unicode()) : qint32(' ');
        return;
    }
    case ValueSource::None:
        break;
    }
    value = 0;
}

bool readPart(StepContext& step, const RegField& reg, QString& text) {
    return step.engine.R_CB(reg.address(RegAdd), step.work.DrvBusID, step.work.DrvRequester,
                            CallbackGet, text);
}

bool sendFileNamePart(StepContext& step, const RegField& reg, QString& text) {
    if (step.reading)
        return readPart(step, reg, text);
    const QString name =
        step.settings.FileName.left(FileNameLength).leftJustified(FileNameLength, QLatin1Char(' '));
    const QString part = name.mid(step.work.DrvBusID - FileNameIds.first, FileNameIds.step);
    return step.engine.W_DataOK(reg.address(RegAdd), step.work.DrvBusID, step.work.DrvRequester,
                                part.mid(0, 1), part.mid(1, 1), part.mid(2, 1), part.mid(3, 1),
                                ValueFourChars, QString(), text);
}

bool sendTablePart(StepContext& step, const RegField& reg, QString& text) {
    if (step.reading)
        return readPart(step, reg, text);
    TableData table{};
    if (!tableOf(reg, step.settings, table, text))
        return false;
    const int index = TableStepIndex(step.work.DrvBusID, table.lastUsed);
    const QVector<TableStep> parts = TableTransferSteps(table.written, table.lastUsed);
    return step.engine.W_DataOK(reg.address(RegAdd), step.work.DrvBusID, step.work.DrvRequester,
                                parts[index].first, parts[index].second, {}, {}, ValueTwoWords,
                                QStringLiteral("T"), text);
}

bool queue(StepContext& step, const NextRequest& next, QString& text) {
    const int address = next.reg.address(RegAdd);
    QVariant value;
    qint16 type = ValueLong;
    switch (next.kind) {
    case RequestKind::Write:
        valueOf(step, next.value, value, type);
        return step.engine.W_DelayCB(address, value, type, step.work.DrvRequester, CallbackSet,
                                     text);
    case RequestKind::WriteData:
        valueOf(step, next.value, value, type);
        return step.engine.W_DataOK(address, step.work.DrvBusID, step.work.DrvRequester, value, {},
                                    {}, {}, type, QString(), text);
    case RequestKind::Read:
        return step.engine.R_CB(address, step.work.DrvBusID, step.work.DrvRequester,
                                step.reading ? CallbackGet : CallbackSet, text);
    case RequestKind::FirstFileName:
        step.work.DrvBusID = FileNameIds.first;
        return sendFileNamePart(step, next.reg, text);
    case RequestKind::FirstTable:
        step.work.DrvBusID = FirstTableBusId;
        return sendTablePart(step, next.reg, text);
    }
    return false;
}

// One acknowledged part of the file name. `done` after the last part, with the
// name taken over when reading.
bool fileNamePart(StepContext& step, const RegField& reg, bool& done, QString& text) {
    const bool expected = step.busId == step.work.DrvBusID && step.busId >= FileNameIds.first &&
                          step.busId <= FileNameIds.last &&
                          (step.busId - FileNameIds.first) % FileNameIds.step == 0;
    if (!expected) {
        if (step.reading) {
            step.work.DrvWarning += QStringLiteral("Invalid Return ID:") +
                                    QString::number(step.busId) + QStringLiteral(", ");
            text = QStringLiteral("Invalid Return ID:") + QString::number(step.busId);
        } else {
            text = QStringLiteral(" Return ID") + QString::number(step.busId) +
                   QStringLiteral(" Invalid");
        }
        return false;
    }
    done = step.busId == FileNameIds.last;
    if (!done) {
        step.work.DrvBusID = qint16(step.busId + FileNameIds.step);
        return sendFileNamePart(step, reg, text);
    }
    step.work.DrvBusID = FirstBusId;
    if (step.reading)
        step.settings.SetFileName(RegVal.File_Text);
    return true;
}

// One acknowledged part of a table transfer. `done` after the last part; a
// table read back with a wrong checksum is reported in the warning text.
bool tablePart(StepContext& step, const RegField& reg, bool& done, QString& text) {
    TableData table{};
    if (!tableOf(reg, step.settings, table, text))
        return false;
    if (!CheckTableReturnId(step.work.DrvBusID, step.busId, !step.reading, text)) {
        if (!step.reading)
            DebugMessage(DiagGeneral, QStringLiteral("WriteTable"), text);
        return false;
    }
    done = step.busId - FirstTableBusId >= table.lastUsed;
    if (!done) {
        step.work.DrvBusID = qint16(step.busId + 2);
        return sendTablePart(step, reg, text);
    }
    step.work.DrvBusID = FirstBusId;
    QString checksum;
    if (step.reading && !CheckTableReadBack(table.read, table.lastUsed, checksum))
        step.work.DrvWarning += checksum + QStringLiteral(", ");
    return true;
}

bool startOfRun(StepContext& step, QString& text) {
    step.work.DrvWarning.clear();
    step.work.DrvBusID = FirstBusId;
    return CheckModType(RegVal.Mod_Type, step.driver.family, text);
}

bool takeStep(StepContext& step, const StepTable& order, const QString& noMatch, QString& text) {
    const StepRow* row = nullptr;
    for (const StepRow& candidate : order) {
        if (acknowledges(candidate, step)) {
            row = &candidate;
            break;
        }
    }
    if (!row) {
        text = noMatch + QString::number(step.id);
        return false;
    }
    step.work.DrvStep = int(row - order.begin());
    if (row->ack.reg.isSameAs(KV_REG(Mod_Type)) && !startOfRun(step, text))
        return false;
    bool done = true;
    switch (row->ack.kind) {
    case AckKind::Register:
        break;
    case AckKind::FileNameParts:
        if (!fileNamePart(step, row->ack.reg, done, text))
            return false;
        break;
    case AckKind::TableParts:
        if (!tablePart(step, row->ack.reg, done, text))
            return false;
        break;
    }
    if (!done)
        return true;
    if (row->hook && !row->hook(step, text))
        return false;
    return queue(step, row->next, text);
}

bool failStep(StepContext& step, QString& text) {
    step.engine.setReserved(false);
    DebugMessage(DiagGeneral, QLatin1String(step.reading ? step.driver.getTag : step.driver.setTag),
                 text, {}, subTag);
    if (!step.reading)
        text = QStringLiteral("PROGRAM FAIL ") + GetRegDescription(step.id, step.busId) +
               QStringLiteral(": ") + text;
    return false;
}

}  // namespace

bool ProgramStep(const DriverDescriptor& driver, RequestEngine& engine, qint32 id, qint16 busId,
                 QString& text, SettingsSet& settings) {
    StepContext step{driver, engine, *driver.work, settings, id, busId, false};
    if (id == 1) {
        text = QStringLiteral("cbSet 1 FAIL Start process on calling form");
        return failStep(step, text);
    }
    if (id == driver.lastProgrammed.address(RegAdd)) {
        text = QStringLiteral("cbSet RegAdd.") + QLatin1String(driver.lastProgrammed.name()) +
               QStringLiteral(" End process on calling form");
        return failStep(step, text);
    }
    if (!takeStep(step, driver.programOrder, QStringLiteral("? Set Address"), text))
        return failStep(step, text);
    return true;
}

bool ReadStep(const DriverDescriptor& driver, RequestEngine& engine, qint32 id, qint16 busId,
              QString& text, SettingsSet& settings) {
    StepContext step{driver, engine, *driver.work, settings, id, busId, true};
    if (id == 0)
        return true;
    if (id == 1) {
        text = QStringLiteral("cbGetSet 1 FAIL Start process on calling form");
        return failStep(step, text);
    }
    if (!takeStep(step, driver.readOrder, QStringLiteral("cbGet ? address:"), text))
        return failStep(step, text);
    return true;
}

bool Dispatch(const DriverDescriptor& driver, RequestEngine& engine, qint16 kind,
              QString& requester, SettingsSet& settings, qint32 id, qint16 busId, QString& text) {
    DriverWork& work = *driver.work;
    work.DrvRequester = requester;
    work.DrvModel = driver.family;
    switch (kind) {
    case DispatchRead:
        return ReadStep(driver, engine, id, busId, text, settings);
    case DispatchProgram:
        return ProgramStep(driver, engine, id, busId, text, settings);
    case DispatchWarning:
        if (!work.DrvWarning.isEmpty())
            text = work.DrvWarning;
        return false;
    default:
        text = QLatin1String(driver.dispatcher) + QStringLiteral(" ? Call Back Function");
        DebugMessage(DiagGeneral, QLatin1String(driver.dispatcher), text, {}, subTag);
        return false;
    }
}

void AddDelay(double seconds, const QString& text) {
    ShowStatus(QStringLiteral("Delay ") + text);
    // A plain pause: processing events here, inside the engine's callback,
    // could let a timer re-enter the engine.
    QThread::msleep(qRound(seconds * 1000.0));
}

}  // namespace kv
