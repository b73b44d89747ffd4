/// @file
#pragma once

#include <string>
#include <vector>

#include <sys/types.h>

/// A program that runs beside a measurement. It dies with the measurement, and with this object.
class Child {
public:
    /// @param command the program's path and its arguments.
    explicit Child(const std::vector<std::string>& command);
    ~Child();
    Child(const Child&) = delete;
    Child& operator=(const Child&) = delete;

    void write(const std::string& input) const;

    /// Waits for some standard output, at most 60 s. @return "" at its end. Throws when none came.
    std::string read() const;

    /// CPU time of the program while it runs, in seconds.
    double cpuSeconds() const;

    /// Waits for the program's end. @return its CPU time, in seconds.
    double waitForEnd();

private:
    pid_t pid_;
    int input_;
    int output_;
};
