/// @file
/// The simulator's log: one JSON object a line, each written with a single unbuffered write.
#pragma once

#include "Fields.h"
#include "StartRecord.h"

#include <cstdint>
#include <string>
#include <vector>

namespace simptp4l {

/// Times are nanoseconds since the start of the process; the log shows them as seconds in "t".
class Log {
public:
    Log() = default;
    ~Log();
    Log(const Log&) = delete;
    Log& operator=(const Log&) = delete;

    /// Appends to the file from now on. Without a successful open every event is thrown away.
    /// @return false when the file cannot be opened; errno tells why.
    bool open(const std::string& path);

    void start(const StartRecord& record) const;
    void bound(std::int64_t time, const std::string& path) const;
    /// @param ignored why the request gets no answer; empty when it is handled.
    void request(std::int64_t time, const Octets& octets, const std::string& from,
                 const std::string& ignored) const;
    void answer(std::int64_t time, const Octets& octets, const std::string& to) const;
    void dropped(std::int64_t time, std::size_t length, const std::string& to,
                 const std::string& reason) const;
    void signal(std::int64_t time, const std::string& name, bool ignored) const;
    void error(const std::string& text) const;
    void exit(int status) const;

private:
    int descriptor_ = -1;
};

} // namespace simptp4l
