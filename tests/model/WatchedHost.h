/// @file
#pragma once

#include <array>
#include <atomic>
#include <cstdint>
#include <ostream>
#include <string>
#include <vector>

#include <vantel_bc/zekel.h>

#include "contract/PluginFixture.h"

/// How a host answers a call.
enum class Answer {
    well,
    warning,
    slowly,
    questions, ///< asks the library what may be asked at any time, and is well
    error,
    errorWithText,
    stopping,
    exception,
    otherException,
    noMemory
};

/// What an answer makes of the status of start, when it ends it. Code 0: it does not.
struct Refusal {
    std::int32_t code;
    const char* text;
};

Refusal refusalOf(Answer answer);
const char* nameOf(Answer answer);

/// One line of what a thread of the library did: a call of the host, or a line in the log.
struct Event {
    enum class What { getTime, adjustTime, setTRQuality, updateMetaData, log };

    What what{};
    std::int32_t failure = 0; ///< the code of the call, when it failed
    std::string text;         ///< reason, metadata, or the line
    bool usable = false;
    std::uint64_t referenceTime = 0;
    std::uint64_t localTime = 0;
    int priority = 0;
};

using Events = std::vector<Event>;

/// "setTRQuality(unusable, PTP role has changed.)"
std::ostream& operator<<(std::ostream& out, const Event& event);

/// The host's four functions, and the system log. Each thread writes what it does into a track of
/// its own, which is read when the library says that the thread has ended: nothing here puts the
/// library's threads in an order, so that ThreadSanitizer sees what the library itself orders. One
/// at a time.
class WatchedHost {
public:
    using What = Event::What;

    explicit WatchedHost(const Plugin& plugin);
    ~WatchedHost();
    WatchedHost(const WatchedHost&) = delete;
    WatchedHost& operator=(const WatchedHost&) = delete;

    /// From here on calls with this context are expected; null: none.
    void expectCallsOf(void** context) { context_ = context; }

    void answer(What function, Answer answer) {
        answers_.at(static_cast<std::size_t>(function)) = answer;
    }

    /// How many calls of a function there have been. A line of the log counts when a poll has
    /// failed.
    unsigned count(What what) const;

    /// How often the death of the daemon was told, and how often this host took that.
    unsigned deaths() const { return deaths_.load(std::memory_order_relaxed); }
    unsigned deathsTaken() const { return deathsTaken_.load(std::memory_order_relaxed); }

    /// How many calls are under way.
    int callsUnderWay() const { return underWay_.load(std::memory_order_relaxed); }

    /// What this thread did since this was last called.
    Events takeOwn();

    /// The same of all other threads, which must have ended, thread by thread.
    std::vector<Events> takeOthers();

    /// The first call that broke the rules of the interface; empty when there was none.
    std::string violation() const;

    /// For the functions themselves.
    void called(Event event, void** context, zeerr_Status& status);
    void logged(int priority, const std::string& line);

private:
    Events& track();
    void check(void** context, const zeerr_Status& status);
    void violated(const char* rule) { violation_.store(rule, std::memory_order_relaxed); }
    void act(Answer answer, zeerr_Status& status) const;

    static constexpr std::size_t mostThreads = 256;

    const Plugin& plugin_;
    std::atomic<void**> context_{nullptr};
    std::array<std::atomic<Answer>, 4> answers_{};
    std::array<std::atomic<unsigned>, 5> counts_{};
    std::atomic<unsigned> deaths_{0};
    std::atomic<unsigned> deathsTaken_{0};
    std::atomic<int> underWay_{0};
    std::atomic<const char*> violation_{nullptr};
    std::array<Events, mostThreads> tracks_;
    std::atomic<std::size_t> tracksTaken_{0};
};
