#include "support/SimulatedDaemon.h"

#include <algorithm>
#include <filesystem>
#include <iterator>
#include <sstream>

#include <nlohmann/json.hpp>

#include "support/Processes.h"
#include "support/TemporaryFolder.h"

namespace {

constexpr char logFile[] = "ptp4l.log";

SimulatedDaemon::Event parse(const std::string& line) {
    using Strings = std::vector<std::string>;
    const auto json = nlohmann::json::parse(line);
    SimulatedDaemon::Event event;
    event.name = json.at("event");
    event.time = json.value("t", 0.0);
    event.octets = json.value("octets", "");
    event.from = json.value("from", "");
    event.ignored = event.name == "request" ? json.value("ignored", "") : "";
    event.signal = event.name == "signal" ? json.value("name", "") : "";
    event.status = json.value("status", -1);
    event.pid = json.value("pid", -1);
    event.argv = json.value("argv", Strings());
    event.environment = json.value("environment", Strings());
    event.openDescriptors = json.value("openDescriptors", std::vector<int>());
    event.blockedSignals = json.value("blockedSignals", Strings());
    event.ignoredSignals = json.value("ignoredSignals", Strings());
    return event;
}

} // namespace

SimulatedDaemon::SimulatedDaemon(const std::string& program) {
    std::filesystem::create_symlink(program, "ptp4l");
}

SimulatedDaemon::~SimulatedDaemon() {
    endChildren();
}

void SimulatedDaemon::script(const std::string& lines) {
    writeFile(std::string(configFile) + ".sim", std::string("log ") + logFile + "\n" + lines);
}

std::vector<SimulatedDaemon::Event> SimulatedDaemon::events() {
    const std::string content = readFile(logFile);
    // A line without its end is still being written.
    std::istringstream lines(content.substr(0, content.rfind('\n') + 1));
    std::vector<Event> events;
    for (std::string line; std::getline(lines, line);) {
        events.push_back(parse(line));
    }
    return events;
}

std::vector<SimulatedDaemon::Event> SimulatedDaemon::events(const std::string& name) {
    const auto all = events();
    std::vector<Event> chosen;
    std::copy_if(all.begin(), all.end(), std::back_inserter(chosen),
                 [&](const Event& event) { return event.name == name; });
    return chosen;
}

bool SimulatedDaemon::waitFor(const std::string& name, std::size_t count) {
    return waitUntil([&] { return events(name).size() >= count; });
}
