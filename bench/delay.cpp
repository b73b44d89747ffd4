// How long it takes from a measurement of the daemon to the host's adjust call, and how many Syncs
// become pairs: beside what the choice of the sleeps allows at best. The daemon's clock is the
// system's, so the pair itself says when it was measured.

#include <algorithm>
#include <chrono>
#include <cmath>
#include <condition_variable>
#include <exception>
#include <iostream>
#include <mutex>
#include <thread>

#include <CLI/CLI.hpp>
#include <fmt/format.h>

#include "Host.h"
#include "Row.h"
#include "Session.h"
#include "Statistics.h"
#include "WakeUpBound.h"
#include "support/TemporaryFolder.h"

namespace {

class DelayHost : public Host {
public:
    void paired(std::uint64_t /*referenceTime*/, std::uint64_t localTime) override {
        const std::uint64_t time = now();
        {
            const std::lock_guard<std::mutex> lock(mutex_);
            pairs_.push_back({localTime, time});
        }
        changed_.notify_all();
    }

    /// A daemon may still look for its clock.
    void waitForFirstPairs() const {
        std::unique_lock<std::mutex> lock(mutex_);
        if (!changed_.wait_for(lock, std::chrono::seconds(60),
                               [&] { return pairs_.size() > firstPairs; })) {
            throw std::runtime_error("there are no pairs");
        }
    }

    /// Of all but the first pairs.
    Delays delays(double interval) const {
        const std::lock_guard<std::mutex> lock(mutex_);
        if (pairs_.size() < firstPairs + 2) {
            throw std::runtime_error("there are too few pairs");
        }
        Delays result;
        for (auto pair = pairs_.begin() + firstPairs + 1; pair != pairs_.end(); ++pair) {
            result.seconds.push_back(
                static_cast<double>(static_cast<std::int64_t>(pair->time - pair->ingress)) * 1e-9);
        }
        const double length =
            static_cast<double>(pairs_.back().ingress - pairs_[firstPairs].ingress) * 1e-9;
        result.pairsPerSync =
            static_cast<double>(result.seconds.size()) / std::round(length / interval);
        return result;
    }

private:
    struct Pair {
        std::uint64_t ingress;
        std::uint64_t time;
    };

    static constexpr std::size_t firstPairs = 5;

    mutable std::mutex mutex_;
    mutable std::condition_variable changed_;
    std::vector<Pair> pairs_;
};

Delays measure(const std::string& configuration, double interval, int seconds) {
    DelayHost host;
    Session session(configuration);
    session.start();
    host.waitForFirstPairs();
    std::this_thread::sleep_for(std::chrono::seconds(seconds));
    session.stop();
    return host.delays(interval);
}

void printRows(const std::string& what, const Delays& measured, const Delays& best) {
    for (const auto& [name, share] :
         {std::pair("5 %", 0.05), {"50 %", 0.5}, {"95 %", 0.95}, {"99 %", 0.99}, {"all", 1.0}}) {
        const double bound = quantile(best.seconds, share) * 1e3;
        const double value = quantile(measured.seconds, share) * 1e3;
        print({fmt::format("delay of {} of the pairs, {}", name, what), "", value, "ms"});
        print({fmt::format("delay of {} of the pairs, {}: at best", name, what), "", bound, "ms",
               value / bound});
    }
    print({"Syncs that become pairs, " + what, "", measured.pairsPerSync * 100, "%"});
    print({"Syncs that become pairs, " + what + ": at best", "", best.pairsPerSync * 100, "%",
           measured.pairsPerSync / best.pairsPerSync});
}

} // namespace

int main(int argc, char** argv) {
    std::string daemon = "simptp4l";
    std::vector<int> rates = {1, 8, 16};
    int seconds = 60;
    CLI::App app("Prints how late time pairs are, and how many Syncs become one.");
    app.add_option("--daemon", daemon, "who measures; ptp4l: at the rate of the scene")
        ->check(CLI::IsMember({"simptp4l", "ptp4l"}));
    app.add_option("--rates", rates, "Syncs a second")->delimiter(',');
    app.add_option("--seconds", seconds, "for each rate");
    CLI11_PARSE(app, argc, argv);
    try {
        const TemporaryFolder folder;
        for (const int rate : rates) {
            const double interval = 1.0 / rate;
            const std::string configuration =
                daemon == "ptp4l" ? useRealDaemon()
                                  : useSimulator(fmt::format("sync-interval {}\n", interval));
            printRows(fmt::format("{} Syncs/s, {}", rate, daemon),
                      measure(configuration, interval, seconds),
                      bestDelays(static_cast<std::uint64_t>(1e9 * interval)));
        }
        return 0;
    } catch (const std::exception& error) {
        std::cerr << "delay: " << error.what() << '\n';
        return 1;
    }
}
