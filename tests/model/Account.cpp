#include "Account.h"

#include <algorithm>
#include <array>
#include <cstdlib>
#include <sstream>

#include <syslog.h>

#include "Promise.h"
#include "Reasons.h"

namespace {

using What = Event::What;

/// Of the script: what the daemon measures once it knows a delay, and before.
constexpr std::uint64_t masterOffset = 7;
/// Epoch offsets are multiples of it.
constexpr std::uint64_t epochUnit = 1000;

constexpr std::array unreachableCodes{-52007, -52012, -52024};
constexpr std::int32_t noOwnSocket = -52006;
constexpr std::int32_t noFifo = -52006;

/// What a thread did, one thing after the other.
class Reader {
public:
    explicit Reader(const Events& events) : events_(events) {}

    bool isAtEnd() const { return next_ == events_.size(); }

    bool isNext(What what, const std::string& beginning = "") const {
        return !isAtEnd() && events_[next_].what == what &&
               events_[next_].text.rfind(beginning, 0) == 0;
    }

    const Event& take() { return events_[next_++]; }

    const Event& expect(What what, const std::string& beginning = "") {
        if (!isNext(what, beginning)) {
            Event wanted;
            wanted.what = what;
            wanted.text = beginning + "...";
            std::ostringstream text;
            text << "expected " << wanted;
            fail(text.str());
        }
        return take();
    }

    [[noreturn]] void fail(const std::string& why) const {
        constexpr std::size_t shown = 12;
        std::ostringstream text;
        text << why << ", after event " << next_ << " of " << events_.size() << ":\n";
        for (std::size_t i = next_ - std::min(next_, shown); i < events_.size() && i <= next_;
             ++i) {
            text << (i == next_ ? "then    " : "        ") << events_[i] << '\n';
        }
        promiseIsBroken(text.str());
    }

    void check(bool holds, const char* otherwise) const {
        if (!holds) {
            fail(otherwise);
        }
    }

private:
    const Events& events_;
    std::size_t next_ = 0;
};

/// @return whether the call did not fail. What it says when it did is read, too.
bool succeeded(Reader& reader, const Event& call, const char* failureLine) {
    if (call.failure == 0) {
        return true;
    }
    const bool isStopping = call.failure == ZEKEL_HOST_IS_STOPPING;
    const Event& log = reader.expect(What::log, isStopping ? line::hostStopping : failureLine);
    reader.check(log.text ==
                     (isStopping ? line::hostStopping : failureLine) + std::to_string(call.failure),
                 "another code than the host's was logged");
    reader.check(log.priority == (isStopping ? LOG_INFO : LOG_ERR), "another priority");
    return false;
}

/// The log line, and the call with the same text.
const Event& readMetaData(Reader& reader, const char* expected = "") {
    const Event& log = reader.expect(What::log, std::string(line::metaData) + expected);
    reader.check(log.priority == LOG_INFO, "another priority");
    const Event& call = reader.expect(What::updateMetaData, expected);
    reader.check(line::metaData + call.text == log.text, "other metadata than was logged");
    return call;
}

/// The polls of a session's worker.
class Worker {
public:
    Worker(const Events& events, const Session& session) : reader_(events), session_(session) {}

    void readAll() {
        while (!reader_.isAtEnd()) {
            if (reader_.isNext(What::log, line::unreachable)) {
                readFailedPoll();
            } else {
                readGoodPoll();
            }
        }
    }

private:
    void readFailedPoll() {
        const Event& log = reader_.take();
        const int code =
            std::atoi(log.text.c_str() + std::char_traits<char>::length(line::unreachable));
        reader_.check(log.priority == LOG_INFO, "another priority");
        reader_.check(std::find(unreachableCodes.begin(), unreachableCodes.end(), code) !=
                              unreachableCodes.end() ||
                          (code == noOwnSocket && session_.ownPathWasTaken),
                      "a poll failed with a code that nothing here explains");
        const Event& quality = reader_.expect(What::setTRQuality, reason::unreachable);
        reader_.check(!quality.usable, "usable while unreachable");
        if (succeeded(reader_, quality, line::hostFailed)) {
            succeeded(reader_, readMetaData(reader_, nothingKnown), line::hostFailed);
        }
    }

