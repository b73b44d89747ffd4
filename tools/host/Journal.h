/// @file
#pragma once

#include <cstdint>
#include <functional>
#include <mutex>
#include <string>

#include "EventPrinter.h"
#include "Tally.h"

namespace vantelhost {

/// Takes everything that happens in a run, prints it and sums it up. Thread-safe: lines come out in
/// the order in which they are counted.
class Journal {
public:
    /// @param onLostOutput called once when a line cannot be written; nothing is printed after
    /// that.
    Journal(EventPrinter printer, std::function<void()> onLostOutput);

    /// Something without a count.
    void note(const Event& event);

    /// Something that makes the run unclean.
    void error(const Event& event);

    /// @param quality ZEKEL_QUALITY_LENGTH doubles
    void quality(const double* quality, const std::string& reason);
    void pair(std::uint64_t reference, std::uint64_t local);

    /// A text that is not a JSON object is an error.
    void metadata(const std::string& text);

    void timeRequest();
    void refusal();

    /// Prints the summary.
    void summary();

    /// Whether there was no error and no lost output.
    bool isClean() const;

    Tally tally() const;

private:
    void print(const Event& event);

    mutable std::mutex mutex_;
    EventPrinter printer_;
    std::function<void()> onLostOutput_;
    bool outputLost_ = false;
    std::string lastQuality_;
    Tally tally_;
};

} // namespace vantelhost
