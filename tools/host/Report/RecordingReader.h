/// @file
#pragma once

#include <cstdint>
#include <istream>
#include <string>
#include <string_view>

#include "Json.h"
#include "Moment.h"
#include "Report/LineReader.h"
#include "Report/RecordAxis.h"
#include "Report/RecordingBuilder.h"

namespace vantelhost {

/// Reads a record of "run --record": one file, or several in their order, each with a run, a part
/// of one, or several. Lines that are no events are left out and told as gaps.
class RecordingReader {
public:
    /// Throws UsageError for a file that has lines but no event, and when reading fails.
    /// @param name of the stream, for people
    void read(std::istream& stream, const std::string& name);

    /// There are no more files. To be called once.
    Recording finish();

private:
    void beginFile(const std::string& name);
    void endFile() const;
    void takeLine(const LineReader::Line& line);
    void takeText(std::string_view text);
    void place(const std::string& event, const Json& line, const Moment& moment);
    void follow(const Moment& moment);
    void beginRun(const Moment& moment, std::uint64_t begin, bool fromStart);
    void takeContinued(const Json& line, const Moment& moment);
    void tell(const std::string& text, double length = 0);
    void leaveOut(const std::string& problem);

    RecordingBuilder builder_;
    RecordAxis axis_;
    std::string name_;
    std::uint64_t lineNumber_ = 0;
    bool hasEvent_ = false;      ///< this file
    std::string firstProblem_;   ///< of this file
    std::uint64_t runBegin_ = 0; ///< what tells the present run from others
    std::uint64_t part_ = 0;     ///< of it
};

} // namespace vantelhost
