/// @file
/// What goes wrong in one session, and when. Times are seconds since its start.
#pragma once

#include <string>
#include <vector>

/// How the functions of the host misbehave: at half of the calls, but for refusal, which is an
/// error at all of them.
enum class HostFault {
    none,
    error,
    refusal,
    stopping,
    warning,
    exception,
    foreignException,
    block
};

/// What the soak does itself, beside the daemon's script.
struct Deed {
    enum class What {
        freezeDaemon,
        thawDaemon,
        killDaemon,
        misbehave,
        removeFifo,
        createFifo,
        fillFifo,
        tearFifo,
        mendFifo
    };
    double at;
    What what;
    HostFault fault = HostFault::none; ///< for misbehave; none: behaves again
};

enum class Ending {
    recovered,           ///< after the last fault there must be usable reports again
    exited,              ///< the daemon ends
    killed,              ///< the daemon is killed
    exitedAtOnce,        ///< the daemon ends before it has done anything
    noProgram,           ///< the daemon cannot be executed
    stoppedInFault,      ///< the host stops the session while the daemon is silent
    startRefused,        ///< the host fails a call of zekeltr_start
    badConfiguration,    ///< zekeltr_initialize fails
    stoppedWhileFrozen,  ///< SIGTERM does not end the daemon, which takes 10 s
    stoppedWhileIgnoring ///< the same
};

/// For reports.
const char* nameOf(Ending ending);

/// Whether the daemon dies by itself, which must be reported.
bool isDeath(Ending ending);

struct SessionPlan {
    struct Fault {
        const char* kind;
        double until;
    };

    Ending ending = Ending::recovered;
    double length = 0;     ///< at the earliest
    double faultsEnd = 0;  ///< no window is open from here on
    double fifoPeriod = 1; ///< between two epoch offsets
    bool fifoAtStart = true;
    int ports = 1;
    HostFault faultAtStop = HostFault::none; ///< from shortly before zekeltr_stop
    std::string script;                      ///< of the simulated daemon
    std::vector<Deed> deeds;                 ///< in the order of their times
    std::vector<Fault> faults;
};

/// The whole plan, for people.
std::string textOf(const SessionPlan& plan);
