/// @file
#pragma once

#include <mutex>
#include <string>
#include <vector>

/// Takes the place of the system log while it lives: what this process, and the libraries loaded
/// into it, write with syslog(3). One at a time.
class SyslogCapture {
public:
    struct Line {
        int priority;
        std::string text;
        bool operator==(const Line& other) const {
            return priority == other.priority && text == other.text;
        }
    };

    SyslogCapture();
    ~SyslogCapture();
    SyslogCapture(const SyslogCapture&) = delete;
    SyslogCapture& operator=(const SyslogCapture&) = delete;

    /// The lines so far. May be called while other threads log.
    std::vector<Line> lines() const;

    /// How many of the lines so far have this text.
    int count(const std::string& text) const;

    void add(int priority, std::string text);

private:
    mutable std::mutex mutex_;
    std::vector<Line> lines_;
};

/// For readable failures.
void PrintTo(const SyslogCapture::Line& line, std::ostream* out);
