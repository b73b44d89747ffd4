/// @file
#pragma once

#include <chrono>
#include <string>

#include <sys/un.h>

namespace vantelhost {

/// Throws UsageError when the path does not fit.
sockaddr_un unixAddress(const std::string& path);

/// A Unix-domain stream socket.
class UnixSocket {
public:
    /// One that never waits. Throws std::system_error.
    UnixSocket();

    /// One that waits; to connect no longer than this. Throws std::system_error.
    explicit UnixSocket(std::chrono::seconds patience);

    /// Owns a descriptor.
    explicit UnixSocket(int descriptor) : descriptor_(descriptor) {}
    ~UnixSocket();
    UnixSocket(const UnixSocket&) = delete;
    UnixSocket& operator=(const UnixSocket&) = delete;

    /// As connect() and bind() answer; errno says why: EAGAIN when who listens there is busy.
    int connectTo(const std::string& path) const;
    int bindTo(const std::string& path) const;

    int descriptor() const { return descriptor_; }

private:
    const int descriptor_;
};

} // namespace vantelhost
