#include "sim/simulator.h"

#include "sim/sim_frame.h"
#include "sim/sim_module.h"
#include "sim/sim_port_link.h"
#include "sim/sim_pty.h"

#include <cerrno>
#include <chrono>
#include <deque>
#include <mutex>
#include <poll.h>
#include <random>
#include <sys/eventfd.h>
#include <thread>
#include <unistd.h>

namespace kv::sim {

namespace {
using Clock = std::chrono::steady_clock;
using std::chrono::milliseconds;

// A self-test sends ten priming blocks right before its request; an ordinary
// exchange sends its priming blocks after the request.
constexpr int SelfTestPriming = 10 * 16;
constexpr int PrimingToRelease = 16;
// The tail after a self-test: a few bytes at a time, closer together than the
// program's 10 ms gap between bytes, so its reads never come back empty.
constexpr int TailBytes = 2;
constexpr int TailStepMs = 5;
// A demonstration runs for hours; the log keeps the recent past.
constexpr std::size_t LogLimit = 10000;
constexpr std::size_t LogDrop = 1000;

struct Outgoing {
    Clock::time_point due;
    QByteArray bytes;
};
}  // namespace

struct Simulator::State {
    // Set up by start() and stop(); the scanner belongs to the thread.
    PseudoTerminal pty;
    FrameScanner scanner;
    Clock::time_point started;
    int stopFd = -1;  // readable once stop() wants the thread to end
    std::thread thread;

    mutable std::mutex mutex;  // guards everything below it
    SimOptions options;
    std::unique_ptr<SimModule> module;
    SimFaults faults;
    int faultFrames = 0;
    std::vector<SimLogEntry> log;
    qint64 logged = 0;
    int frames = 0;
    int ignored = 0;
    int priming = 0;
    std::deque<Outgoing> outgoing;
    QByteArray awaitingPriming;  // a type-1 adapter's reply held until priming follows
    int primingSinceFrame = 0;
    int primingRun = 0;  // priming bytes since the last frame or other byte
    std::mt19937 random;
    PortLink link;
    PortLock lock;

    qint64 msecNow() const {
        return std::chrono::duration_cast<milliseconds>(Clock::now() - started).count();
    }

