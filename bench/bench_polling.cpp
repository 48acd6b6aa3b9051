// Cost of watching a connected module: CPU time per minute of wall time and the
// resident memory after 1 and after N minutes of live polling, against a
// kv700-sim process (so its work is not counted here).
//
//   bench_polling [MINUTES]   (default 10; the simulator binary is found beside this one's tree)
#include "engine/diagnostics.h"
#include "engine/module_connection.h"

#include <QCoreApplication>
#include <QElapsedTimer>
#include <QFile>
#include <QProcess>
#include <QTemporaryDir>
#include <QThread>
#include <QTimer>

#include <cstdio>
#include <sys/resource.h>

namespace {
double cpuSeconds() {
    rusage usage{};
    getrusage(RUSAGE_SELF, &usage);
    return usage.ru_utime.tv_sec + usage.ru_stime.tv_sec +
           (usage.ru_utime.tv_usec + usage.ru_stime.tv_usec) / 1e6;
}

long residentKiB() {
    QFile status(QStringLiteral("/proc/self/status"));
    if (!status.open(QIODevice::ReadOnly))
        return -1;
    for (const QByteArray& line : status.readAll().split('\n'))
        if (line.startsWith("VmRSS:"))
            return line.mid(6).trimmed().split(' ').value(0).toLong();
    return -1;
}
}  // namespace

int main(int argc, char** argv) {
    QCoreApplication app(argc, argv);
    const int minutes = argc > 1 ? qMax(1, atoi(argv[1])) : 10;
    QTemporaryDir portDir;
    qputenv("KV700_PORT_DIR", portDir.path().toLocal8Bit());
    QProcess sim;
    sim.start(QStringLiteral(KV700_SIM_PATH),
              {QStringLiteral("--model"), QStringLiteral("KV720-20"), QStringLiteral("--port"),
               QStringLiteral("1")});
    if (!sim.waitForStarted()) {
        std::fprintf(stderr, "cannot start %s\n", KV700_SIM_PATH);
        return 1;
    }
    QThread::msleep(300);

    kv::ModuleConnection connection;
    connection.engine().setPort(1);
    QString error;
    connection.OpenCom(true, error);
    bool running = false;
    QObject::connect(&connection, &kv::ModuleConnection::runMode, [&] { running = true; });
    QElapsedTimer wait;
    wait.start();
    while (!running && wait.elapsed() < 20000)
        app.processEvents(QEventLoop::WaitForMoreEvents, 50);
    if (!running) {
        std::fprintf(stderr, "module not identified: %s\n", qPrintable(kv::StatusText()));
        return 1;
    }

    const double cpuStart = cpuSeconds();
    QElapsedTimer clock;
    clock.start();
    long rssAfterOne = -1;
    QTimer sampler;
    QObject::connect(&sampler, &QTimer::timeout, [&] {
        if (rssAfterOne < 0 && clock.elapsed() >= 60000) {
            rssAfterOne = residentKiB();
            std::printf("after 1 min: CPU %.2f %% of one core, RSS %ld KiB\n",
                        100.0 * (cpuSeconds() - cpuStart) / (clock.elapsed() / 1000.0),
                        rssAfterOne);
            std::fflush(stdout);
        }
        if (clock.elapsed() >= minutes * 60000LL)
            app.quit();
    });
    sampler.start(1000);
    app.exec();

    const double cpuPercent = 100.0 * (cpuSeconds() - cpuStart) / (clock.elapsed() / 1000.0);
    const long rssEnd = residentKiB();
    std::printf(
        "after %d min: CPU %.2f %% of one core (target < 2 %%), RSS %ld KiB, growth %ld KiB "
        "(target < 1024)\n",
        minutes, cpuPercent, rssEnd, rssEnd - rssAfterOne);
    sim.terminate();
    sim.waitForFinished();
    return 0;
}
