// A program of its own: operator new is the one below, which counts.

#include "tPtpMgmtNode.h"

#include <cstdlib>
#include <new>

#include <gtest/gtest.h>

#include "support/DatagramSocket.h"
#include "support/Octets.h"
#include "support/TemporaryFolder.h"
#include "tPtp4lDefaultDataSetMgmtTlv.h"
#include "tPtp4lParentDataSetMgmtTlv.h"
#include "tPtp4lTimeStatusMgmtTlv.h"
#include "tUdsMsgInterface.h"

using namespace zekelVantel;

namespace {

std::size_t allocations = 0;

} // namespace

// The other forms of new and delete end up in these.
void* operator new(std::size_t size) {
    ++allocations;
    if (void* const memory = std::malloc(size == 0 ? 1 : size)) {
        return memory;
    }
    throw std::bad_alloc();
}

void operator delete(void* memory) noexcept {
    std::free(memory);
}

void operator delete(void* memory, std::size_t /*size*/) noexcept {
    std::free(memory);
}

namespace {

class PtpMgmtNodeMemoryTest : public testing::Test {
protected:
    void SetUp() override {
        const std::size_t before = allocations;
        ::operator delete(::operator new(1));
        ASSERT_GT(allocations, before) << "allocations are not counted";
        interface.open("local", status);
        ASSERT_EQ(status.code, 0);
    }

    /// Allocations of one exchange whose answer waits already.
    template <typename Tlv>
    std::size_t allocationsOfExchange(std::size_t octets) {
        EXPECT_TRUE(daemon.sendTo("local", Octets(octets)));
        Tlv tlv;
        const std::size_t before = allocations;
        node.getSingle(interface, remote, tlv, status);
        return allocations - before;
    }

    TemporaryFolder folder;
    DatagramSocket daemon{"remote"};
    const tUdsMsgAddress remote{"remote"};
    tUdsMsgInterface interface;
    tPtpMgmtNode node{tPtpPortIdentity(tPtpClockIdentity(), 1), 0};
    zeerr::LocalStatus status;
};

TEST_F(PtpMgmtNodeMemoryTest, SingleAnswerExchangeAllocatesNothing) {
    EXPECT_EQ(allocationsOfExchange<tPtp4lTimeStatusMgmtTlv>(104), 0U);
    EXPECT_EQ(allocationsOfExchange<tPtp4lParentDataSetMgmtTlv>(86), 0U);
    EXPECT_EQ(allocationsOfExchange<tPtp4lDefaultDataSetMgmtTlv>(74), 0U);
    EXPECT_EQ(status.code, 0);
}

} // namespace
