/// @file
#pragma once

#include <optional>
#include <string>

#include "Callbacks.h"
#include "ChronyClock.h"
#include "EpochFifo.h"
#include "Failure.h"
#include "HostStatus.h"
#include "Journal.h"
#include "Json.h"
#include "LastWords.h"
#include "LiveView.h"
#include "PlugIn.h"
#include "RecordFile.h"
#include "RunOptions.h"
#include "Schema.h"
#include "Signals.h"

namespace vantelhost {

/// One session of the plug-in, from loading to unloading. Single use.
class Run {
public:
    /// @param configText the content of the configuration file, if there is one
    /// @param signals    made before any thread
    /// Throws UsageError.
    Run(const RunOptions& options, std::optional<std::string> configText, Signals& signals);

    /// Throws UsageError.
    /// @return the exit status.
    int execute();

private:
    EventSink output();

    /// The steps of a run. A step that says false ends the run; the journal then knows why.
    void session();
    bool readSchema(const PlugIn& plugIn, Schema& schema);
    Json completedSettings(const Schema& schema) const;
    void prepare(const Json& settings);

    /// Mistakes are refused before: an old record is then left as it was.
    void beginRecord();
    bool initialise(const PlugIn& plugIn, const Json& settings);
    void startAndStop(const PlugIn& plugIn);
    bool start(const PlugIn& plugIn);

    /// Those that a view would have been spoilt by.
    void tellLastWords();

    /// Start and wait do not throw: the plug-in's child must be stopped whatever happens.
    /// @return why the run ends.
    std::string startAndWait(const PlugIn& plugIn);
    std::string waitForEnd();
    std::optional<std::string> waitUntil(std::optional<Moment::Clock::time_point> deadline);

    /// Takes what has come from outside.
    /// @return the name of a signal that ends the run.
    std::optional<std::string> takeNews();
    void tellDaemonEnd(const ChildEnd& end);
    void tellFailure();
    void openFifo();
    void writeOffset(std::int64_t nanoseconds);

    /// Shows a status that is not clean.
    /// @return whether the operation succeeded.
    bool succeeded(const char* operation, const HostStatus& status);

    const RunOptions& options_;
    std::optional<std::string> configText_;
    Signals& signals_;
    const Moment::Clock::time_point begin_ = Moment::Clock::now();
    std::optional<LiveView> view_;
    std::optional<RecordFile> record_;
    std::optional<ChronyClock> chrony_;
    Journal journal_;
    Callbacks callbacks_;
    std::optional<EpochFifo> fifo_;
    LastWords words_;
    RunFacts facts_;
};

} // namespace vantelhost
