/// @file
#pragma once

#include <optional>
#include <string>

#include "FastWaits.h"
#include "Model.h"
#include "Questions.h"
#include "WatchedHost.h"
#include "contract/PluginFixture.h"
#include "support/EpochFifo.h"

/// A host of the library with all that is around it, in the working folder. What it is told to do
/// it does, and expects that the library does its part: Promise.h.
class LiveHost {
public:
    LiveHost();
    LiveHost(const LiveHost&) = delete;
    LiveHost& operator=(const LiveHost&) = delete;

    /// Ends what still runs, and expects that nothing is left.
    void end(const Model& model);

    void ask() const { expectAnswers(plugin_); }
    void askInVain() const { expectRefusedAnswers(plugin_); }
    void answer(Event::What function, Answer answer) { host_.answer(function, answer); }

    /// @param configuration null: none
    void initialiseInVain(const char* configuration, const Refusal& refusal,
                          const std::string& logLine);
    /// @param interfaces a JSON array
    void initialise(const std::string& interfaces);
    void initialiseWithAnErrorOnEntry();
    void startWithAnErrorOnEntry();
    void start(const Model& model, const Script& script, bool inAnotherThread);
    void startWithoutThread(const Model& model, int allowed);
    void stop(const Model& model, bool inAnotherThread);
    void finalise();

    void writeOffset();
    void createFifo() { fifo_.emplace(); }
    void removeFifo() { fifo_.reset(); }
    void killDaemon();
    void freezeDaemon();
    void thawDaemon();
    void removeOwnSocket();
    void takeOwnPath();
    void freeOwnPath();

    /// Sends a signal to all other threads, which the host has a handler for.
    void interruptThreads();

    void awaitPoll();
    void awaitFailure();
    void awaitPair();

    /// Until it was told, or also taken: it is told again until it is.
    void awaitDeath(bool taken);

private:
    void expectNoViolation() const;
    void callStop(const Model& model);
    static void reapKilledDaemon();
    void awaitMore(Event::What what, const char* otherwise) const;

    const Plugin plugin_;
    WatchedHost host_;
    std::optional<EpochFifo> fifo_;
    void* slot_ = nullptr;
    std::int64_t lastOffset_ = 0; ///< ns
    unsigned deathsBefore_ = 0;   ///< told in former sessions
    unsigned deathsTakenBefore_ = 0;
    int threads_;
    int descriptors_;
};
