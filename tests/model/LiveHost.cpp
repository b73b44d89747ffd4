#include "LiveHost.h"

#include <chrono>
#include <csignal>
#include <cstdlib>
#include <filesystem>
#include <functional>
#include <thread>

#include <sys/syscall.h>
#include <sys/wait.h>
#include <unistd.h>

#include "Account.h"
#include "Promise.h"
#include "Questions.h"
#include "Reasons.h"
#include "support/Descriptors.h"
#include "support/Processes.h"
#include "support/TemporaryFolder.h"

namespace {

const std::string configuration =
    R"({"neighborPropDelayThreshold":20000000,"logAnnounceInterval":1,"logSyncInterval":-3,)"
    R"("priority1":127,"priority2":126,"offsetScaledLogVariance":65535,)"
    R"("udsAddress":"ptp4l.sock","transportSpecific":"0x0","syncReceiptTimeout":0,)"
    R"("assumeTwoStep":false,"pathTraceEnabled":false,"followUpInfo":false,)"
    R"("networkTransport":"UDPv4","delayMechanism":"E2E","configFile":"ptp4l.conf",)"
    R"("ptpDstMac":"01:00:5e:00:01:81","interface":)";

constexpr std::chrono::seconds patience{20};
constexpr std::int64_t betweenOffsets = 1000000;

constexpr char noThread[] = R"({"error_constant":"zeoskerr_softwareFaultOSKInternalUseOnly",)"
                            R"("file":"exception_errStatus","line":69,"component":"vantel_bc",)"
                            R"("std_exception_what":"Resource temporarily unavailable"})";

std::string ownSocket() {
    return "ptp4lTimeRef." + std::to_string(getpid());
}

/// In this thread or in one of its own, which has ended then.
void run(bool inAnotherThread, const std::function<void()>& call) {
    if (!inAnotherThread) {
        return call();
    }
    std::thread(call).join();
}

void await(const std::function<bool()>& condition, const char* otherwise) {
    const auto end = std::chrono::steady_clock::now() + patience;
    while (!condition()) {
        expect(std::chrono::steady_clock::now() < end, otherwise);
        passAMoment();
    }
}

void signalDaemon(int signal) {
    for (const pid_t child : children()) {
        kill(child, signal);
        if (signal != SIGCONT) {
            // Until it has taken it; not when the library knows its end first.
            siginfo_t ignored{};
            waitid(P_PID, static_cast<id_t>(child), &ignored, WEXITED | WSTOPPED | WNOWAIT);
        }
    }
}

void provideDaemon(const Script& script) {
    std::filesystem::remove("ptp4l");
    if (script.life != Script::Life::noProgram) {
        std::filesystem::create_symlink(VANTEL_SIMPTP4L, "ptp4l");
    }
    writeFile("ptp4l.conf.sim", script.text());
}

} // namespace

LiveHost::LiveHost() : host_(plugin_), threads_(settledThreadCount()) {
    descriptors_ = openDescriptors();
    fifo_.emplace();
    // Without SA_RESTART.
    struct sigaction handled {};
    handled.sa_handler = [](int) {};
    sigaction(SIGUSR1, &handled, nullptr);
}

void LiveHost::end(const Model& model) {
    if (model.phase == Model::Phase::running) {
        stop(model, false);
    }
    if (model.phase != Model::Phase::none) {
        finalise();
    }
    expectNoViolation();
    fifo_.reset();
    if (model.ownPathIsTaken) {
        freeOwnPath();
    }
    expect(openDescriptors() == descriptors_, "descriptors are left open");
    expect(!hasChildren(), "a child is left");
    expect(waitUntil([this] { return threadCount() <= threads_; }), "threads are left");
    expect(!std::filesystem::exists(ownSocket()), "the library's socket is left");
}

void LiveHost::initialiseInVain(const char* text, const Refusal& refusal,
                                const std::string& logLine) {
    host_.takeOwn();
    HostStatus status;
    plugin_.initialize(&slot_, text, &status);
    expectStatus(status, refusal.code, refusal.text);
    expect(slot_ == nullptr, "a session in spite of an error");
    const Events events = host_.takeOwn();
    expect(events.size() == (logLine.empty() ? 0 : 1) &&
               (logLine.empty() || events.front().text == logLine),
           "another log than \"" + logLine + '"');
}

void LiveHost::initialise(const std::string& interfaces) {
    HostStatus status;
    plugin_.initialize(&slot_, (configuration + interfaces + '}').c_str(), &status);
    expectStatus(status, 0, "");
    expect(slot_ != nullptr, "no session");
    expectNoViolation();
}

void LiveHost::initialiseWithAnErrorOnEntry() {
    void* const before = slot_;
    HostStatus status(-7, ownError);
    plugin_.initialize(&slot_, (configuration + "[]}").c_str(), &status);
    expectStatus(status, -7, ownError);
    expect(slot_ == before, "a session in spite of an error on entry");
}

void LiveHost::startWithAnErrorOnEntry() {
    HostStatus status(-7, ownError);
    plugin_.start(&slot_, &status);
    expectStatus(status, -7, ownError);
    expectNoViolation();
    expect(!hasChildren(), "a daemon in spite of an error on entry");
}

