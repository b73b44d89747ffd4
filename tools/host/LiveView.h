/// @file
#pragma once

#include <mutex>
#include <optional>

#include "EventPrinter.h"
#include "Moment.h"
#include "Screen.h"
#include "ViewState.h"

namespace vantelhost {

/// Shows a run on a terminal: while it is open in place, else a line per event. Thread-safe.
class LiveView {
public:
    /// @param terminal not owned.
    /// @param begin    of the run
    LiveView(int terminal, Moment::Clock::time_point begin);

    /// The last picture stays, as plain lines.
    void close();

    /// Opens with the first session. Whether something could be shown.
    bool take(const Event& event, const Moment& moment);

    /// Shows how time goes by. Does nothing when it is not open.
    void refresh();

private:
    double now() const;
    bool draw(double seconds);

    std::mutex mutex_;
    const int terminal_;
    const Moment::Clock::time_point begin_;
    const EventPrinter printer_;
    ViewState state_;
    std::optional<Screen> screen_;
    double drawn_ = 0; ///< when
};

} // namespace vantelhost
