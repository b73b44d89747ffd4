#include "Journal.h"

#include <algorithm>
#include <cerrno>
#include <utility>

#include "Text.h"

namespace vantelhost {

namespace {

/// Two's complement: the modulo difference read as a signed number.
std::int64_t difference(std::uint64_t local, std::uint64_t reference) {
    return static_cast<std::int64_t>(local - reference);
}

/// An output that is lost with the first event that it does not take.
EventTaker untilLost(EventSink output, std::function<void(const std::string&)> onLost) {
    return [output = std::move(output), onLost = std::move(onLost), lost = false](
               const Event& event, const Moment& moment) mutable -> std::optional<Event> {
        if (lost || output(event, moment)) {
            return std::nullopt;
        }
        const std::string reason = errorText(errno);
        lost = true;
        onLost(reason);
        return failureEvent("output", reason);
    };
}

} // namespace

Journal::Journal(EventSink output, std::function<void(const std::string&)> onLostOutput,
                 Moment::Clock::time_point begin)
    : begin_(begin) {
    outputs_.push_back(untilLost(std::move(output), std::move(onLostOutput)));
}

void Journal::addOutput(EventTaker output) {
    outputs_.push_back(std::move(output));
    const auto events = early_.value();
    for (const auto& [event, moment] : events) {
        if (const auto news = outputs_.back()(event, moment)) {
            tell({*news}, moment);
        }
    }
}

void Journal::outputsAreComplete() {
    early_.reset();
}

void Journal::handPairsTo(PairTaker taker) {
    pairTaker_ = std::move(taker);
}

void Journal::carryPairsBy(LocalCarrier carrier) {
    carrier_ = std::move(carrier);
}

void Journal::note(const Event& event) {
    const std::lock_guard lock(mutex_);
    print(event);
}

void Journal::error(const Event& event) {
    const std::lock_guard lock(mutex_);
    ++tally_.errors;
    print(event);
}

void Journal::quality(const double* quality, const std::string& reason, bool expected) {
    const Event event = qualityEvent(quality, reason);
    const std::lock_guard lock(mutex_);
    lastCall_ = Moment::Clock::now();
    if (expected) {
        print(expectedEvent(event));
        return;
    }
    if (event.text != lastQuality_) {
        ++tally_.qualityChanges;
        lastQuality_ = event.text;
    }
    tally_.wasUsable = tally_.wasUsable || event.members["quality"] == "usable";
    print(event);
}

void Journal::pair(std::uint64_t reference, std::uint64_t local) {
    const std::lock_guard lock(mutex_);
    lastCall_ = Moment::Clock::now();
    const Moment moment = Moment::now(begin_);
    const std::int64_t offset = difference(local, reference);
    const PairKind kind = judge(local, offset, moment);
    const auto carried = carry(kind, local);
    tally_.offsets.add(offset);
    pass(pairEvent(reference, local, offset, kind, carried.time), moment);
    tellHealth(moment);
    if (carried.news) {
        tell({*carried.news}, moment);
    }
    if (kind != PairKind::measured) {
        ++tally_.leftOut[leftOutWord(kind)];
    } else if (pairTaker_ && carried.time) {
        if (const auto news = pairTaker_(reference, carried.time->realtime)) {
            tell({*news}, moment);
        }
    }
}

PairKind Journal::judge(std::uint64_t local, std::int64_t offset, const Moment& moment) {
    const PairKind kind = trust_.pair(local, offset, moment);
    // The pair itself may have made it good.
    health_.pair(kind, moment.seconds);
    return kind == PairKind::measured && !isGood(health_.state(moment.seconds))
               ? PairKind::unhealthy
               : kind;
}

PairCarrier::Result Journal::carry(PairKind kind, std::uint64_t local) const {
    if (!carrier_) {
        return {Carried{local, 0, false}, std::nullopt};
    }
    return kind == PairKind::of1970 ? PairCarrier::Result() : carrier_(local);
}

void Journal::metadata(const std::string& text, bool expected) {
    const Json metadata = Json::parse(text, nullptr, false);
    if (!metadata.is_object()) {
        error(invalidMetadataEvent(text));
        return;
    }
    const Event event = metadataEvent(metadata);
    const std::lock_guard lock(mutex_);
    lastCall_ = Moment::Clock::now();
    if (expected) {
        print(expectedEvent(event));
        return;
    }
    ++tally_.metadataUpdates;
    tally_.hasPorts = std::any_of(metadata.begin(), metadata.end(),
                                  [](const Json& member) { return member.is_object(); });
    print(event);
}

void Journal::timeRequest() {
    const std::lock_guard lock(mutex_);
    lastCall_ = Moment::Clock::now();
    ++tally_.timeRequests;
}

void Journal::refusal(const std::string& function) {
    const std::lock_guard lock(mutex_);
    lastCall_ = Moment::Clock::now();
    ++tally_.refused;
    print(refusedEvent(function));
}

void Journal::turn() {
    const std::lock_guard lock(mutex_);
    tellHealth(Moment::now(begin_));
}

Standing Journal::health() const {
    const std::lock_guard lock(mutex_);
    return health_.standing(Moment::now(begin_).seconds);
}

double Journal::sinceLastCall() const {
    const std::lock_guard lock(mutex_);
    return std::chrono::duration<double>(Moment::Clock::now() - lastCall_).count();
}

void Journal::summary() {
    const std::lock_guard lock(mutex_);
    print(summaryEvent(Moment::now(begin_).seconds, tally_));
}

bool Journal::isClean() const {
    const std::lock_guard lock(mutex_);
    return tally_.errors == 0;
}

Tally Journal::tally() const {
    const std::lock_guard lock(mutex_);
    return tally_;
}

void Journal::print(const Event& event) {
    const Moment moment = Moment::now(begin_);
    pass(event, moment);
    tellTrust(event);
    health_.take(event, moment.seconds);
    tellHealth(moment);
}

void Journal::tellTrust(const Event& event) {
    if (event.name == "quality") {
        trust_.quality(event.members["quality"].get_ref<const std::string&>(),
                       event.members["reason"].get_ref<const std::string&>());
    } else if (event.name == "epoch-offset") {
        trust_.epochOffset(event.members["offset"]);
    } else if (event.name == "initialised") {
        trust_ = {};
    }
}

void Journal::tellHealth(const Moment& moment) {
    if (const auto event = health_.change(moment.seconds)) {
        pass(*event, moment);
    }
}

void Journal::pass(const Event& event, const Moment& moment) {
    if (early_) {
        early_->emplace_back(event, moment);
    }
    std::vector<Event> news;
    for (auto& output : outputs_) {
        if (auto told = output(event, moment)) {
            news.push_back(std::move(*told));
        }
    }
    tell(news, moment);
}

void Journal::tell(const std::vector<Event>& news, const Moment& moment) {
    for (const auto& event : news) {
        tally_.errors += event.name == "error" ? 1U : 0U;
        pass(event, moment);
    }
}

} // namespace vantelhost
