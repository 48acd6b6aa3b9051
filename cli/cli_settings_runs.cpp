#include "cli/cli_settings_runs.h"

#include "cli/cli_output.h"
#include "cli/cli_session.h"
#include "drivers/driver_list.h"
#include "drivers/module_run.h"
#include "files/kv7_file.h"
#include "model/codec.h"
#include "model/module_types.h"
#include "model/register_map.h"

namespace kv::cli {

namespace {

// Runs one programming or reading run to its end; `settings` is the record
// programmed, or the one read.
bool runDriver(ModuleSession& session, StderrSink& sink, RunKind kind, SettingsSet& settings,
               QString& text) {
    const DriverDescriptor* driver = DriverForMap(ModuleMap);
    if (!driver) {
        text = QStringLiteral("cmdProcess: Unknown Module Type");
        return false;
    }
    ModuleRun run(session.connection(), NextTag(true));
    bool ended = false;
    bool ok = false;
    QObject::connect(&run, &ModuleRun::progress, [&sink](const QString& item, int step, int steps) {
        sink.progress(QStringLiteral("Step %1 of %2: %3").arg(step).arg(steps).arg(item));
    });
    QObject::connect(&run, &ModuleRun::finished, [&](bool good, const QString& finalText) {
        ended = true;
        ok = good;
        text = finalText;
        // Held again at once, so the live polling stays out to the end.
        session.engine().setReserved(true);
    });
    // The run takes the reservation itself; no tick runs between these two lines.
    session.engine().setReserved(false);
    const bool started = kind == RunKind::Programming
                             ? run.startProgramming(*driver, settings, text)
                             : run.startReading(*driver, settings, text);
    if (!started) {
        session.engine().setReserved(true);
        return false;
    }
    // The step lines name each register; the engine's status would repeat them.
    sink.setProgressShown(false);
    QString error;
    const bool waited = session.runUntil(
        [&](QString& why) {
            if (!ended)
                return false;
            if (!ok)
                why = text;
            return true;
        },
        error);
    sink.setProgressShown(true);
    if (!waited) {
        text = error;
        return false;
    }
    settings = run.settings();
    if (!run.warning().isEmpty())
        sink.notice(run.warning());
    return true;
}

}  // namespace

bool LoadSettingsFile(const QString& file, qint32& typeCode, SettingsSet& settings,
                      QString& error) {
    QString name = file;
    if (!RestoreKVdef(name, typeCode, settings)) {
        error = QStringLiteral("Failed: ") + name;
        return false;
    }
    return true;
}

bool ProgramModule(ModuleSession& session, StderrSink& sink, qint32 typeCode,
                   const SettingsSet& settings, QString& result, QString& error) {
    if (!CheckModType(typeCode, ModuleMap, error))
        return false;
    if (!settings.LoadNote.isEmpty())
        sink.notice(settings.LoadNote);
    SettingsSet programmed = settings;
    QString text;
    if (!runDriver(session, sink, RunKind::Programming, programmed, text)) {
        error = text;
        return false;
    }
    result = text + QLatin1Char('\n');
    return true;
}

bool ReadModule(ModuleSession& session, StderrSink& sink, const QString& file, QString& result,
                QString& error) {
    SettingsSet settings;
    QString text;
    if (!runDriver(session, sink, RunKind::Reading, settings, text)) {
        error = text;
        return false;
    }
    QString name = file;
    if (!SaveKVdef(name, settings)) {
        error = QStringLiteral("Failed: ") + name;
        return false;
    }
    result = QStringLiteral("Saved: ") + name + QLatin1Char('\n');
    return true;
}

}  // namespace kv::cli