    void run();
    void handleEvents(const std::vector<FrameScanner::Event>& events);
    void handleFrame(const Request& request);
    void append(SimLogEntry entry);
    void noteIgnored(const QByteArray& bytes);
    void notePriming(int count);
    void schedule(QByteArray reply);
    void scheduleSelfTestTail(Clock::time_point from);
    bool flushOutgoing(int& waitMs);
};

Simulator::Simulator(SimOptions options) : d(new State) {
    d->options = options;
    d->faults = options.faults;
    d->random.seed(options.seed);
    d->module = std::make_unique<SimModule>(options.module);
    d->module->setTrimVerdict(options.trimVerdict);
    d->module->holdReading(options.heldReading);
}

Simulator::~Simulator() {
    stop();
}

bool Simulator::start(QString& error) {
    if (isRunning())
        return true;
    if (!d->pty.open(error))
        return false;
    d->stopFd = eventfd(0, EFD_NONBLOCK | EFD_CLOEXEC);
    if (d->stopFd < 0) {
        error = QStringLiteral("eventfd failed");
        d->pty.close();
        return false;
    }
    d->started = Clock::now();
    d->scanner = FrameScanner();
    d->thread = std::thread([this] { d->run(); });
    return true;
}

void Simulator::stop() {
    if (d->thread.joinable()) {
        const quint64 one = 1;
        (void)!write(d->stopFd, &one, sizeof one);
        d->thread.join();
    }
    std::lock_guard<std::mutex> guard(d->mutex);
    d->link.remove();
    d->lock.release();
    if (d->stopFd >= 0)
        close(d->stopFd);
    d->stopFd = -1;
    d->pty.close();
}

bool Simulator::isRunning() const {
    return d->thread.joinable();
}

QString Simulator::slavePath() const {
    return d->pty.slavePath();
}

bool Simulator::publishAsPort(int port, QString& error) {
    if (!isRunning()) {
        error = QStringLiteral("the simulator is not running");
        return false;
    }
    std::lock_guard<std::mutex> guard(d->mutex);
    return d->link.publish(port, d->pty.slavePath(), error);
}

QString Simulator::portLinkPath() const {
    std::lock_guard<std::mutex> guard(d->mutex);
    return d->link.linkPath();
}

std::vector<SimLogEntry> Simulator::log() const {
    std::lock_guard<std::mutex> guard(d->mutex);
    return d->log;
}

int Simulator::frameCount() const {
    std::lock_guard<std::mutex> guard(d->mutex);
    return d->frames;
}

int Simulator::ignoredBytes() const {
    std::lock_guard<std::mutex> guard(d->mutex);
    return d->ignored;
}

int Simulator::primingBytes() const {
    std::lock_guard<std::mutex> guard(d->mutex);
    return d->priming;
}

ModuleIdentity Simulator::module() const {
    std::lock_guard<std::mutex> guard(d->mutex);
    return d->module->identity();
}

qint32 Simulator::registerValue(int address) const {
    std::lock_guard<std::mutex> guard(d->mutex);
    return d->module->value(address);
}

void Simulator::setRegisterValue(int address, qint32 value) {
    std::lock_guard<std::mutex> guard(d->mutex);
    d->module->setValue(address, value);
}

QByteArray Simulator::fileName() const {
    std::lock_guard<std::mutex> guard(d->mutex);
    return d->module->fileName();
}

std::vector<qint32> Simulator::table1() const {
    std::lock_guard<std::mutex> guard(d->mutex);
    return d->module->table1();
}

std::vector<qint32> Simulator::tableC() const {
    std::lock_guard<std::mutex> guard(d->mutex);
    return d->module->tableC();
}

std::vector<int> Simulator::calErrors() const {
    std::lock_guard<std::mutex> guard(d->mutex);
    return d->module->calErrors();
}

void Simulator::setCalErrors(const std::vector<int>& errors) {
    std::lock_guard<std::mutex> guard(d->mutex);
    d->module->setCalErrors(errors);
}

void Simulator::setFaults(const SimFaults& faults) {
    std::lock_guard<std::mutex> guard(d->mutex);
    d->faults = faults;
    d->faultFrames = 0;
}

SimFaults Simulator::faults() const {
    std::lock_guard<std::mutex> guard(d->mutex);
    return d->faults;
}

void Simulator::swapModule(const ModuleIdentity& identity) {
    std::lock_guard<std::mutex> guard(d->mutex);
    d->module = d->module->replacedBy(identity);
}

void Simulator::setTrimVerdict(std::optional<qint32> verdict) {
    std::lock_guard<std::mutex> guard(d->mutex);
    d->options.trimVerdict = verdict;
    d->module->setTrimVerdict(verdict);
}

void Simulator::holdReading(std::optional<qint32> reading) {
    std::lock_guard<std::mutex> guard(d->mutex);
    d->options.heldReading = reading;
    d->module->holdReading(reading);
}

bool Simulator::setPortBusy(bool busy, QString& error) {
    std::lock_guard<std::mutex> guard(d->mutex);
    if (!busy) {
        d->lock.release();
        return true;
    }
    if (!isRunning()) {
        error = QStringLiteral("the simulator is not running");
        return false;
    }
    return d->lock.hold(d->pty.slavePath(), error);
}

void Simulator::State::run() {
    char buffer[512];
    for (;;) {
        int waitMs = -1;
        bool wantWrite = false;
        {
            std::lock_guard<std::mutex> guard(mutex);
            wantWrite = flushOutgoing(waitMs);
        }
        pollfd fds[2] = {{pty.masterFd(), short(POLLIN | (wantWrite ? POLLOUT : 0)), 0},
                         {stopFd, POLLIN, 0}};
        if (poll(fds, 2, waitMs) < 0 && errno != EINTR)
            return;
        if (fds[1].revents & POLLIN)
            return;
        if (!(fds[0].revents & POLLIN))
            continue;
        const ssize_t n = read(pty.masterFd(), buffer, sizeof buffer);
        if (n <= 0) {
            // Cannot happen while our own slave descriptor is open; do not spin if it does.
            if (n < 0 && errno != EAGAIN && errno != EINTR)
                std::this_thread::sleep_for(milliseconds(10));
            continue;
        }
        std::vector<FrameScanner::Event> events;
        scanner.feed(QByteArray(buffer, int(n)), events);
        std::lock_guard<std::mutex> guard(mutex);
        handleEvents(events);
    }
}

// Writes what is due; returns whether bytes are waiting for room on the line,
// and sets waitMs to the time until the next bytes fall due (-1: none).
bool Simulator::State::flushOutgoing(int& waitMs) {
    waitMs = -1;
    while (!outgoing.empty()) {
        Outgoing& next = outgoing.front();
        const Clock::time_point now = Clock::now();
        if (next.due > now) {
            waitMs = int(std::chrono::duration_cast<milliseconds>(next.due - now).count()) + 1;
            return false;
        }
        const ssize_t n = write(pty.masterFd(), next.bytes.constData(), size_t(next.bytes.size()));
        if (n < 0)
            return errno == EAGAIN || errno == EINTR;
        next.bytes.remove(0, int(n));
        if (!next.bytes.isEmpty())
            return true;
        outgoing.pop_front();
    }
    return false;
}

void Simulator::State::handleEvents(const std::vector<FrameScanner::Event>& events) {
    for (const FrameScanner::Event& event : events) {
        switch (event.kind) {
        case FrameScanner::Event::Frame:
            handleFrame(event.request);
            break;
        case FrameScanner::Event::Priming:
            notePriming(int(event.bytes.size()));
            break;
        case FrameScanner::Event::Garbage:
            noteIgnored(event.bytes);
            break;
        }
    }
}

void Simulator::State::noteIgnored(const QByteArray& bytes) {
    ignored += int(bytes.size());
    primingRun = 0;
    if (!log.empty() && log.back().kind == SimLogEntry::Ignored) {
        log.back().bytes += bytes;
        return;
    }
    SimLogEntry entry;
    entry.kind = SimLogEntry::Ignored;
    entry.bytes = bytes;
    append(entry);
}

void Simulator::State::append(SimLogEntry entry) {
    if (log.size() >= LogLimit)
        log.erase(log.begin(), log.begin() + LogDrop);
    entry.sequence = logged++;
    entry.msec = msecNow();
    log.push_back(entry);
}

void Simulator::State::notePriming(int count) {
    priming += count;
    primingRun += count;
    if (awaitingPriming.isEmpty())
        return;
    primingSinceFrame += count;
    if (primingSinceFrame >= PrimingToRelease) {
        schedule(awaitingPriming);
        awaitingPriming.clear();
    }
}

void Simulator::State::handleFrame(const Request& request) {
    ++frames;
    const int number = ++faultFrames;
    const bool selfTest = primingRun >= SelfTestPriming;
    primingRun = 0;
    primingSinceFrame = 0;
    awaitingPriming.clear();

    SimLogEntry entry;
    entry.kind = SimLogEntry::Request;
    entry.command = request.command;
    entry.busId = request.busId;
    entry.address = request.address;
    entry.data = request.data;

    if (faults.deadAfter >= 0 && number > faults.deadAfter) {
        entry.outcome = SimLogEntry::Dead;
        append(entry);
        return;
    }
    const SimModule::Answer answer = module->handle(request);
    const bool dropped = (faults.dropEvery > 0 && number % faults.dropEvery == 0) ||
                         (faults.dropFrame > 0 && number == faults.dropFrame);
    entry.outcome = dropped ? SimLogEntry::Dropped : SimLogEntry::Answered;
    append(entry);
    if (faults.swapAfter >= 0 && number == faults.swapAfter)
        module = module->replacedBy(faults.swapTo);
    if (dropped)
        return;

    const bool corrupt = faults.corruptEvery > 0 && number % faults.corruptEvery == 0;
    QByteArray reply = EncodeReply(request, answer.data, answer.status, corrupt);
    std::uniform_int_distribution<int> byteValue(0, 255);
    QByteArray noise;
    while (noise.size() < faults.noiseBytes) {
        const char byte = char(byteValue(random));
        if (byte != Stx)
            noise.append(byte);
    }
    reply.prepend(noise);

    if (options.adapter == 1 && !selfTest) {
        awaitingPriming = reply;
        return;
    }
    schedule(reply);
    if (options.adapter == 1)
        scheduleSelfTestTail(outgoing.back().due);
}

void Simulator::State::schedule(QByteArray reply) {
    Clock::time_point due = Clock::now() + milliseconds(faults.latencyMs);
    const int piece = faults.splitBytes > 0 ? faults.splitBytes : int(reply.size());
    while (!reply.isEmpty()) {
        outgoing.push_back({due, reply.left(piece)});
        reply.remove(0, piece);
        due += milliseconds(faults.splitGapMs);
    }
}

void Simulator::State::scheduleSelfTestTail(Clock::time_point from) {
    const QByteArray tail(TailBytes, PrimingByte);
    for (int ms = TailStepMs; ms <= options.adapterDecayMs; ms += TailStepMs)
        outgoing.push_back({from + milliseconds(ms), tail});
}

}  // namespace kv::sim
