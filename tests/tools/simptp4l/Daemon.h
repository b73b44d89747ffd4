/// @file
/// The simulator as a child process, in a temporary folder of its own.
#pragma once

#include <functional>
#include <string>
#include <sys/types.h>
#include <vector>

/// What a finished program left behind.
struct Finished {
    int status = -1; ///< exit status; minus the signal's number when a signal ended it
    std::string output;
};

/// Calls `condition` until it holds.
/// @return false when it does not within ten seconds
bool eventually(const std::function<bool()>& condition);

/// The whole file; empty when there is none.
std::string readFile(const std::string& path);

/// A child process that is killed with its owner.
class Child {
public:
    /// Standard output and error go to `outputPath`. The environment is empty.
    Child(const std::vector<std::string>& command, const std::string& outputPath);
    ~Child();
    Child(const Child&) = delete;
    Child& operator=(const Child&) = delete;

    pid_t pid() const { return pid_; }
    void signal(int number) const;
    bool isRunning();

    /// Waits up to ten seconds, then kills.
    Finished finish();

private:
    std::string outputPath_;
    pid_t pid_;
    int status_ = 0;
    bool reaped_ = false;
};

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

/// The simulator, running with `script` beside its configuration.
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
