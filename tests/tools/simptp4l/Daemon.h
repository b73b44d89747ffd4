/// @file
/// The simulator as a child process, in a temporary folder of its own.
#pragma once

#include <string>
#include <vector>

#include "support/Child.h"

/// What a program that has ended left behind.
struct Finished {
    int status; ///< as Child::wait() has it
    std::string output;
    std::string errors;
};

/// Runs the simulator to its end.
Finished run(const std::vector<std::string>& arguments);

/// The whole file; empty when there is none.
std::string readFile(const std::string& path);

/// A temporary folder with a configuration and a script; removed with all it holds.
class Folder {
public:
    Folder();
    ~Folder();
    Folder(const Folder&) = delete;
    Folder& operator=(const Folder&) = delete;

    std::string path(const std::string& name) const { return path_ + "/" + name; }
    void write(const std::string& name, const std::string& text) const;

private:
    std::string path_;
};

/// The simulator, running with `script` beside its configuration, in an empty environment.
class Daemon {
public:
    explicit Daemon(const std::string& script = {}, const std::vector<std::string>& interfaces = {},
                    const std::string& config = {});

    std::string socketPath() const { return folder.path("ptp4l"); }
    std::string log() const { return readFile(folder.path("log")); }
    bool isBound() const;

    /// Waits for the socket.
    bool waitUntilBound() const;

    Folder folder;
    Child process;
};
