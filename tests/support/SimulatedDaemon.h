/// @file
#pragma once

#include <cstdint>
#include <functional>
#include <string>
#include <vector>

/// The simulated daemon as "./ptp4l", with its script beside the configuration file "ptp4l.conf",
/// and what it logs.
class SimulatedDaemon {
public:
    /// One line of its log. Of the members, those that the event has.
    struct Event {
        std::string name;   ///< "start", "bound", "request", "answer", "signal", "exit", ...
        double time = 0;    ///< seconds since its start
        std::string octets; ///< hexadecimal
        std::string from;
        std::string ignored; ///< why a request has no answer
        std::string signal;
        int status = -1;
        int pid = -1;
        std::vector<std::string> argv;
        std::vector<std::string> environment;
        std::vector<int> openDescriptors;
        std::vector<std::string> blockedSignals;
        std::vector<std::string> ignoredSignals;
    };

    static constexpr char configFile[] = "ptp4l.conf";

    /// Puts a symbolic link at "./ptp4l".
    explicit SimulatedDaemon(const std::string& program);

    /// Ends every child of this process.
    ~SimulatedDaemon();
    SimulatedDaemon(const SimulatedDaemon&) = delete;
    SimulatedDaemon& operator=(const SimulatedDaemon&) = delete;

    /// Lines for the next start, in the language of the simulator.
    static void script(const std::string& lines);

    /// So far, of all runs.
    static std::vector<Event> events();
    static std::vector<Event> events(const std::string& name);

    /// Waits until there are so many events of a name. @return false after the deadline.
    static bool waitFor(const std::string& name, std::size_t count = 1);
};
