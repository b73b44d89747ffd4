/// @file
#pragma once

#include <string>
#include <vector>

#include <sys/types.h>

/// A program that runs beside the test. It dies with the test, and with this object.
class Child {
public:
    /// @param command     the program's path and its arguments
    /// @param environment added to the test's own, each "NAME=value"
    /// @param input       what the program reads from its standard input
    explicit Child(const std::vector<std::string>& command,
                   const std::vector<std::string>& environment = {}, const std::string& input = {});
    ~Child();
    Child(const Child&) = delete;
    Child& operator=(const Child&) = delete;

    void signal(int number) const;

    /// Reads until the standard output holds a text.
    /// @return false when the program ended, or 20 s have passed, without it.
    bool waitForOutput(const std::string& text);

    /// Reads no more of the standard output: the program's next write to it fails.
    void closeOutput();

    /// Waits for the program's end, 20 s at most.
    /// @return its exit status, 1000 plus the signal that ended it, or -1 when it has not ended.
    int wait();

    const std::string& output() const { return output_; }
    const std::string& errors() const { return errors_; }

private:
    bool readSome(int milliseconds);

    pid_t pid_ = -1;
    int outputDescriptor_ = -1;
    int errorsDescriptor_ = -1;
    std::string output_;
    std::string errors_;
};
