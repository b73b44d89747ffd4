/// @file
#pragma once

#include <string>

#include <sys/un.h>

namespace vantelhost {

/// Throws UsageError when the path does not fit.
sockaddr_un unixAddress(const std::string& path);

/// A Unix-domain stream socket that does not wait.
class UnixSocket {
public:
    /// Throws std::system_error.
    UnixSocket();
    ~UnixSocket();
    UnixSocket(const UnixSocket&) = delete;
    UnixSocket& operator=(const UnixSocket&) = delete;

    /// As connect() and bind() answer; errno says why.
    int connectTo(const std::string& path) const;
    int bindTo(const std::string& path) const;

    int descriptor() const { return descriptor_; }

    /// The descriptor is the caller's from now on.
    int release();

private:
    int descriptor_;
};

} // namespace vantelhost
