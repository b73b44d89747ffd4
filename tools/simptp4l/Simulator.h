/// @file
/// The simulated daemon: one thread, one loop over socket, signals and times.
#pragma once

#include "Clock.h"
#include "Config.h"
#include "DataSets.h"
#include "Log.h"
#include "ManagementSocket.h"
#include "Outbox.h"
#include "Plan.h"
#include "Random.h"
#include "Rules.h"
#include "Script.h"
#include "Signals.h"

#include <cstdint>
#include <optional>
#include <string>
#include <vector>

namespace simptp4l {

class Simulator {
public:
    /// @param log must outlive the simulator
    Simulator(const Config& config, const Script& script,
              const std::vector<std::string>& interfaces, Log& log);

    /// Runs until a signal or the script ends it.
    /// @return the exit status
    int run();

private:
    std::int64_t now() const;
    std::int64_t wakeTime(std::int64_t now) const;
    void wait();
    void doTimed();
    void takeSignals();
    void readSocket();
    void bind();

    void handle(const Datagram& datagram);
    void answer(const Request& request, const Address& to, const Plan& plan, std::int64_t now);
    void applyToSelf(const Action& action, std::int64_t now);
    View viewOf(unsigned port, std::int64_t now);
    int portState(unsigned port, const ClockReading& reading) const;
    std::string interfaceName(unsigned port) const;

    struct Held {
        Octets octets;
        Address to;
    };

    Config config_;
    Script script_;
    std::vector<std::string> interfaces_;
    unsigned ports_;
    Log& log_;
    std::int64_t start_;
    Clock clock_;
    Rules rules_;
    Random random_;
    Signals signals_;
    ManagementSocket socket_;
    Outbox outbox_;
    std::vector<TimedAction> timed_; ///< by time; those to come
    std::vector<Held> held_;         ///< answers kept for the next request
    std::int64_t readAgain_ = 0;
    bool started_ = false; ///< the first bind has been tried
    std::optional<int> exit_;
};

} // namespace simptp4l
