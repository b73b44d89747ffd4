/// @file
/// What is kept of a recording, to be told about.
#pragma once

#include <cstddef>
#include <cstdint>
#include <optional>
#include <string>
#include <vector>

#include "Json.h"
#include "PairFilter.h"

namespace vantelhost {

/// A time pair. Seconds are those since the host's start, here and below.
struct Pair {
    double seconds = 0;
    std::uint64_t ingress = 0; ///< of the Sync: nanoseconds modulo 2^64, without the epoch offset
    std::int64_t offset = 0;   ///< local minus reference, nanoseconds
    std::int64_t delay = 0;    ///< from the ingress to the call in the host's clock, nanoseconds
};

struct QualityChange {
    double seconds = 0;
    std::string quality;
    std::string reason;
};

struct PortChange {
    double seconds = 0;
    std::string port;
    std::string state; ///< empty: the port is not there any more
};

/// How many pairs chronyd got.
struct ChronyCount {
    std::uint64_t sent;
    std::uint64_t failed;
};

/// An error, a warning or a refused call; ptp4l's end; the cause of a run in vain, and its mend.
struct Problem {
    double seconds = 0;
    std::string kind;
    std::string text;
};

/// The first ones of something; what comes later is counted only.
template <typename Item>
class First {
public:
    void add(const Item& item) {
        if (items_.size() < limit) {
            items_.push_back(item);
        } else if (!fullSince_) {
            fullSince_ = item.seconds;
        }
        ++count_;
    }

    const std::vector<Item>& items() const { return items_; }
    std::size_t count() const { return count_; }

    /// When the first one came that is not kept.
    std::optional<double> fullSince() const { return fullSince_; }

private:
    static constexpr std::size_t limit = 5000;
    std::vector<Item> items_;
    std::size_t count_ = 0;
    std::optional<double> fullSince_;
};

struct Recording {
    std::uint64_t lines = 0;
    bool truncated = false;  ///< the last line is cut
    bool summarised = false; ///< the host came to its end
    std::uint64_t begin = 0; ///< the host's start in its clock: nanoseconds since 1970
    double duration = 0;     ///< seconds until the last event
    std::string plugIn;      ///< its name; empty when it was not loaded
    std::string plugInFile;
    std::string stopCause; ///< empty when the host was not stopped
    std::string cause;     ///< why the run was in vain; empty when it was not, or was not told
    std::string mend;      ///< what to do about it
    PairCounts counts;
    std::vector<Pair> pairs;        ///< the measured ones; with only zeros, those of offset 0
    First<QualityChange> qualities; ///< only what differs from the one before
    First<PortChange> portChanges;
    First<Problem> problems;
    std::size_t errors = 0;
    std::size_t warnings = 0;
    std::size_t refused = 0;
    std::size_t epochOffsets = 0; ///< how often one was written
    std::int64_t epochOffset = 0; ///< the last one, nanoseconds
    std::optional<ChronyCount> chrony;
    Json configuration = Json::value_t::null; ///< an object, or null
    Json metadata = Json::value_t::null;      ///< the last valid one: an object, or null
};

} // namespace vantelhost
