#include "Soak.h"

#include <algorithm>
#include <cstdio>
#include <utility>

#include <fmt/format.h>
#include <unistd.h>

#include "Plan.h"
#include "support/Processes.h"

namespace {

// Averages of resident memory differ by so much from what the allocator keeps for later.
constexpr double memoryAllowance = 256; // KiB
// A socket, the FIFO at both ends, and one of them anew.
constexpr int descriptorsOfASession = 4;

double warmUpOf(int seconds) {
    return std::max(seconds / 10.0, std::min(60.0, seconds / 2.0));
}

unsigned windowOf(int seconds) {
    return static_cast<unsigned>(std::clamp((seconds - warmUpOf(seconds)) / 4, 1.0, 60.0));
}

template <typename... Arguments>
void say(const char* format, const Arguments&... arguments) {
    fmt::print("soak: {}\n", fmt::format(fmt::runtime(format), arguments...));
    std::fflush(stdout);
}

} // namespace

Soak::Soak(Options options, const volatile int& interrupted)
    : options_(std::move(options)),
      interrupted_(interrupted),
      plugIn_(options_.plugIn),
      warmUp_(warmUpOf(options_.seconds)),
      resident_(windowOf(options_.seconds)),
      descriptors_(windowOf(options_.seconds)) {}

bool Soak::run() {
    say("{} s, seed {}, process {}", options_.seconds, options_.seed, getpid());
    Plan plan(options_.seed, options_.seconds);
    SessionPlan session;
    while (failure_.empty() && plan.next(session)) {
        runSession(session);
    }
    judge();
    report();
    return failure_.empty();
}

void Soak::runSession(const SessionPlan& plan) {
    double stopSeconds = 0;
    {
        SessionRun run(plugIn_, host_, plan);
        const std::string failure = run.run(options_.daemon, [this] { return watch(); });
        if (!failure.empty()) {
            say("session {} after {:.1f} s, with this plan:\n{}", sessions_ + 1, run.seconds(),
                textOf(plan));
            fail(failure);
            return;
        }
        stopSeconds = run.stopSeconds();
    }
    takeStock(plan, stopSeconds);
}

bool Soak::watch() {
    if (elapsed() >= nextSample_) {
        nextSample_ = elapsed() + 1;
        const Holdings holdings = Holdings::now();
        if (elapsed() >= warmUp_) {
            resident_.add(elapsed(), static_cast<double>(holdings.resident));
            descriptors_.add(elapsed(), holdings.descriptors);
        }
    }
    if (elapsed() >= nextProgress_) {
        nextProgress_ += 60;
        reportProgress();
    }
    if (interrupted_ != 0) {
        fail("interrupted");
    }
    return failure_.empty();
}

void Soak::takeStock(const SessionPlan& plan, double stopSeconds) {
    // The system lists a thread for a moment after it was joined.
    waitUntil([&] { return sessions_ == 0 || threadCount() <= quietAtStart_.threads; },
              std::chrono::seconds(2));
    quiet_ = Holdings::now();
    if (sessions_ == 0) {
        quietAtStart_ = quiet_;
    }
    ++sessions_;
    Stops& stops = endings_[nameOf(plan.ending)];
    ++stops.count;
    stops.longest = std::max(stops.longest, stopSeconds);
    for (const SessionPlan::Fault& fault : plan.faults) {
        ++faults_[fault.kind];
    }
}

void Soak::judge() {
    if (quiet_.descriptors > quietAtStart_.descriptors) {
        fail("descriptors are held beyond sessions");
    }
    if (quiet_.threads > quietAtStart_.threads) {
        fail("threads are held beyond sessions");
    }
    if (descriptors_.peak() > quietAtStart_.descriptors + descriptorsOfASession) {
        fail("a session holds too many descriptors");
    }
    if (options_.skipMemory.empty() && resident_.growth() > memoryAllowance) {
        fail("resident memory grew");
    }
}

void Soak::fail(const std::string& what) {
    if (failure_.empty()) {
        failure_ = what;
    }
}

double Soak::elapsed() const {
    return std::chrono::duration<double>(Clock::now() - begin_).count();
}

void Soak::reportProgress() const {
    const SoakHost::Counts counts = host_.counts();
    const Holdings now = Holdings::now();
    say("{:4.0f} min: {} sessions, {} polls, {} failed polls, {} pairs; {} KiB, {} descriptors",
        elapsed() / 60, sessions_, counts.polls, counts.failed, counts.pairs, now.resident,
        now.descriptors);
}

void Soak::report() const {
    const SoakHost::Counts counts = host_.counts();
    say("");
    say("{:.0f} s, seed {}", elapsed(), options_.seed);
    say("polls          {} good, {} failed", counts.polls, counts.failed);
    say("pairs          {}", counts.pairs);
    say("reports        {} usable, {} deaths of the daemon, {} metadata", counts.usable,
        counts.deaths, counts.metaData);
    say("log            {} lines, {} of them errors", counts.logLines, counts.logErrors);
    reportFaults();
    reportHoldings();
    say("{}", failure_.empty() ? "passed" : "FAILED: " + failure_);
}

void Soak::reportFaults() const {
    std::uint64_t total = 0;
    for (const auto& [kind, count] : faults_) {
        total += count;
    }
    say("faults         {} survived, {} calls failed by the host", total, host_.counts().misdeeds);
    for (const auto& [kind, count] : faults_) {
        say("  {:<20} {:>6}", kind, count);
    }
    say("sessions       {}, each with a daemon of its own; they ended", sessions_);
    for (const auto& [ending, stops] : endings_) {
        say("  {:<20} {:>6}   longest stop {:5.2f} s", ending, stops.count, stops.longest);
    }
}

void Soak::reportHoldings() const {
    say("memory         {:.0f} KiB after {:.0f} s, {:.0f} KiB at the end, peak {:.0f} KiB",
        resident_.start(), warmUp_, resident_.end(), resident_.peak());
    say("               growth {:.0f} KiB of {:.0f} allowed, slope {:.0f} KiB an hour",
        resident_.growth(), memoryAllowance, resident_.perHour());
    if (!options_.skipMemory.empty()) {
        say("               not judged: {}", options_.skipMemory);
    }
    say("descriptors    {} after the first session, {} after the last, peak {:.0f} of {} allowed",
        quietAtStart_.descriptors, quiet_.descriptors, descriptors_.peak(),
        quietAtStart_.descriptors + descriptorsOfASession);
    say("threads        {} after the first session, {} after the last", quietAtStart_.threads,
        quiet_.threads);
}
