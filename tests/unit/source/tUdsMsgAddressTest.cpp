#include "tUdsMsgAddress.h"

#include <algorithm>
#include <cstring>
#include <iterator>

#include <gtest/gtest.h>

using zekelVantel::tUdsMsgAddress;

namespace {

sockaddr_un structureOf(const tUdsMsgAddress& address) {
    sockaddr_un structure{};
    std::memcpy(&structure, address.sendAddress(), sizeof(structure));
    return structure;
}

TEST(UdsMsgAddressTest, PathStandsInAZeroedStructureOfTheUnixFamily) {
    const sockaddr_un structure = structureOf(tUdsMsgAddress("/var/run/ptp4l_bc"));
    EXPECT_EQ(structure.sun_family, AF_UNIX);
    EXPECT_STREQ(structure.sun_path, "/var/run/ptp4l_bc");
    EXPECT_TRUE(std::all_of(structure.sun_path + 17, std::end(structure.sun_path),
                            [](char octet) { return octet == 0; }));
}

TEST(UdsMsgAddressTest, LengthIsTheWholeStructureWhateverThePath) {
    EXPECT_EQ(tUdsMsgAddress("").length(), 110U);
    EXPECT_EQ(tUdsMsgAddress("/a").length(), 110U);
    EXPECT_EQ(tUdsMsgAddress(std::string(200, 'a')).length(), 110U);
}

TEST(UdsMsgAddressTest, PathOf107CharactersIsKeptWhole) {
    const std::string path(107, 'a');
    EXPECT_EQ(tUdsMsgAddress(path).path(), path);
}

TEST(UdsMsgAddressTest, LongerPathIsCutSilentlyAndAZeroFollows) {
    const tUdsMsgAddress address(std::string(107, 'a') + "b");
    EXPECT_EQ(address.path(), std::string(107, 'a'));
    EXPECT_EQ(structureOf(address).sun_path[107], 0);
    EXPECT_EQ(tUdsMsgAddress(std::string(200, 'c')).path(), std::string(107, 'c'));
}

TEST(UdsMsgAddressTest, SendingAndReceivingUseTheSameStructure) {
    tUdsMsgAddress address("/a");
    EXPECT_EQ(address.receiveAddress(), address.sendAddress());
}

TEST(UdsMsgAddressTest, ReceivedPathOf108OctetsNeedsNoZero) {
    tUdsMsgAddress address("");
    sockaddr_un received{};
    received.sun_family = AF_UNIX;
    std::memset(received.sun_path, 'x', sizeof(received.sun_path));
    std::memcpy(address.receiveAddress(), &received, sizeof(received));
    EXPECT_EQ(address.path(), std::string(108, 'x'));
}

TEST(UdsMsgAddressTest, CopiesAreIndependent) {
    const tUdsMsgAddress first("/first");
    tUdsMsgAddress copy = first;
    copy = tUdsMsgAddress("/second");
    EXPECT_EQ(first.path(), "/first");
    EXPECT_EQ(copy.path(), "/second");
}

} // namespace
