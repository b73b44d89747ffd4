/// @file
#pragma once

#include <istream>
#include <map>
#include <string>
#include <utility>

#include "PairFilter.h"
#include "Report/Recording.h"

namespace vantelhost {

/// Reads a record of "run --record", line by line. Events and members that it does not know are
/// passed over.
class RecordingReader {
public:
    /// A last line without its end may be cut.
    /// @param name of the stream, for people
    /// Throws UsageError for a line that is none of a record, and when reading fails.
    static Recording read(std::istream& stream, const std::string& name);

private:
    void take(const Json& line);
    void takeMoment(const Json& line);
    void takePair(const Json& line);
    void takeQuality(const Json& line);
    void takeMetadata(const Json& line);
    void takePorts(const Json& metadata);
    void takeProblem(const std::string& kind, const Json& line);
    void takeOther(const std::string& event, const Json& line);

    Recording recording_;
    PairFilter filter_;
    double seconds_ = 0;                              ///< of the present line
    std::pair<std::string, std::string> lastQuality_; ///< with its reason
    std::map<std::string, std::string> portStates_;
};

} // namespace vantelhost
