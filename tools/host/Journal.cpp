#include "Journal.h"

#include <utility>

namespace vantelhost {

namespace {

/// Two's complement: the modulo difference read as a signed number.
std::int64_t difference(std::uint64_t local, std::uint64_t reference) {
    return static_cast<std::int64_t>(local - reference);
}

} // namespace

Journal::Journal(EventPrinter printer, std::function<void()> onLostOutput)
    : printer_(printer), onLostOutput_(std::move(onLostOutput)) {}

void Journal::note(const Event& event) {
    const std::lock_guard lock(mutex_);
    print(event);
}

void Journal::error(const Event& event) {
    const std::lock_guard lock(mutex_);
    ++tally_.errors;
    print(event);
}

void Journal::quality(const double* quality, const std::string& reason) {
    const Event event = qualityEvent(quality, reason);
    const std::lock_guard lock(mutex_);
    if (event.text != lastQuality_) {
        ++tally_.qualityChanges;
        lastQuality_ = event.text;
    }
    print(event);
}

void Journal::pair(std::uint64_t reference, std::uint64_t local) {
    const std::int64_t offset = difference(local, reference);
    const Event event = pairEvent(reference, local, offset);
    const std::lock_guard lock(mutex_);
    tally_.offsets.add(offset);
    print(event);
}

void Journal::metadata(const std::string& text) {
    const Json metadata = Json::parse(text, nullptr, false);
    if (!metadata.is_object()) {
        error(invalidMetadataEvent(text));
        return;
    }
    const Event event = metadataEvent(metadata);
    const std::lock_guard lock(mutex_);
    ++tally_.metadataUpdates;
    print(event);
}

void Journal::timeRequest() {
    const std::lock_guard lock(mutex_);
    ++tally_.timeRequests;
}

void Journal::refusal() {
    const std::lock_guard lock(mutex_);
    ++tally_.refused;
}

void Journal::summary() {
    const std::lock_guard lock(mutex_);
    print(summaryEvent(printer_.seconds(), tally_));
}

bool Journal::isClean() const {
    const std::lock_guard lock(mutex_);
    return tally_.errors == 0 && !outputLost_;
}

Tally Journal::tally() const {
    const std::lock_guard lock(mutex_);
    return tally_;
}

void Journal::print(const Event& event) {
    if (!outputLost_ && !printer_.print(event)) {
        outputLost_ = true;
        onLostOutput_();
    }
}

} // namespace vantelhost
