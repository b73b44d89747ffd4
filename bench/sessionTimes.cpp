// How long a host waits: from start to the first time pair, and for stop. With the simulated
// daemon, so that no clock has to be selected first.

#include <chrono>
#include <future>
#include <stdexcept>

#include "Clocks.h"
#include "Host.h"
#include "Measurements.h"
#include "Program.h"
#include "Row.h"
#include "Session.h"
#include "Statistics.h"
#include "support/TemporaryFolder.h"

namespace {

class WaitingHost : public Host {
public:
    void paired(std::uint64_t /*referenceTime*/, std::uint64_t /*localTime*/) override {
        if (!isPaired_) {
            isPaired_ = true;
            first_.set_value(secondsOf(CLOCK_MONOTONIC));
        }
    }

    double momentOfFirstPair() {
        auto moment = first_.get_future();
        if (moment.wait_for(std::chrono::seconds(30)) != std::future_status::ready) {
            throw std::runtime_error("there is no pair");
        }
        return moment.get();
    }

private:
    std::promise<double> first_;
    bool isPaired_ = false; ///< of the worker
};

void measure(int rounds) {
    const TemporaryFolder folder;
    std::vector<double> firstPair;
    std::vector<double> stop;
    for (int round = 0; round < rounds; ++round) {
        WaitingHost host;
        Session session(useSimulator("sync-interval 0.125\n"));
        const double start = secondsOf(CLOCK_MONOTONIC);
        session.start();
        firstPair.push_back(host.momentOfFirstPair() - start);
        const double beforeStop = secondsOf(CLOCK_MONOTONIC);
        session.stop();
        stop.push_back(secondsOf(CLOCK_MONOTONIC) - beforeStop);
    }
    print({"zekeltr_start to the first pair, simptp4l", "", median(firstPair) * 1e3, "ms"});
    print({"zekeltr_stop after the first pair, simptp4l", "", median(stop) * 1e3, "ms"});
}

} // namespace

void addSessionTimes(Program& program) {
    const auto rounds = std::make_shared<int>(9);
    Options options = program.add("session_times", "Prints how long a host waits for a session.",
                                  [rounds] { measure(*rounds); });
    options.add("--rounds", *rounds, "sessions");
}
