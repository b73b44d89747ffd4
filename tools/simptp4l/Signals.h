/// @file
/// The terminating signals, as a descriptor to poll.
#pragma once

namespace simptp4l {

/// Blocks SIGTERM and SIGINT for the process and queues them in a descriptor.
class Signals {
public:
    /// Throws std::system_error.
    Signals();
    ~Signals();
    Signals(const Signals&) = delete;
    Signals& operator=(const Signals&) = delete;

    int descriptor() const { return descriptor_; }

    /// @return the next queued signal's number, 0 when there is none.
    int next() const;

private:
    int descriptor_;
};

} // namespace simptp4l
