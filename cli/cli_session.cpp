#include "cli/cli_session.h"

#include "engine/diagnostics.h"
#include "model/codec.h"

#include <QEventLoop>
#include <QTimer>

namespace kv::cli {

namespace {
// Only a module that keeps answering the wrong address stalls the engine for
// ever; a bench program must end all the same.
constexpr int WatchdogMs = 120000;
}  // namespace

ModuleSession::ModuleSession(qint16 port, qint16 connector, QObject* parent)
    : QObject(parent), tag_(NextTag(false)) {
    engine().setPort(port);
    engine().setConnector(connector);
    engine().registerReceiver(tag_, this);
    connect(&connection_, &ModuleConnection::ticked, this, [this] { ++ticks_; });
    connect(&connection_, &ModuleConnection::runMode, this, [this] {
        runMode_ = true;
        // Reserved before this tick's polling step, which would otherwise start.
        engine().ReserveSomeTime();
    });
}

ModuleSession::~ModuleSession() {
    // Disconnecting also clears the reservation.
    QString ignored;
    if (engine().connected())
        connection_.OpenCom(false, ignored);
    engine().unregisterReceiver(tag_);
}

bool ModuleSession::runUntil(const WaitOver& over, QString& error) {
    error.clear();
    if (over(error))
        return error.isEmpty();
    QEventLoop loop;
    bool ended = false;
    auto check = [&] {
        if (ended)
            return;
        if (over(error) || !engine().connected()) {
            if (error.isEmpty() && !engine().connected())
                error = StatusText();
            ended = true;
            loop.quit();
        }
    };
    const QMetaObject::Connection tick = connect(&connection_, &ModuleConnection::ticked, check);
    QTimer watchdog;
    watchdog.setSingleShot(true);
    connect(&watchdog, &QTimer::timeout, &loop, [&] {
        error = QStringLiteral("No end of the exchange after %1 s").arg(WatchdogMs / 1000);
        ended = true;
        loop.quit();
    });
    watchdog.start(WatchdogMs);
    loop.exec();
    disconnect(tick);
    return error.isEmpty();
}

bool ModuleSession::open(QString& error) {
    runMode_ = false;
    ticks_ = 0;
    clock_.start();
    if (!connection_.OpenCom(true, error))
        return false;
    return runUntil(
        [this](QString& why) {
            if (runMode_)
                return true;
            switch (engine().state()) {
            case StateUnknownModule:  // "Debug module": nothing more is sent
            case StateRun:            // identification stopped on an unexpected reply
                why = StatusText();
                return true;
            default:
                return false;
            }
        },
        error);
}

bool ModuleSession::awaitCallback(QString& error) {
    return runUntil(
        [this](QString& why) {
            if (!answered_)
                return false;
            why = answerError_;
            return true;
        },
        error);
}

bool ModuleSession::read(qint32 address, qint16 busId, QString& error) {
    answered_ = false;
    // Kind 2: a read given up comes back with its reason, not as stale data.
    if (!engine().R_CB(address, busId, tag_, CallbackSet, error))
        return false;
    return awaitCallback(error);
}

bool ModuleSession::writeAndReadBack(qint32 address, const QVariant& value, qint16 valueType,
                                     QString& error) {
    answered_ = false;
    if (!engine().W_DelayCB(address, value, valueType, tag_, CallbackSet, error))
        return false;
    return awaitCallback(error);
}

void ModuleSession::cbGet(qint32 address, qint16 busId) {
    // Reads are requested with callback kind 2 and arrive at cbSet.
    Q_UNUSED(address);
    Q_UNUSED(busId);
}

void ModuleSession::cbSet(qint32 address, qint16 busId, const QString& text, bool ok) {
    Q_UNUSED(address);
    Q_UNUSED(busId);
    answered_ = true;
    answerError_ = ok ? QString() : text;
    if (ok)
        dataField_ = engine().lastReplyData();
}

}  // namespace kv::cli
