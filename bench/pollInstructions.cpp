// How many instructions a poll takes outside the kernel, counted by callgrind, which runs this
// program again with --run.

#include <chrono>
#include <cstdlib>
#include <filesystem>
#include <stdexcept>

#include "Daemons.h"
#include "FetchClient.h"
#include "Measurements.h"
#include "Program.h"
#include "Row.h"
#include "Statistics.h"
#include "support/Child.h"
#include "support/TemporaryFolder.h"

namespace {

constexpr int countedPolls = 10;

/// Of which the first one is the fetcher's own, when it is made.
void runPolls(std::uint16_t ports, int polls) {
    const TemporaryFolder folder;
    const auto daemon = Daemon::make("stub", ports);
    FetchClient fetch(daemon->socket());
    for (int poll = 1; poll < polls; ++poll) {
        fetch.poll();
    }
}

double countInstructions(std::uint16_t ports, int polls) {
    const std::string self = std::filesystem::read_symlink("/proc/self/exe");
    Child callgrind({"/usr/bin/valgrind", "--tool=callgrind", "--callgrind-out-file=/dev/null",
                     "--log-fd=1", "--toggle-collect=zekelVantel::tGetDataFromPtp4l::fetch(*)",
                     self, "poll_instructions", "--run", "--ports", std::to_string(ports),
                     "--polls", std::to_string(polls)});
    callgrind.wait(std::chrono::minutes(1));
    const std::string& output = callgrind.output();
    const std::string label = "Collected : ";
    const auto position = output.find(label);
    const double count = position == std::string::npos
                             ? 0
                             : std::strtod(output.c_str() + position + label.size(), nullptr);
    if (count <= 0) {
        throw std::runtime_error("valgrind counts nothing:\n" + output + callgrind.errors());
    }
    return count;
}

/// The first poll, which also opens the socket, does not count.
double instructionsPerPoll(std::uint16_t ports) {
    return (countInstructions(ports, countedPolls + 1) - countInstructions(ports, 1)) /
           countedPolls;
}

void printAll(const std::vector<std::uint16_t>& portCounts) {
    std::vector<double> x;
    std::vector<double> y;
    for (const std::uint16_t ports : portCounts) {
        x.push_back(ports);
        y.push_back(instructionsPerPoll(ports));
        print({"instructions per poll", std::to_string(ports), y.back(), ""});
    }
    if (x.size() > 2) {
        print({"instructions per poll, farthest from a line", "", deviationFromLine(x, y) * 100,
               "%", std::nullopt, 5});
    }
}

} // namespace

void addPollInstructions(Program& program) {
    struct Setting {
        std::vector<std::uint16_t> ports = {1, 2, 8, 32, 64};
        int polls = 1;
        bool isInside = false;
    };
    const auto setting = std::make_shared<Setting>();
    Options options =
        program.add("poll_instructions",
                    "Prints how many instructions a poll takes, counted by callgrind.", [setting] {
                        if (setting->isInside) {
                            runPolls(setting->ports.at(0), setting->polls);
                        } else {
                            printAll(setting->ports);
                        }
                    });
    options.add("--ports", setting->ports, "numbers of ports");
    options.add("--polls", setting->polls, "with --run: how many");
    options.addFlag("--run", setting->isInside, "only poll, to be counted");
}
