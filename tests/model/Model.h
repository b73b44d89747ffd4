/// @file
#pragma once

#include <array>
#include <string>
#include <vector>

#include "WatchedHost.h"

/// What the simulated daemon is told to do.
struct Script {
    enum class Grandmaster { present, absent, comesAndGoes };
    enum class Life { stays, noProgram, exitsAtOnce, exitsLater };

    Grandmaster grandmaster = Grandmaster::present;
    Life life = Life::stays;
    bool ignoresSigterm = false;
    bool strictPadding = false;
    bool losesSocket = false;
    std::vector<std::string> faults; ///< each passes

    std::string text() const;
};

/// What the host and the daemon were to a session, from start to stop.
struct Session {
    Script script;
    bool fifoWasThere = false;
    bool fifoWasMissing = false;
    bool daemonWasKilled = false;
    bool ownPathWasTaken = false;

    bool daemonEnds() const { return daemonWasKilled || script.life != Script::Life::stays; }
};

/// What a host knows of the library, and of what it has done around it.
struct Model {
    enum class Phase { none, ready, running, stopped };

    Phase phase = Phase::none;
    std::array<Answer, 4> answers{};
    bool hasFifo = true;
    bool daemonIsFrozen = false;
    bool ownPathIsTaken = false; ///< by a folder, in the place of the library's socket
    Session session;             ///< of Phase::running
    int sessions = 0;            ///< that have run

    /// What ends start, if anything does.
    Refusal refusalOfStart() const;

    /// What goes on to happen, so that a wait for it ends.
    bool pollsSucceed() const;
    bool pollsFail() const;
    bool pairsCome() const;
    bool deathIsTold() const;

    /// Whether calls of a function do not fail.
    bool answersWell(Event::What function) const;
};
