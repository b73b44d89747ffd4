// Whether the cost of a poll grows in a straight line with the ports.

#include <exception>
#include <iostream>

#include <CLI/CLI.hpp>

#include "BareClient.h"
#include "Daemons.h"
#include "FetchClient.h"
#include "Race.h"
#include "Row.h"
#include "Statistics.h"
#include "support/TemporaryFolder.h"

namespace {

constexpr std::uint16_t portCounts[] = {1, 2, 4, 8, 16, 24, 32, 40, 48, 56, 63, 64};

/// The bare client's deviation is that of the system calls.
void compare(int rounds, int answers) {
    std::vector<double> x;
    std::vector<double> fetch;
    std::vector<double> bare;
    for (const std::uint16_t ports : portCounts) {
        const TemporaryFolder folder;
        const auto daemon = Daemon::make("stub", ports);
        const int polls = std::max(1, answers / (3 + 3 * ports));
        std::vector<Contestant> contestants;
        contestants.push_back({std::make_unique<FetchClient>(daemon->socket()), polls});
        contestants.push_back({std::make_unique<BareClient>(daemon->socket(), ports), polls});
        const auto costs = race(contestants, rounds);
        x.push_back(ports);
        fetch.push_back(median(costs[0].cpu));
        bare.push_back(median(costs[1].cpu));
    }
    print({"CPU per poll, stub: fetch, farthest from a line", "1-64",
           deviationFromLine(x, fetch) * 100, "%", std::nullopt, 10});
    print({"CPU per poll, stub: bare client, farthest from a line", "1-64",
           deviationFromLine(x, bare) * 100, "%"});
}

} // namespace

int main(int argc, char** argv) {
    int rounds = 9;
    int answers = 8000;
    CLI::App app("Prints how far the cost of a poll is from a straight line over the ports.");
    app.add_option("--rounds", rounds, "turns of each client");
    app.add_option("--answers", answers, "in one round, about");
    CLI11_PARSE(app, argc, argv);
    try {
        useOneProcessor();
        compare(rounds, answers);
        return 0;
    } catch (const std::exception& error) {
        std::cerr << "poll_line: " << error.what() << '\n';
        return 1;
    }
}
