// How close a kv700-cli run on a simulated KV720 comes to its tick budget: the
// wall time of a reading and of a programming run against the number of engine
// ticks they took, each tick being one 10 ms timer interval plus its exchange.
// The KV720 programming order pauses twice for 0.1 s inside a tick (before the
// input and the output calibration values); that wall time has no ticks.
//
//   bench_cli [REPEATS]   (default 5; medians are printed)
#include "engine/module_connection.h"
#include "sim/simulator.h"

#include <QCoreApplication>
#include <QElapsedTimer>
#include <QProcess>
#include <QRegularExpression>
#include <QTemporaryDir>

#include <algorithm>
#include <cstdio>
#include <vector>

namespace {

constexpr int BenchPort = 1;

struct Sample {
    qint64 processMs = 0;  // kv700-cli from start to exit
    qint64 sessionMs = 0;  // connect to end of the run, as kv700-cli measured it
    int ticks = 0;
};

bool runCli(const QStringList& command, Sample& sample) {
    QProcess process;
    QElapsedTimer clock;
    clock.start();
    process.start(QStringLiteral(KV700_CLI_PATH),
                  QStringList{"--verbose", "--port", QString::number(BenchPort)} + command);
    if (!process.waitForFinished(300000) || process.exitCode() != 0) {
        std::fprintf(stderr, "kv700-cli %s failed:\n%s\n", qPrintable(command.join(' ')),
                     process.readAllStandardError().right(2000).constData());
        return false;
    }
    sample.processMs = clock.elapsed();
    static const QRegularExpression figures(QStringLiteral("Engine ticks: (\\d+) in (\\d+) ms"));
    const QRegularExpressionMatch match =
        figures.match(QString::fromUtf8(process.readAllStandardError()));
    if (!match.hasMatch())
        return false;
    sample.ticks = match.captured(1).toInt();
    sample.sessionMs = match.captured(2).toLongLong();
    return true;
}

template <typename T>
T median(std::vector<T> values) {
    std::sort(values.begin(), values.end());
    return values[values.size() / 2];
}

void report(const char* name, const std::vector<Sample>& samples) {
    std::vector<qint64> process;
    std::vector<qint64> session;
    std::vector<int> ticks;
    for (const Sample& s : samples) {
        process.push_back(s.processMs);
        session.push_back(s.sessionMs);
        ticks.push_back(s.ticks);
    }
    const int t = median(ticks);
    const double budget = t * double(kv::RunIntervalMs);
    std::printf("%-12s %6d %10.0f %10lld %8.3f %10lld %8.3f\n", name, t, budget,
                static_cast<long long>(median(session)), median(session) / budget,
                static_cast<long long>(median(process)), median(process) / budget);
}

}  // namespace

int main(int argc, char** argv) {
    QCoreApplication app(argc, argv);
    const int repeats = argc > 1 ? std::max(1, atoi(argv[1])) : 5;
    QTemporaryDir work;
    qputenv("KV700_PORT_DIR", QFile::encodeName(work.path()));

    kv::sim::SimOptions options;
    options.module.typeCode = 4;  // KV720-20
    kv::sim::Simulator sim(options);
    QString error;
    if (!sim.start(error) || !sim.publishAsPort(BenchPort, error)) {
        std::fprintf(stderr, "simulator: %s\n", qPrintable(error));
        return 1;
    }

    const QString file = work.filePath(QStringLiteral("bench.kv7"));
    std::vector<Sample> reads;
    std::vector<Sample> programs;
    for (int i = 0; i < repeats; ++i) {
        Sample read;
        Sample program;
        if (!runCli({"read", "--out", file}, read) || !runCli({"program", file}, program))
            return 1;
        reads.push_back(read);
        programs.push_back(program);
    }
    std::printf("KV720 on the simulator, median of %d runs (identification included)\n", repeats);
    std::printf("%-12s %6s %10s %10s %8s %10s %8s\n", "run", "ticks", "ticks*10ms", "session",
                "ratio", "process", "ratio");
    report("reading", reads);
    report("programming", programs);
    return 0;
}
