/// @file
#pragma once

#include <atomic>
#include <cstdint>
#include <functional>
#include <optional>
#include <string>

#include "ChronyFeed.h"
#include "Clock/LocalTime.h"
#include "ConfigReload.h"
#include "Failure.h"
#include "Journal.h"
#include "Json.h"
#include "LiveView.h"
#include "Metrics/Metrics.h"
#include "PlugIn.h"
#include "Record.h"
#include "RunOptions.h"
#include "Schema.h"
#include "Signals.h"
#include "Status/StatusPage.h"
#include "Status/StatusSocket.h"

namespace vantelhost {

/// A run of the program: the plug-in from loading to unloading, and where its news go. Single use.
class Run {
public:
    /// Reads the configuration again: see rereadConfig().
    using Reread = std::function<ConfigChange(const Schema& schema, const Json& settings)>;

    /// @param configText the content of the configuration file, if it is a JSON object
    /// @param signals    made before any thread
    /// Throws UsageError.
    Run(const RunOptions& options, std::optional<std::string> configText, Signals& signals,
        Reread reread);

    /// Throws UsageError.
    /// @return the exit status.
    int execute();

private:
    EventSink output();

    /// Ends the run. From any thread.
    void loseOutput(const std::string& reason);
    bool endsWell() const;

    /// @return false when there is none; the journal then knows why.
    bool readSchema(const PlugIn& plugIn, Schema& schema);
    Json completedSettings(const Schema& schema) const;
    void keepSessions(const PlugIn& plugIn, const Schema& schema);

    /// Reads the configuration again, and tells what it says.
    /// @return new settings, if there are some.
    std::optional<Json> newSettings(const Schema& schema, const Json& settings);

    /// @return an event, if there is something to tell.
    std::optional<Event> handToChrony(std::uint64_t reference, std::uint64_t local);

    /// Mistakes are refused before: an old record is then left as it was, and no address is taken.
    void beginOutputs();

    /// Answers who asks how the run stands.
    void attend();
    void tell(const std::optional<Event>& news);

    /// Sees to what depends on time alone.
    void turn();
    void tellFailure();

    const RunOptions& options_;
    std::optional<std::string> configText_;
    Signals& signals_;
    const Reread reread_;
    const Moment::Clock::time_point begin_ = Moment::Clock::now();
    std::optional<LiveView> view_;
    std::optional<Record> record_;
    std::optional<ChronyFeed> chrony_;
    std::optional<StatusPage> statusPage_;
    std::optional<StatusSocket> statusSocket_;
    std::optional<Metrics> metrics_;
    std::atomic<bool> outputIsLost_{false};
    Journal journal_;
    LocalTime localTime_;
    RunFacts facts_;
    std::uint64_t healedErrors_ = 0;
};

} // namespace vantelhost
