/// @file
/// What is kept of a recording, to be told about.
#pragma once

#include <cstddef>
#include <cstdint>
#include <memory>
#include <optional>
#include <string>
#include <vector>

#include "Json.h"
#include "PairFilter.h"
#include "Report/PairSeries.h"

namespace vantelhost {

/// Seconds are those on the axis of the recording, here and below: since the host's start, or,
/// where that is not recorded, since the first line. They go on over files and runs.
struct StateChange {
    double seconds = 0;
    std::string state; ///< empty: nothing is known any more
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

/// A time of which something is missing, a line that is no event, or a clock that was set.
struct Gap {
    double seconds = 0; ///< its beginning
    double length = 0;  ///< seconds
    std::string text;
};

/// An error, a warning or a refused call; ptp4l's end; a restart; the cause of a run in vain, and
/// its mend.
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
        keep(item);
        ++count_;
    }

    /// The same, but not counted.
    void keep(const Item& item) {
        if (items_.size() < limit) {
            items_.push_back(item);
        } else if (!fullSince_) {
            fullSince_ = item.seconds;
        }
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
    std::uint64_t lines = 0; ///< that are events
    std::size_t files = 0;
    std::size_t runs = 0;
    bool truncated = false;  ///< the last line is cut
    bool summarised = false; ///< the last host came to its end
    std::uint64_t begin =
        0;               ///< of the axis, in the host's clock at the end: nanoseconds since 1970
    double duration = 0; ///< seconds until the last event
    std::string plugIn;  ///< its name; empty when it was not loaded
    std::string plugInFile;
    std::string stopCause; ///< empty when the host was not stopped
    std::string cause;     ///< why the run was in vain; empty when it was not, or was not told
    std::string mend;      ///< what to do about it
    PairCounts counts;
    /// The measured ones; with only zeros, those of offset 0. Not null.
    std::unique_ptr<PairSeries> pairs = std::make_unique<PairSeries>();
    First<StateChange> qualities; ///< only what differs from the one before
    First<StateChange> healths;   ///< none where the host told none
    First<PortChange> portChanges;
    First<Problem> problems;
    First<Gap> gaps;
    std::size_t errors = 0;
    std::size_t warnings = 0;
    std::size_t refused = 0;
    std::size_t restarts = 0;     ///< of the plug-in's session
    std::size_t epochOffsets = 0; ///< how often one was written
    std::int64_t epochOffset = 0; ///< the last one, nanoseconds
    std::optional<ChronyCount> chrony;
    Json configuration = Json::value_t::null; ///< an object, or null
    Json metadata = Json::value_t::null;      ///< the last valid one: an object, or null
};

} // namespace vantelhost
