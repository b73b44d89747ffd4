/// @file
/// The options of the subcommand "run".
#pragma once

#include <cstdint>
#include <optional>
#include <string>
#include <vector>

#include "BuiltPaths.h"
#include "Metrics/ListenAddress.h"
#include "Record.h"
#include "SettingsOptions.h"

namespace CLI {
class App;
}

namespace vantelhost {

/// An epoch offset to write some time after the start.
struct TimedOffset {
    double seconds;
    std::int64_t nanoseconds;
};

struct RunOptions : SettingsOptions {
    std::optional<double> seconds;
    bool jsonLines = false;
    bool plain = false;     ///< lines also on a terminal
    bool quiet = false;     ///< no lines for pairs and metadata
    std::string recordFile; ///< empty when nothing is recorded
    RecordRules recordRules;
    std::string clock = "auto";            ///< as LocalTime has it
    std::string chronySocket;              ///< empty when chronyd gets nothing
    std::optional<std::int64_t> taiOffset; ///< seconds; nothing: as the kernel has it
    std::string statusSocket;              ///< empty when nobody may ask
    std::optional<ListenAddress> metrics;  ///< where they are served
    bool useFifo = false;
    bool createFifo = false;
    std::string fifo = builtEpochFifo;
    std::optional<std::int64_t> epochOffset;
    std::vector<TimedOffset> timedOffsets; ///< in the order of their times
    bool restart = false;                  ///< after a session that failed begins the next one
    double giveUpAfter = 60; ///< so many seconds lost are a session that failed; 0: never
    bool refuseWhileStopping = false;
    bool force = false; ///< also when somebody listens at "udsAddress"

    /// Whether this host writes epoch offsets into the FIFO.
    bool writesFifo() const { return epochOffset || !timedOffsets.empty(); }
};

/// Adds the options to a command. They are filled when the command line is read.
void addRunOptions(CLI::App& command, RunOptions& options);

} // namespace vantelhost
