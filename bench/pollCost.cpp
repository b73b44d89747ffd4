// What a poll costs: the plug-in's fetch beside other ways to ask the same, in turns.

#include <algorithm>
#include <exception>
#include <iostream>

#include <CLI/CLI.hpp>

#include "BareClient.h"
#include "Daemons.h"
#include "FetchClient.h"
#include "PmcClients.h"
#include "Race.h"
#include "Row.h"
#include "Statistics.h"
#include "support/TemporaryFolder.h"

namespace {

struct Options {
    std::string daemon = "stub";
    std::vector<std::uint16_t> ports = {1, 2, 8, 32, 64};
    int rounds = 9;
    int answers = 8000; ///< in one round

    int polls(std::uint16_t portCount) const { return std::max(1, answers / (3 + 3 * portCount)); }
};

/// The limits of the fetch's CPU time beside that of the others, in their order. Beside the bare
/// client it needs a daemon on the same processor.
std::vector<std::optional<double>> limitsOf(const Options& options, std::uint16_t ports) {
    return {std::nullopt, options.daemon == "stub" ? std::optional(1.10) : std::nullopt, 0.75,
            ports == 1 ? std::optional(0.05) : std::nullopt};
}

std::vector<Contestant> makeContestants(const Options& options, const std::string& socket,
                                        std::uint16_t ports) {
    const int polls = options.polls(ports);
    std::vector<Contestant> contestants;
    contestants.push_back({std::make_unique<FetchClient>(socket), polls});
    contestants.push_back({std::make_unique<BareClient>(socket, ports), polls});
    contestants.push_back({std::make_unique<OpenPmc>(socket, ports), std::max(1, polls / 8)});
    contestants.push_back({std::make_unique<PmcPerPoll>(socket, ports), std::min(3, polls)});
    return contestants;
}

void compare(const Options& options, std::uint16_t ports) {
    const TemporaryFolder folder;
    const auto daemon = Daemon::make(options.daemon, ports);
    const auto contestants = makeContestants(options, daemon->socket(), ports);
    const auto costs = race(contestants, options.rounds);
    const auto limits = limitsOf(options, ports);
    for (const auto& [kind, values] : {std::pair("CPU", &Costs::cpu), {"wall", &Costs::wall}}) {
        for (std::size_t i = 0; i < contestants.size(); ++i) {
            Row row{std::string(kind) + " per poll, " + options.daemon + ": " +
                        contestants[i].client->name(),
                    std::to_string(ports), median(costs[i].*values) * 1e6, "us"};
            if (i > 0) {
                row.ratio = medianRatio(costs[0].*values, costs[i].*values);
                row.limit = values == &Costs::cpu ? limits[i] : std::nullopt;
            }
            print(row);
        }
    }
}

} // namespace

int main(int argc, char** argv) {
    Options options;
    CLI::App app("Prints what a poll costs.");
    app.add_option("--daemon", options.daemon, "who is asked")
        ->check(CLI::IsMember({"stub", "simptp4l", "ptp4l"}));
    app.add_option("--ports", options.ports, "numbers of ports")->delimiter(',');
    app.add_option("--rounds", options.rounds, "turns of each client");
    app.add_option("--answers", options.answers, "in one round, about");
    CLI11_PARSE(app, argc, argv);
    try {
        if (options.daemon == "stub") {
            useOneProcessor();
        }
        for (const std::uint16_t ports : options.ports) {
            compare(options, ports);
        }
        return 0;
    } catch (const std::exception& error) {
        std::cerr << "poll_cost: " << error.what() << '\n';
        return 1;
    }
}
