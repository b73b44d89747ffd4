#include "Race.h"

#include <stdexcept>

#include <sched.h>

#include "Clocks.h"

namespace {

void runRound(const Contestant& contestant, Costs& costs) {
    const double cpu = contestant.client.cpuSeconds();
    const double wall = secondsOf(CLOCK_MONOTONIC);
    for (int poll = 0; poll < contestant.polls; ++poll) {
        contestant.client.poll();
    }
    costs.cpu.push_back((contestant.client.cpuSeconds() - cpu) / contestant.polls);
    costs.wall.push_back((secondsOf(CLOCK_MONOTONIC) - wall) / contestant.polls);
}

} // namespace

std::vector<Costs> race(const std::vector<Contestant>& contestants, int rounds) {
    for (const Contestant& contestant : contestants) {
        Costs warmUp;
        runRound(contestant, warmUp);
    }
    std::vector<Costs> costs(contestants.size());
    for (int round = 0; round < rounds; ++round) {
        for (std::size_t turn = 0; turn < contestants.size(); ++turn) {
            const std::size_t next = (static_cast<std::size_t>(round) + turn) % contestants.size();
            runRound(contestants[next], costs[next]);
        }
    }
    return costs;
}

void useOneProcessor() {
    cpu_set_t one;
    CPU_ZERO(&one);
    CPU_SET(static_cast<unsigned>(sched_getcpu()), &one);
    if (sched_setaffinity(0, sizeof(one), &one) != 0) {
        throw std::runtime_error("the process cannot be kept on one processor");
    }
}
