/// @file
#pragma once

#include <chrono>
#include <functional>
#include <string>
#include <vector>

#include <sys/types.h>

#include "support/Descriptor.h"

/// A program that runs beside this one. It dies with this process, and with this object.
class Child {
public:
    using Words = std::vector<std::string>;

    /// @param command     the program's path and its arguments
    /// @param environment as env(1) takes it: "NAME=value" adds to that of this process, which "-i"
    ///                    leaves out
    explicit Child(const Words& command, const Words& environment = {});
    ~Child();
    Child(const Child&) = delete;
    Child& operator=(const Child&) = delete;

    pid_t pid() const { return pid_; }
    bool isRunning() const;
    void signal(int number) const;

    /// CPU time in seconds: so far or, after wait(), of the whole run.
    double cpuSeconds() const;

    /// Writes to the standard input. Throws when nobody reads it.
    void write(const std::string& text) const;

    /// Reads until the output has a text so often.
    /// @return false when the output ended, or 20 s have passed, without it.
    bool waitForOutput(const std::string& text, int count = 1);

    /// Reads no more of the standard output: the program's next write to it fails.
    void closeOutput() { streams_.output.close(); }

    /// Ends the standard input, reads both outputs to their end, and waits for the program's.
    /// @return its exit status, 1000 plus the signal that ended it, or -1 when it has not ended.
    int wait(std::chrono::seconds patience = std::chrono::seconds(20));

    /// What was read of the standard output, since forgetOutput().
    const std::string& output() const { return outputText_; }
    void forgetOutput() { outputText_.clear(); }

    /// What was read of the standard error.
    const std::string& errors() const { return errorsText_; }

protected:
    /// This process's ends of the standard streams.
    struct Streams {
        Descriptor input;
        Descriptor output;
        Descriptor errors;
    };

    /// Nothing is running yet.
    Child() = default;

    /// @param connect called in the new process: makes its ends of these its standard streams
    void start(const Words& command, const Words& environment, Streams streams,
               const std::function<void()>& connect);

    int outputDescriptor() const { return streams_.output.get(); }

private:
    using Clock = std::chrono::steady_clock;

    bool read(Clock::time_point end);

    Streams streams_;
    pid_t pid_ = -1;
    Descriptor process_; ///< becomes readable with the program's end
    double cpuSeconds_ = 0;
    std::string outputText_;
    std::string errorsText_;
};
