/// @file
/// What lasted from when to when.
#pragma once

#include <cstddef>
#include <string>
#include <vector>

#include "Report/Recording.h"

namespace vantelhost {

/// Times in seconds on the axis of the recording.
struct Span {
    std::size_t row;
    double begin;
    double end;
    std::string label;
};

struct TimeLine {
    std::vector<std::string> rows;
    std::vector<Span> spans; ///< in the order of their beginnings or ends
};

/// A row for each quality; the label is the quality with its reason.
TimeLine qualityTimeLine(const Recording& recording);

/// A row for each health, which is the label.
TimeLine healthTimeLine(const Recording& recording);

/// A row for each port; the label is its state.
TimeLine portTimeLine(const Recording& recording);

/// When the quality was not usable. The label is empty, the row 0.
std::vector<Span> outages(const Recording& recording);

/// The labels, each once, in the order of the spans.
std::vector<std::string> labelsOf(const TimeLine& timeLine);

/// How long the spans of a row last together; 0 when there is no such row.
double timeIn(const TimeLine& timeLine, const std::string& row);

} // namespace vantelhost
