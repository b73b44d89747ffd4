// How long it takes from a measurement of the daemon to the host's adjust call, and how many Syncs
// become pairs: beside what the choice of the sleeps allows at best. The daemon's clock is the
// system's, so the pair itself says when it was measured.

#include <algorithm>
#include <chrono>
#include <cmath>
#include <condition_variable>
#include <mutex>
#include <stdexcept>
#include <thread>

#include <fmt/format.h>

#include "Host.h"
#include "Measurements.h"
#include "Program.h"
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

    /// Of all but the first pairs. Syncs are counted by the gaps between those that became pairs: a
    /// daemon's interval is not exactly the nominal one.
    Delays delays(double nominalInterval) const {
        const std::lock_guard<std::mutex> lock(mutex_);
        if (pairs_.size() < firstPairs + 2) {
            throw std::runtime_error("there are too few pairs");
        }
        Delays result;
        double syncs = 0;
        for (auto pair = pairs_.begin() + firstPairs + 1; pair != pairs_.end(); ++pair) {
            result.seconds.push_back(secondsBetween(pair->ingress, pair->time));
            syncs += std::round(secondsBetween(std::prev(pair)->ingress, pair->ingress) /
                                nominalInterval);
        }
        result.pairsPerSync = static_cast<double>(result.seconds.size()) / syncs;
        return result;
    }

private:
    struct Pair {
        std::uint64_t ingress;
        std::uint64_t time;
    };

    static double secondsBetween(std::uint64_t from, std::uint64_t to) {
        return static_cast<double>(static_cast<std::int64_t>(to - from)) * 1e-9;
    }

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
        // Of fewer, the one share is the next one.
        if (share == 1 || (1 - share) * static_cast<double>(measured.seconds.size()) >= 1) {
            print({fmt::format("delay of {} of the pairs, {}", name, what), "",
                   quantile(measured.seconds, share) * 1e3, "ms"});
        }
    }
    print({"delay at best, " + what, "", median(best.seconds) * 1e3, "ms",
           median(measured.seconds) / median(best.seconds)});
    print({"Syncs that become pairs, " + what, "", measured.pairsPerSync * 100, "%"});
    print({"Syncs that become pairs at best, " + what, "", best.pairsPerSync * 100, "%",
           measured.pairsPerSync / best.pairsPerSync});
}

void measureAll(const std::string& daemon, const std::vector<std::uint16_t>& rates, int seconds) {
    const TemporaryFolder folder;
    for (const std::uint16_t rate : rates) {
        const double interval = 1.0 / rate;
        const std::string configuration =
            daemon == "ptp4l" ? useRealDaemon()
                              : useSimulator(fmt::format("sync-interval {}\n", interval));
        printRows(fmt::format("{} Syncs/s, {}", rate, daemon),
                  measure(configuration, interval, seconds), bestDelays(interval));
    }
}

} // namespace

void addDelay(Program& program) {
    struct Setting {
        std::string daemon = "simptp4l";
        std::vector<std::uint16_t> rates = {1, 8, 16};
        int seconds = 60;
    };
    const auto setting = std::make_shared<Setting>();
    Options options =
        program.add("delay", "Prints how late time pairs are, and how many Syncs become one.",
                    [setting] { measureAll(setting->daemon, setting->rates, setting->seconds); });
    options.add("--daemon", setting->daemon, {"simptp4l", "ptp4l"}, "who measures");
    options.add("--rates", setting->rates, "Syncs a second; with ptp4l, that of the scene");
    options.add("--seconds", setting->seconds, "for each rate");
}