void LiveHost::start(const Model& model, const Script& script, bool inAnotherThread) {
    const Refusal refusal = model.refusalOfStart();
    expectNoViolation();
    provideDaemon(script);
    deathsBefore_ = host_.deaths();
    deathsTakenBefore_ = host_.deathsTaken();
    host_.expectCallsOf(&slot_);
    run(inAnotherThread, [&] {
        HostStatus status;
        plugin_.start(&slot_, &status);
        expectStatus(status, refusal.code, refusal.text);
        expectStartsCalls(host_.takeOwn(), model.answers);
    });
    if (refusal.code < 0) {
        host_.expectCallsOf(nullptr);
        expect(!hasChildren(), "a daemon in spite of a refusal");
        expectNoViolation();
    }
}

void LiveHost::startWithoutThread(const Model& model, int allowed) {
    expectNoViolation();
    provideDaemon({});
    host_.expectCallsOf(&slot_);
    const ThreadLimit limit(allowed);
    HostStatus status;
    plugin_.start(&slot_, &status);
    host_.expectCallsOf(nullptr);
    expectStatus(status, -52003, noThread);
    expectStartsCalls(host_.takeOwn(), model.answers);
    expect(waitingThreads() == 0, "a thread runs in spite of an error of start");
    expect(!hasChildren(), "a daemon in spite of an error of start");
    Session session;
    session.fifoWasThere = model.hasFifo;
    session.fifoWasMissing = !model.hasFifo;
    session.ownPathWasTaken = model.ownPathIsTaken;
    expectThreadsCalls(host_.takeOthers(), session);
}

void LiveHost::stop(const Model& model, bool inAnotherThread) {
    run(inAnotherThread, [&] { callStop(model); });
    if (model.phase == Model::Phase::running) {
        expectThreadsCalls(host_.takeOthers(), model.session);
    }
    expectNoViolation();
}

void LiveHost::finalise() {
    void* const before = slot_;
    plugin_.finalize(&slot_);
    expect(slot_ == before, "finalize has written the slot");
    slot_ = nullptr;
    expectNoViolation();
}

void LiveHost::writeOffset() {
    lastOffset_ += betweenOffsets;
    fifo_->write({lastOffset_});
}

void LiveHost::killDaemon() {
    signalDaemon(SIGKILL);
}

void LiveHost::freezeDaemon() {
    signalDaemon(SIGSTOP);
}

void LiveHost::thawDaemon() {
    signalDaemon(SIGCONT);
}

void LiveHost::removeOwnSocket() {
    std::filesystem::remove(ownSocket());
}

void LiveHost::takeOwnPath() {
    // The library may bind it anew in between.
    std::error_code error;
    do {
        std::filesystem::remove(ownSocket(), error);
        std::filesystem::create_directory(ownSocket(), error);
    } while (error);
}

void LiveHost::freeOwnPath() {
    std::filesystem::remove(ownSocket());
}

void LiveHost::interruptThreads() {
    for (const auto& thread : std::filesystem::directory_iterator("/proc/self/task")) {
        const pid_t id = std::stoi(thread.path().filename());
        if (id != gettid()) {
            syscall(SYS_tgkill, getpid(), id, SIGUSR1);
        }
    }
}

void LiveHost::awaitPoll() {
    awaitMore(Event::What::getTime, "no poll succeeds");
}

void LiveHost::awaitFailure() {
    awaitMore(Event::What::log, "no poll fails");
}

void LiveHost::awaitPair() {
    awaitMore(Event::What::adjustTime, "no time pair comes");
}

void LiveHost::awaitDeath(bool taken) {
    await(
        [&] {
            return taken ? host_.deathsTaken() > deathsTakenBefore_
                         : host_.deaths() > deathsBefore_;
        },
        "the daemon's death is not told");
}

void LiveHost::expectNoViolation() const {
    const std::string violation = host_.violation();
    expect(violation.empty(), violation);
}

void LiveHost::callStop(const Model& model) {
    const bool willNotEnd = model.phase == Model::Phase::running && !model.session.daemonEnds() &&
                            (model.daemonIsFrozen || model.session.script.ignoresSigterm);
    std::optional<NoGracePeriod> hurry;
    if (willNotEnd) {
        hurry.emplace();
    }
    host_.takeOwn();
    plugin_.stop(&slot_);
    host_.expectCallsOf(nullptr);
    expect(waitingThreads() == 0, "a thread waits after stop");
    expect(host_.callsUnderWay() == 0, "a call is under way after stop");
    const Events events = host_.takeOwn();
    const bool isKilled = !events.empty();
    expect(!isKilled || (events.size() == 1 && willNotEnd &&
                         events.front().text.rfind(line::killing, 0) == 0),
           "a log line of stop: " + (isKilled ? events.front().text : ""));
    expect(isKilled || !model.daemonIsFrozen, "a daemon that does not end is not killed");
    if (isKilled) {
        reapKilledDaemon();
    }
    expect(!hasChildren(), "a child is left after stop");
}

// The library does not wait for it. One that was to ignore SIGTERM may have got it too early for
// that.
void LiveHost::reapKilledDaemon() {
    int status = 0;
    expect(waitpid(-1, &status, 0) > 0 && WIFSIGNALED(status), "the daemon was not killed");
}

void LiveHost::awaitMore(Event::What what, const char* otherwise) const {
    const unsigned before = host_.count(what);
    await([&] { return host_.count(what) > before; }, otherwise);
}
