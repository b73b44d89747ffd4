/// @file
#pragma once

#include <string>
#include <vector>

#include <sys/types.h>

/// A program on a terminal of its own, of 24 rows and 80 columns. It dies with this object.
class Terminal {
public:
    /// @param command     the program's path and its arguments
    /// @param environment added to the test's own, each "NAME=value"
    explicit Terminal(const std::vector<std::string>& command,
                      const std::vector<std::string>& environment = {});
    ~Terminal();
    Terminal(const Terminal&) = delete;
    Terminal& operator=(const Terminal&) = delete;

    void type(const std::string& keys) const;
    void resize(unsigned short rows, unsigned short columns) const;
    void signal(int number) const;

    /// Reads until a text has come count times in what was read since the last forget().
    /// @return false when the program ended, or 20 s have passed, without it.
    bool waitFor(const std::string& text, int count = 1);

    void forget() { output_.clear(); }

    /// Waits for the program's end, 20 s at most.
    /// @return its exit status, 1000 plus the signal that ended it, or -1 when it has not ended.
    int wait();

    const std::string& output() const { return output_; }

private:
    bool readSome();

    pid_t pid_ = -1;
    int descriptor_ = -1;
    std::string output_;
};
