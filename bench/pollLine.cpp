// Whether the cost of a poll grows in a straight line with the ports.

#include <algorithm>

#include "BareClient.h"
#include "Daemons.h"
#include "FetchClient.h"
#include "Measurements.h"
#include "Program.h"
#include "Race.h"
#include "Row.h"
#include "Statistics.h"
#include "support/TemporaryFolder.h"

namespace {

/// The costs of both clients with one number of ports.
struct Point {
    std::uint16_t ports;
    std::vector<double> fetch;
    std::vector<double> bare;
};

void measure(Point& point, int answers) {
    const TemporaryFolder folder;
    const auto daemon = Daemon::make("stub", point.ports);
    const int polls = std::max(1, answers / (3 + 3 * point.ports));
    FetchClient fetch(daemon->socket());
    BareClient bare(daemon->socket(), point.ports);
    const auto costs = race({{fetch, polls}, {bare, polls}}, 1);
    point.fetch.push_back(costs[0].cpu.front());
    point.bare.push_back(costs[1].cpu.front());
}

double deviationOf(const std::vector<Point>& points, std::vector<double> Point::*costs) {
    std::vector<double> x;
    std::vector<double> y;
    for (const Point& point : points) {
        x.push_back(point.ports);
        y.push_back(median(point.*costs));
    }
    return deviationFromLine(x, y);
}

/// Each round visits all points: what slows the machine for a while must not bend the line. The
/// bare client's deviation is that of the system calls.
void compare(int rounds, int answers) {
    std::vector<Point> points;
    for (const int ports : {1, 2, 4, 8, 16, 24, 32, 40, 48, 56, 63, 64}) {
        points.push_back({static_cast<std::uint16_t>(ports), {}, {}});
    }
    for (int round = 0; round < rounds; ++round) {
        for (Point& point : points) {
            measure(point, answers);
        }
    }
    print({"CPU per poll, stub: fetch, farthest from a line", "1-64",
           deviationOf(points, &Point::fetch) * 100, "%", std::nullopt, 10});
    print({"CPU per poll, stub: bare client, farthest from a line", "1-64",
           deviationOf(points, &Point::bare) * 100, "%"});
}

} // namespace

void addPollLine(Program& program) {
    struct Lengths {
        int rounds = 101;
        int answers = 1000;
    };
    const auto lengths = std::make_shared<Lengths>();
    Options options = program.add(
        "poll_line", "Prints how far the cost of a poll is from a straight line over the ports.",
        [lengths] {
            useOneProcessor();
            compare(lengths->rounds, lengths->answers);
        });
    options.add("--rounds", lengths->rounds, "turns of each client");
    options.add("--answers", lengths->answers, "in one round, about");
}
