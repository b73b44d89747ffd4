#include "ListeningChronyd.h"

#include <array>
#include <cstring>
#include <utility>

#include <gtest/gtest.h>
#include <sys/socket.h>
#include <sys/un.h>
#include <unistd.h>

ListeningChronyd::ListeningChronyd(const std::string& path)
    : descriptor_(::socket(AF_UNIX, SOCK_DGRAM | SOCK_CLOEXEC, 0)) {
    sockaddr_un address{};
    address.sun_family = AF_UNIX;
    std::strcpy(address.sun_path, path.c_str());
    EXPECT_EQ(::bind(descriptor_, reinterpret_cast<const sockaddr*>(&address), sizeof(address)), 0);
}

ListeningChronyd::~ListeningChronyd() {
    ::close(descriptor_);
}

std::string ListeningChronyd::receive() const {
    std::array<char, 100> buffer;
    const ssize_t size = ::recv(descriptor_, buffer.data(), buffer.size(), MSG_DONTWAIT);
    return size < 0 ? "" : std::string(buffer.data(), static_cast<std::size_t>(size));
}

void ListeningChronyd::read() {
    // Behind the platform's own struct timeval.
    constexpr std::size_t position = 2 * sizeof(long);
    for (std::string sample = receive(); !sample.empty(); sample = receive()) {
        double offset = 0;
        ASSERT_GE(sample.size(), position + sizeof(offset));
        std::memcpy(&offset, sample.data() + position, sizeof(offset));
        offsets_.push_back(offset);
    }
}

std::vector<double> ListeningChronyd::takeOffsets() {
    read();
    return std::exchange(offsets_, {});
}