    void readGoodPoll() {
        if (!succeeded(reader_, reader_.expect(What::getTime), line::hostFailed)) {
            return;
        }
        bool usable = usable_;
        if (reader_.isNext(What::setTRQuality, reason::role)) {
            const Event& role = reader_.take();
            reader_.check(role.usable != usable_, "a role that has not changed");
            reader_.check(!role.usable ||
                              session_.script.grandmaster != Script::Grandmaster::absent,
                          "usable without a grandmaster");
            usable = role.usable;
            if (!succeeded(reader_, role, line::hostFailed)) {
                return;
            }
        }
        reader_.check(usable || session_.script.grandmaster != Script::Grandmaster::present,
                      "a grandmaster that was not told of");
        if (reader_.isNext(What::log, line::hostFailed + std::to_string(noFifo))) {
            reader_.take();
            reader_.check(session_.fifoWasMissing, "no FIFO, while there was one all the time");
            return;
        }
        std::uint64_t ingressTime = ingressTime_;
        if (reader_.isNext(What::adjustTime) && !readPair(ingressTime)) {
            return;
        }
        if (reader_.isNext(What::log, line::metaData)) {
            const Event& call = readMetaData(reader_);
            reader_.check(call.text != metaData_, "metadata that has not changed");
            if (!succeeded(reader_, call, line::hostFailed)) {
                return;
            }
            metaData_ = call.text;
        }
        reader_.check(metaData_ != nothingKnown, "a good poll, and no metadata");
        usable_ = usable;
        ingressTime_ = ingressTime;
    }

    /// @return whether the host took it.
    bool readPair(std::uint64_t& ingressTime) {
        const Event& pair = reader_.take();
        reader_.check(session_.fifoWasThere, "a pair without a FIFO");
        reader_.check(session_.script.grandmaster != Script::Grandmaster::absent,
                      "a pair without a grandmaster");
        const std::uint64_t difference = pair.localTime - pair.referenceTime;
        const std::uint64_t offset = difference % epochUnit;
        const std::uint64_t epoch = difference - offset;
        reader_.check(offset == 0 || offset == masterOffset,
                      "a pair with another offset than the daemon's");
        reader_.check(epoch >= epoch_, "an epoch offset that was replaced before");
        epoch_ = epoch;
        ingressTime = pair.localTime - epoch;
        reader_.check(ingressTime != ingressTime_, "a pair of the measurement of before");
        return succeeded(reader_, pair, line::hostFailed);
    }

    Reader reader_;
    const Session& session_;
    // What the host has been told of, poll by poll.
    bool usable_ = false;
    std::string metaData_ = nothingKnown;
    std::uint64_t epoch_ = 0;
    std::uint64_t ingressTime_ = 0;
};

bool isWatchdog(const Events& events) {
    return events.front().what == What::setTRQuality && events.front().text == reason::died;
}

void readWatchdog(const Events& events, const Session& session) {
    Reader reader(events);
    bool isTaken = false;
    while (!isTaken) {
        const Event& death = reader.expect(What::setTRQuality, reason::died);
        reader.check(!death.usable, "usable while dead");
        reader.check(session.daemonEnds(), "the death of a daemon that lives");
        isTaken = succeeded(reader, death, line::deathNotTaken) || reader.isAtEnd();
    }
    reader.check(reader.isAtEnd(), "the watchdog goes on after the death");
}

} // namespace

void expectStartsCalls(const Events& events, const std::array<Answer, 4>& answers) {
    Reader reader(events);
    readMetaData(reader, nothingKnown);
    if (refusalOf(answers.at(static_cast<std::size_t>(What::updateMetaData))).code == 0) {
        const Event& quality = reader.expect(What::setTRQuality, reason::waiting);
        reader.check(!quality.usable, "usable before there is a daemon");
    }
    reader.check(reader.isAtEnd(), "more calls of start");
}

void expectThreadsCalls(const std::vector<Events>& threads, const Session& session) {
    expect(threads.size() <= 2, "more than two threads call");
    unsigned watchdogs = 0;
    for (const Events& events : threads) {
        if (isWatchdog(events)) {
            readWatchdog(events, session);
            ++watchdogs;
        } else {
            Worker(events, session).readAll();
        }
    }
    expect(threads.size() < 2 || watchdogs == 1, "two workers, or two watchdogs");
}
