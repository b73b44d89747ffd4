#include "WatchedHost.h"

#include <algorithm>
#include <cstring>
#include <ctime>
#include <new>
#include <stdexcept>
#include <utility>

#include "FastWaits.h"
#include "Questions.h"
#include "Reasons.h"
#include "support/LogFunctions.h"

namespace {

constexpr int momentsOfASlowCall = 20;
/// That of an exception's conversion.
constexpr std::int32_t softwareFault = -52003;
constexpr std::int32_t memoryFull = -52000;

std::atomic<WatchedHost*> current{nullptr};

WatchedHost& host() {
    return *current.load(std::memory_order_relaxed);
}

bool isRecord(const double* quality, const double (&record)[ZEKEL_QUALITY_LENGTH]) {
    return std::equal(quality, quality + ZEKEL_QUALITY_LENGTH, record);
}

void log(int priority, const char* line) {
    host().logged(priority, line);
}

class UnderWay {
public:
    explicit UnderWay(std::atomic<int>& calls) : calls_(calls) {
        calls_.fetch_add(1, std::memory_order_relaxed);
    }
    ~UnderWay() { calls_.fetch_sub(1, std::memory_order_relaxed); }
    UnderWay(const UnderWay&) = delete;
    UnderWay& operator=(const UnderWay&) = delete;

private:
    std::atomic<int>& calls_;
};

} // namespace

// Called by the plug-in.
extern "C" {

void zekel_getTime(void** context, std::uint64_t* time, zeerr_Status* status) {
    timespec now{};
    clock_gettime(CLOCK_REALTIME, &now);
    *time = static_cast<std::uint64_t>(now.tv_sec) * 1000000000 +
            static_cast<std::uint64_t>(now.tv_nsec);
    Event event;
    event.what = Event::What::getTime;
    host().called(event, context, *status);
}

void zekel_adjustTime(void** context, std::uint64_t referenceTime, std::uint64_t localTime,
                      zeerr_Status* status) {
    Event event;
    event.what = Event::What::adjustTime;
    event.referenceTime = referenceTime;
    event.localTime = localTime;
    host().called(event, context, *status);
}

void zekel_setTRQuality(void** context, const double* quality, const char* reason,
                        zeerr_Status* status) {
    Event event;
    event.what = Event::What::setTRQuality;
    event.usable = isRecord(quality, ZEKEL_QUALITY_USABLE);
    event.text = event.usable || isRecord(quality, ZEKEL_QUALITY_UNUSABLE) ? reason : "no record";
    host().called(event, context, *status);
}

void zekel_updateMetaData(void** context, const char* metadataJson, zeerr_Status* status) {
    Event event;
    event.what = Event::What::updateMetaData;
    event.text = metadataJson;
    host().called(event, context, *status);
}

} // extern "C"

Refusal refusalOf(Answer answer) {
    switch (answer) {
    case Answer::error:
        return {-1, ""};
    case Answer::errorWithText:
        return {-52008, R"({"host":"has no room"})"};
    case Answer::stopping:
        return {ZEKEL_HOST_IS_STOPPING, R"({"host":"is going down"})"};
    case Answer::exception:
        return {softwareFault, R"({"error_constant":"zeoskerr_softwareFaultOSKInternalUseOnly",)"
                               R"("file":"exception_errStatus","line":69,"component":"vantel_bc",)"
                               R"("std_exception_what":"no \"way\""})"};
    case Answer::otherException:
        return {softwareFault,
                R"({"error_constant":"zeoskerr_softwareFaultOSKInternalUseOnly",)"
                R"("file":"exception_errStatus","line":74,"component":"vantel_bc"})"};
    case Answer::noMemory:
        return {memoryFull,
                R"({"error_constant":"zeoskerr_memoryFull","file":"exception_errStatus","line":62,)"
                R"("component":"vantel_bc","std_exception_what":"std::bad_alloc"})"};
    case Answer::well:
    case Answer::warning:
    case Answer::slowly:
    case Answer::questions:
        break;
    }
    return {0, ""};
}

const char* nameOf(Answer answer) {
    static constexpr std::array names{
        "well",          "with a warning",    "slowly",
        "and asks",      "with an error",     "with an error's text",
        "stopping",      "with an exception", "with another exception",
        "without memory"};
    return names.at(static_cast<std::size_t>(answer));
}

