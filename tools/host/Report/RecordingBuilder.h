/// @file
#pragma once

#include <map>
#include <string>
#include <utility>

#include "Json.h"
#include "PairFilter.h"
#include "Report/PairLine.h"
#include "Report/Recording.h"

namespace vantelhost {

/// Makes a recording of events, in their order. Events and members that it does not know are passed
/// over. Throws where a member has not its type.
class RecordingBuilder {
public:
    /// A run begins, or goes on behind a gap: what was known is not known any more.
    /// @param seconds where it begins
    void interrupt(double seconds);

    /// @param line    the event's members
    /// @param seconds on the axis, as below
    void take(const std::string& event, const Json& line, double seconds);

    /// Something that was told before: it still holds.
    void takeOld(const std::string& event, const Json& line, double seconds);

    void takePair(const PairLine& line, double seconds);

    Recording& recording() { return recording_; }

private:
    void beginSession();
    void takeQuality(const Json& line, double seconds);
    void takeHealth(const Json& line, double seconds);
    void takeMetadata(const Json& line, double seconds);
    void takePorts(std::map<std::string, std::string> states, double seconds);
    void takeProblem(const std::string& kind, const Json& line, double seconds);
    void takeLoss(const Json& line, double seconds);

    Recording recording_;
    PairFilter filter_;
    std::pair<std::string, std::string> lastQuality_; ///< with its reason
    std::string lastHealth_;
    std::map<std::string, std::string> portStates_;
};

} // namespace vantelhost
