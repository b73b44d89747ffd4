/// @file
#pragma once

#include <string>

#include <gtest/gtest.h>
#include <sys/socket.h>
#include <sys/un.h>
#include <unistd.h>

/// Has a socket at a path while it lives; leaves it there.
class Listener {
public:
    Listener(const std::string& path, int type) : descriptor_(::socket(AF_UNIX, type, 0)) {
        sockaddr_un address{};
        address.sun_family = AF_UNIX;
        path.copy(static_cast<char*>(address.sun_path), sizeof(address.sun_path) - 1);
        EXPECT_EQ(::bind(descriptor_, reinterpret_cast<const sockaddr*>(&address), sizeof(address)),
                  0);
    }
    ~Listener() { ::close(descriptor_); }
    Listener(const Listener&) = delete;
    Listener& operator=(const Listener&) = delete;

private:
    int descriptor_;
};
