// What metrics add to the host's callbacks, with and without somebody who asks for them.

#include <atomic>
#include <chrono>
#include <cstdint>
#include <optional>
#include <stdexcept>
#include <string>
#include <thread>
#include <vector>

#include <fcntl.h>

#include "Callbacks.h"
#include "EventPrinter.h"
#include "HostStatus.h"
#include "Journal.h"
#include "Measurements.h"
#include "Metrics/Metrics.h"
#include "Program.h"
#include "Row.h"
#include "Statistics.h"
#include "support/Descriptor.h"
#include "support/Http.h"

namespace {

using namespace vantelhost;
using Clock = std::chrono::steady_clock;

/// With two ports.
constexpr char metadata[] =
    R"({"gmClockId":"00:1B:21:FF:FE:0A:0B:0C","gmMacAddress":"00:1B:21:0A:0B:0C",)"
    R"("localClockId":"02:00:00:FF:FE:00:00:01","clockClass":248,)"
    R"("clockAccuracy":"ACCURACY_UNKNOWN","offsetLogVariance":65535,"priority1":127,)"
    R"("priority2":126,"domainNumber":0,"gmClockClass":6,"gmClockAccuracy":"WITHIN_100NS",)"
    R"("gmOffsetLogVariance":20061,"gmPriority1":128,"gmPriority2":128,)"
    R"("Port1":{"portState":"PTP_UNCALIBRATED","asCapable":"true","logSyncInterval":-3,)"
    R"("logAnnounceInterval":1,"logPdelayInterval":0,"interface":"eth0",)"
    R"("neighborPropDelayThreshold":20000000},)"
    R"("Port2":{"portState":"PTP_MASTER","asCapable":"true","logSyncInterval":-3,)"
    R"("logAnnounceInterval":1,"logPdelayInterval":0,"interface":"eth1",)"
    R"("neighborPropDelayThreshold":20000000}})";

/// Asks for the metrics ten times a second.
class Scraper {
public:
    explicit Scraper(int port) : thread_([this, port] { scrape(port); }) {}
    ~Scraper() {
        isOver_ = true;
        thread_.join();
    }
    Scraper(const Scraper&) = delete;
    Scraper& operator=(const Scraper&) = delete;

    int answers() const { return answers_; }

private:
    void scrape(int port) {
        for (auto next = Clock::now(); !isOver_; next += std::chrono::milliseconds(100)) {
            std::this_thread::sleep_until(next);
            answers_ += httpGet(port, "/metrics").empty() ? 0 : 1;
        }
    }

    std::atomic<bool> isOver_{false};
    std::atomic<int> answers_{0};
    std::thread thread_;
};

/// A host that writes a record.
class MeasuredHost {
public:
    MeasuredHost() : callbacks_(journal_, false) {
        journal_.addOutput([this](const Event& event, const Moment& moment) {
            if (hasMetrics) {
                metrics_.take(event, moment);
            }
            return std::nullopt;
        });
        journal_.outputsAreComplete();
    }

    /// Serves metrics.
    int port() {
        const auto event = metrics_.attend();
        return parseListenAddress(event.value().members["address"]).value().port;
    }

    void pair() {
        reference_ += 125000000;
        callbacks_.adjustTime(callbacks_.slot(), reference_, reference_ + 250, status_.get());
    }

    void update() { callbacks_.updateMetaData(callbacks_.slot(), metadata, status_.get()); }

    bool hasMetrics = false;

private:
    const Descriptor null_{::open("/dev/null", O_WRONLY | O_CLOEXEC)};
    Journal journal_{EventPrinter(null_.get(), Format::jsonLines), [](const std::string&) {}};
    Callbacks callbacks_;
    Metrics metrics_{parseListenAddress("127.0.0.1:0").value(), Clock::now()};
    HostStatus status_;
    std::uint64_t reference_ = 1795261620000000000;
};

using Call = void (MeasuredHost::*)();

/// Nanoseconds of each call, for so long.
std::vector<double> times(MeasuredHost& host, Call call, std::chrono::milliseconds length) {
    std::vector<double> all;
    const auto end = Clock::now() + length;
    for (auto before = Clock::now(); before < end;) {
        (host.*call)();
        const auto after = Clock::now();
        all.push_back(std::chrono::duration<double, std::nano>(after - before).count());
        before = after;
    }
    return all;
}

/// One way to run, in all rounds.
struct Way {
    bool hasMetrics;
    bool isScraped;
    std::string name;
    std::vector<double> medians{};
    std::vector<double> worst{}; ///< all but one of a hundred were shorter

    void measure(MeasuredHost& host, Call call, int port, std::chrono::milliseconds length) {
        host.hasMetrics = hasMetrics;
        std::optional<Scraper> scraper;
        if (isScraped) {
            scraper.emplace(port);
        }
        const auto all = times(host, call, length);
        if (scraper && scraper->answers() == 0) {
            throw std::runtime_error("metrics are not served");
        }
        medians.push_back(median(all));
        worst.push_back(quantile(all, 0.99));
    }
};

double added(const std::vector<double>& with, const std::vector<double>& without) {
    std::vector<double> differences;
    for (std::size_t i = 0; i < with.size(); ++i) {
        differences.push_back(with[i] - without.at(i));
    }
    return median(differences);
}

void printWays(const std::string& figure, const std::vector<Way>& ways) {
    constexpr double most = 1000;
    const Way& without = ways.front();
    for (const Way& way : ways) {
        Row row{figure + ": " + way.name, "", median(way.medians), "ns"};
        if (way.hasMetrics) {
            row.ratio = medianRatio(way.medians, without.medians);
        }
        print(row);
        if (way.hasMetrics) {
            print({figure + ", added: " + way.name, "", added(way.medians, without.medians), "ns",
                   std::nullopt, most});
            print({figure + ", added to 99 %: " + way.name, "", added(way.worst, without.worst),
                   "ns"});
        }
    }
}

void compare(MeasuredHost& host, int port, const std::string& figure, Call call, int rounds) {
    constexpr std::chrono::milliseconds length(250);
    std::vector<Way> ways{{false, false, "without metrics"},
                          {true, false, "metrics"},
                          {true, true, "metrics, 10 scrapes/s"}};
    for (int round = 0; round < rounds; ++round) {
        for (Way& way : ways) {
            way.measure(host, call, port, length);
        }
    }
    printWays(figure, ways);
}

} // namespace

void addMetricsCost(Program& program) {
    const auto rounds = std::make_shared<int>(25);
    Options options =
        program.add("metrics_cost", "Prints what metrics add to the host's callbacks.", [rounds] {
            MeasuredHost host;
            const int port = host.port();
            compare(host, port, "callback with a pair", &MeasuredHost::pair, *rounds);
            compare(host, port, "callback with metadata", &MeasuredHost::update, *rounds);
        });
    options.add("--rounds", *rounds, "turns of each way");
}
