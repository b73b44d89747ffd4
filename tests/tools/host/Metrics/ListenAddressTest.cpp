#include "Metrics/ListenAddress.h"

#include <arpa/inet.h>
#include <gtest/gtest.h>
#include <netinet/in.h>

#include "support/TcpConnection.h"

using namespace vantelhost;

TEST(ListenAddress, AnIpv4AddressAndAPortAreTaken) {
    const auto address = parseListenAddress("127.0.0.1:9993");
    ASSERT_TRUE(address.has_value());
    EXPECT_EQ(address->host, "127.0.0.1");
    EXPECT_EQ(address->port, 9993);
    EXPECT_EQ(address->text(), "127.0.0.1:9993");
    const auto* const ipv4 = reinterpret_cast<const sockaddr_in*>(&address->socketAddress);
    EXPECT_EQ(ipv4->sin_family, AF_INET);
    EXPECT_EQ(ipv4->sin_port, htons(9993));
    EXPECT_EQ(ipv4->sin_addr.s_addr, htonl(0x7F000001));
}

TEST(ListenAddress, AnIpv6AddressInBracketsAndAPortAreTaken) {
    const auto address = parseListenAddress("[fe80::1]:80");
    ASSERT_TRUE(address.has_value());
    EXPECT_EQ(address->text(), "[fe80::1]:80");
    const auto* const ipv6 = reinterpret_cast<const sockaddr_in6*>(&address->socketAddress);
    EXPECT_EQ(ipv6->sin6_family, AF_INET6);
    EXPECT_EQ(ipv6->sin6_addr.s6_addr[0], 0xFE);
    EXPECT_EQ(ipv6->sin6_addr.s6_addr[15], 1);
}

TEST(ListenAddress, PortsReachFrom0To65535) {
    EXPECT_EQ(parseListenAddress("0.0.0.0:0").value().port, 0);
    EXPECT_EQ(parseListenAddress("0.0.0.0:65535").value().port, 65535);
    EXPECT_FALSE(parseListenAddress("0.0.0.0:65536").has_value());
    EXPECT_FALSE(parseListenAddress("0.0.0.0:-1").has_value());
}

TEST(ListenAddress, WhatIsNoAddressAndPortIsRefused) {
    for (const char* const text :
         {"", ":", ":9993", "9993", "127.0.0.1", "127.0.0.1:", "127.0.0.1:x", "127.0.0.1:99 ",
          "127.0.0:1", "localhost:1", "::1:9993", "[]:1", "[127.0.0.1]:1", "[::1]", "[::1:1",
          "127.0.0.1:80s", "+9993", "127.0.0.1:80,127.0.0.1:81"}) {
        EXPECT_FALSE(parseListenAddress(text).has_value()) << text;
    }
}

TEST(ListenAddress, APortInUseIsAProblem) {
    SilentListener listener;
    auto address = parseListenAddress("127.0.0.1:" + std::to_string(listener.port()));
    EXPECT_EQ(listeningProblem(address.value()), "Address already in use");
    EXPECT_EQ(listeningProblem(parseListenAddress("127.0.0.1:0").value()), "");
}

TEST(ListenAddress, AnAddressOfAnotherMachineIsAProblem) {
    EXPECT_EQ(listeningProblem(parseListenAddress("192.0.2.1:0").value()),
              "Cannot assign requested address");
}
