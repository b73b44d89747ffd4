/// @file
#pragma once

#include <cstdint>
#include <functional>
#include <string>

#include "Callbacks.h"
#include "HostStatus.h"
#include "Journal.h"
#include "Json.h"
#include "LastWords.h"
#include "PlugIn.h"
#include "Signals.h"

namespace vantelhost {

/// One session of the plug-in, from its initialisation to its end, which stop() is. Single use, and
/// one at a time.
class Session {
public:
    struct Manner {
        bool refuseWhileStopping;           ///< as Callbacks has it
        std::function<bool()> endsBySignal; ///< as Callbacks has it
        int passWordsOn;                    ///< as LastWords has it
        std::function<std::uint64_t()> now; ///< as Callbacks has it
    };

    Session(const PlugIn& plugIn, Journal& journal, const Manner& manner);
    ~Session() = default;
    Session(const Session&) = delete;
    Session& operator=(const Session&) = delete;

    /// Both say whether it went well; if not, the journal knows why.
    bool initialise(const Json& settings);
    bool start();

    /// Also after a start that failed: whatever that left running ends here. Does nothing when
    /// there is no session any more, or yet.
    /// @param cause for the journal
    void stop(const std::string& cause);

    LastWords& words() { return words_; }

    /// A child of this process has ended: its ptp4l.
    void take(const ChildEnd& end);

    /// How ptp4l ended unasked: the event's text; empty while it runs.
    const std::string& daemonEnd() const { return daemonEnd_; }

    /// Whether ptp4l ended as one that could not be executed, and without a word.
    bool daemonWasNotExecuted() const { return notExecuted_; }

private:
    const PlugIn& plugIn_;
    Journal& journal_;
    Callbacks callbacks_;
    LastWords words_;
    bool isInitialised_ = false;
    std::string daemonEnd_;
    bool notExecuted_ = false;
};

/// Tells the journal of a status that is not clean.
/// @param operation that gave it
/// @return whether the operation succeeded.
bool succeeded(Journal& journal, const char* operation, const HostStatus& status);

} // namespace vantelhost
