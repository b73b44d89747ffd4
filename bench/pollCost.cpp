// What a poll costs: the plug-in's fetch beside other ways to ask the same, in turns.

#include <algorithm>

#include "BareClient.h"
#include "Daemons.h"
#include "FetchClient.h"
#include "Measurements.h"
#include "PmcClients.h"
#include "Program.h"
#include "Race.h"
#include "Row.h"
#include "Statistics.h"
#include "support/TemporaryFolder.h"

namespace {

struct Setting {
    std::string daemon = "stub";
    std::vector<std::uint16_t> ports = {1, 2, 8, 32, 64};
    int rounds = 101;
    int answers = 1000; ///< in one round

    int polls(std::uint16_t portCount) const { return std::max(1, answers / (3 + 3 * portCount)); }
};

/// What the fetch is compared with.
struct Rival {
    Client& client;
    int polls;
    std::optional<double> limit; ///< of the ratio of CPU times
};

/// Each rival races the fetch alone: what a sleeping pmc does to the processor's caches and clock
/// would otherwise be in the ratio of the other two.
void compare(const Setting& setting, std::uint16_t ports) {
    const TemporaryFolder folder;
    const auto daemon = Daemon::make(setting.daemon, ports);
    const int polls = setting.polls(ports);
    FetchClient fetch(daemon->socket());
    BareClient bareClient(daemon->socket(), ports);
    OpenPmc openPmc(daemon->socket(), ports);
    PmcPerPoll pmcPerPoll(daemon->socket(), ports);
    // What other daemons do between two answers is the system's work, and not the same each time.
    const Rival rivals[] = {
        {bareClient, polls,
         setting.daemon == "stub" ? std::optional(ports == 1 ? 1.03 : 1.04) : std::nullopt},
        {openPmc, std::max(1, polls / 8), 0.75},
        {pmcPerPoll, 1, ports == 1 ? std::optional(0.05) : std::nullopt},
    };
    std::vector<std::vector<Costs>> races;
    for (const Rival& rival : rivals) {
        races.push_back(race({{fetch, polls}, {rival.client, rival.polls}}, setting.rounds));
    }
    for (const auto& [kind, values] : {std::pair("CPU", &Costs::cpu), {"wall", &Costs::wall}}) {
        const std::string figure = std::string(kind) + " per poll, " + setting.daemon + ": ";
        const std::string portText = std::to_string(ports);
        print({figure + fetch.name(), portText, median(races[0][0].*values) * 1e6, "us"});
        for (std::size_t i = 0; i < races.size(); ++i) {
            print({figure + rivals[i].client.name(), portText, median(races[i][1].*values) * 1e6,
                   "us", medianRatio(races[i][0].*values, races[i][1].*values),
                   values == &Costs::cpu ? rivals[i].limit : std::nullopt});
        }
    }
}

} // namespace

void addPollCost(Program& program) {
    const auto setting = std::make_shared<Setting>();
    Options options = program.add("poll_cost", "Prints what a poll costs.", [setting] {
        useOneProcessor();
        for (const std::uint16_t ports : setting->ports) {
            compare(*setting, ports);
        }
    });
    options.add("--daemon", setting->daemon, {"stub", "simptp4l", "ptp4l"}, "who is asked");
    options.add("--ports", setting->ports, "numbers of ports");
    options.add("--rounds", setting->rounds, "turns of each client");
    options.add("--answers", setting->answers, "in one round, about");
}