std::ostream& operator<<(std::ostream& out, const Event& event) {
    switch (event.what) {
    case Event::What::getTime:
        out << "getTime()";
        break;
    case Event::What::adjustTime:
        out << "adjustTime(" << event.referenceTime << ", " << event.localTime << ")";
        break;
    case Event::What::setTRQuality:
        out << "setTRQuality(" << (event.usable ? "usable, " : "unusable, ") << event.text << ")";
        break;
    case Event::What::updateMetaData:
        out << "updateMetaData(" << event.text << ")";
        break;
    case Event::What::log:
        out << "log " << event.priority << ": " << event.text;
        break;
    }
    if (event.failure != 0) {
        out << " = " << event.failure;
    }
    return out;
}

WatchedHost::WatchedHost(const Plugin& plugin) : plugin_(plugin) {
    current = this;
    setLogTaker(log);
}

WatchedHost::~WatchedHost() {
    setLogTaker(nullptr);
    current = nullptr;
}

unsigned WatchedHost::count(What what) const {
    return counts_.at(static_cast<std::size_t>(what)).load(std::memory_order_relaxed);
}

Events WatchedHost::takeOwn() {
    return std::exchange(track(), {});
}

std::vector<Events> WatchedHost::takeOthers() {
    std::vector<Events> others;
    const Events* const own = &track();
    for (Events& events : tracks_) {
        if (&events != own && !events.empty()) {
            others.push_back(std::exchange(events, {}));
        }
    }
    return others;
}

std::string WatchedHost::violation() const {
    const char* const rule = violation_.load(std::memory_order_relaxed);
    return rule == nullptr ? "" : rule;
}

void WatchedHost::called(Event event, void** context, zeerr_Status& status) {
    const UnderWay call(underWay_);
    check(context, status);
    const auto function = static_cast<std::size_t>(event.what);
    const Answer answer = answers_.at(function).load(std::memory_order_relaxed);
    event.failure = refusalOf(answer).code;
    const bool isDeath = event.what == What::setTRQuality && event.text == reason::died;
    const bool isTaken = isDeath && event.failure == 0;
    track().push_back(std::move(event));
    counts_.at(function).fetch_add(1, std::memory_order_relaxed);
    deaths_.fetch_add(isDeath ? 1 : 0, std::memory_order_relaxed);
    deathsTaken_.fetch_add(isTaken ? 1 : 0, std::memory_order_relaxed);
    act(answer, status);
}

void WatchedHost::logged(int priority, const std::string& line) {
    Event event;
    event.what = What::log;
    event.text = line;
    event.priority = priority;
    track().push_back(std::move(event));
    if (line.rfind(line::unreachable, 0) == 0) {
        counts_.at(static_cast<std::size_t>(What::log)).fetch_add(1, std::memory_order_relaxed);
    }
}

Events& WatchedHost::track() {
    thread_local Events* const track =
        &tracks_.at(tracksTaken_.fetch_add(1, std::memory_order_relaxed));
    return *track;
}

void WatchedHost::check(void** context, const zeerr_Status& status) {
    void** const expected = context_.load(std::memory_order_relaxed);
    if (expected == nullptr) {
        violated("a call before start or after stop");
    } else if (context != expected) {
        violated("a call with another context");
    }
    if (status.code != 0 || status.json != nullptr || status.resize == nullptr) {
        violated("a call with a status that is not fresh");
    }
}

void WatchedHost::act(Answer answer, zeerr_Status& status) const {
    switch (answer) {
    case Answer::exception:
        throw std::runtime_error("no \"way\"");
    case Answer::otherException:
        throw 42;
    case Answer::noMemory:
        throw std::bad_alloc();
    case Answer::slowly:
        for (int i = 0; i < momentsOfASlowCall; ++i) {
            passAMoment();
        }
        break;
    case Answer::questions:
        expectAnswers(plugin_);
        break;
    case Answer::warning:
        status.code = 1;
        break;
    case Answer::well:
    case Answer::error:
    case Answer::errorWithText:
    case Answer::stopping: {
        const Refusal refusal = refusalOf(answer);
        status.code = refusal.code;
        if (*refusal.text != '\0') {
            status.resize(&status, static_cast<std::uint32_t>(std::strlen(refusal.text) + 1));
            std::strcpy(status.json, refusal.text);
        }
    }
    }
}
