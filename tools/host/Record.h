/// @file
#pragma once

#include <cstdint>
#include <optional>
#include <string>
#include <utility>
#include <vector>

#include "Events.h"
#include "Moment.h"
#include "RecordFile.h"
#include "Rotation.h"

namespace vantelhost {

struct RecordRules {
    std::uint64_t size = 0; ///< of a file, octets; it then becomes an old one. 0: no limit
    unsigned keep = 9;      ///< so many old ones
    bool append = false;    ///< behind what is in the file; else that is emptied
};

/// Writes every event of a run into a file, a line each, in one piece and at once. What cannot be
/// written is counted, and tried again as time goes on. Not thread-safe.
///
/// A new file of the same run begins with the event "continued", which holds what is still valid of
/// what was told before: each file can be read alone.
class Record {
public:
    /// Opens the file; leaves what is in it. Throws UsageError.
    Record(std::string path, const RecordRules& rules);

    /// To be called before the first event. Throws UsageError.
    void begin();

    /// @return an event, if there is something to tell: it cannot be written, or it can again, or
    /// no new file can be begun. It is taken as others are.
    std::optional<Event> take(const Event& event, const Moment& moment);

private:
    std::optional<Event> rotateIfFull(std::size_t size);
    bool write(const std::string& text);
    std::string head(const Moment& moment) const;
    void remember(const Event& event);
    std::optional<Event> lose(const std::string& problem, double seconds);
    Event recovered(double seconds);
    std::string name() const { return "record " + path_; }

    std::string path_;
    RecordRules rules_;
    RecordFile file_;
    Rotation rotation_;
    std::uint64_t size_ = 0;     ///< of the file
    std::uint64_t rotateAt_ = 0; ///< of its size
    bool isCut_ = false;         ///< the last line has no end
    bool isFresh_ = true;        ///< this run has no line in the file
    bool needsHead_ = false;
    std::uint64_t part_ = 0;                          ///< of this run
    std::uint64_t begin_ = 0;                         ///< of the host, nanoseconds since 1970
    bool hasBegun_ = false;                           ///< an event has come
    std::uint64_t lost_ = 0;                          ///< events since it cannot be written
    double lostSince_ = 0;                            ///< seconds
    double retryAt_ = 0;                              ///< seconds
    std::string problem_;                             ///< why
    bool cannotRotate_ = false;                       ///< told already
    std::vector<std::pair<std::string, Json>> state_; ///< the last events that are still valid
};

} // namespace vantelhost
