#include "tUdsMsgInterface.h"

#include <chrono>
#include <csignal>

#include <fcntl.h>
#include <gtest/gtest.h>
#include <sys/select.h>
#include <sys/time.h>
#include <unistd.h>

#include "support/DatagramSocket.h"
#include "support/Descriptors.h"
#include "support/ErrorText.h"
#include "support/Octets.h"
#include "support/TemporaryFolder.h"

using zekelVantel::tMsgBuffer;
using zekelVantel::tUdsMsgAddress;
using zekelVantel::tUdsMsgInterface;

namespace {

using Clock = std::chrono::steady_clock;
using std::chrono::milliseconds;

constexpr char ownPath[] = "local";
constexpr char remote[] = "remote";

/// Sending and receiving.
class UdsMsgTransferTest : public testing::Test {
protected:
    void SetUp() override {
        interface.open(ownPath, status);
        ASSERT_EQ(status.code, 0);
    }

    void expectError(std::int32_t code, const std::string& constant, int line) {
        EXPECT_EQ(status.code, code);
        EXPECT_EQ(textOf(status), errorText(constant, "tUdsMsgInterface", line));
    }

    void expectTimedOut() { expectError(-52007, "zeoskerr_operationTimedOut", 160); }

    TemporaryFolder folder;
    DatagramSocket peer{remote};
    const tUdsMsgAddress remoteAddress{remote};
    tUdsMsgInterface interface;
    tMsgBuffer buffer;
    zeerr::LocalStatus status;
};

milliseconds since(Clock::time_point start) {
    return std::chrono::duration_cast<milliseconds>(Clock::now() - start);
}

/// Raises SIGALRM once after a while; its handler does nothing and lets no call go on.
class AlarmAfter {
public:
    explicit AlarmAfter(milliseconds delay) {
        struct sigaction action {};
        action.sa_handler = [](int) {};
        sigaction(SIGALRM, &action, &before_);
        itimerval timer{};
        timer.it_value.tv_usec =
            static_cast<decltype(timer.it_value.tv_usec)>(std::chrono::microseconds(delay).count());
        setitimer(ITIMER_REAL, &timer, nullptr);
    }
    ~AlarmAfter() {
        const itimerval none{};
        setitimer(ITIMER_REAL, &none, nullptr);
        sigaction(SIGALRM, &before_, nullptr);
    }
    AlarmAfter(const AlarmAfter&) = delete;
    AlarmAfter& operator=(const AlarmAfter&) = delete;

private:
    struct sigaction before_ {};
};

TEST_F(UdsMsgTransferTest, SendsTheOctetsUpToTheLengthFromItsOwnPath) {
    buffer = received(octets("01 02 03"));
    interface.send(buffer, remoteAddress, status);
    EXPECT_EQ(status.code, 0);
    const auto datagram = peer.receiveQueued();
    ASSERT_TRUE(datagram);
    EXPECT_EQ(datagram->octets, octets("01 02 03"));
    EXPECT_EQ(datagram->source, ownPath);
    EXPECT_FALSE(peer.receiveQueued());
}

TEST_F(UdsMsgTransferTest, SendsAFullBuffer) {
    buffer.setLength(1500, status);
    interface.send(buffer, remoteAddress, status);
    EXPECT_EQ(status.code, 0);
    const auto datagram = peer.receiveQueued();
    ASSERT_TRUE(datagram);
    EXPECT_EQ(datagram->octets.size(), 1500U);
}

TEST_F(UdsMsgTransferTest, SendingWhileClosedIsNotInitialized) {
    interface.close();
    interface.send(buffer, remoteAddress, status);
    expectError(-52010, "zeoskerr_resourceNotInitialized", 96);
    EXPECT_FALSE(peer.receiveQueued());
}

TEST_F(UdsMsgTransferTest, SendingToNobodyIsACommunicationsFault) {
    interface.send(buffer, tUdsMsgAddress("nobody"), status);
    expectError(-52024, "zeoskerr_communicationsFault", 109);
}

TEST_F(UdsMsgTransferTest, SendingToOneThatDoesNotReadFailsAfter2000Milliseconds) {
    const DatagramSocket other;
    other.fillQueueOf(remote);
    const auto start = Clock::now();
    interface.send(buffer, remoteAddress, status);
    expectError(-52024, "zeoskerr_communicationsFault", 109);
    EXPECT_GE(since(start), milliseconds(1990));
    EXPECT_LT(since(start), milliseconds(3900));
}

TEST_F(UdsMsgTransferTest, SendingWithAnErrorDoesNothing) {
    status.code = -1;
    interface.send(buffer, remoteAddress, status);
    interface.send(buffer, tUdsMsgAddress("nobody"), status);
    EXPECT_EQ(status.code, -1);
    EXPECT_EQ(textOf(status), "");
    EXPECT_FALSE(peer.receiveQueued());
}

TEST_F(UdsMsgTransferTest, SendingWithAWarningSendsAndKeepsIt) {
    status.code = 1;
    interface.send(buffer, remoteAddress, status);
    EXPECT_EQ(status.code, 1);
    EXPECT_TRUE(peer.receiveQueued());
}

TEST_F(UdsMsgTransferTest, ReceivesOneDatagramAndSetsTheLength) {
    ASSERT_TRUE(peer.sendTo(ownPath, octets("0A 0B 0C 0D")));
    ASSERT_TRUE(peer.sendTo(ownPath, octets("0E")));
    interface.receive(buffer, 1000, status);
    EXPECT_EQ(status.code, 0);
    EXPECT_EQ(contentOf(buffer), octets("0A 0B 0C 0D"));
    EXPECT_EQ(buffer.readU32(status), 0x0A0B0C0DU);
    buffer.clear();
    interface.receive(buffer, 1000, status);
    EXPECT_EQ(contentOf(buffer), octets("0E"));
}

TEST_F(UdsMsgTransferTest, ReceivingLeavesTheReadPositionAndMovesTheWritePosition) {
    buffer = received(octets("01 02 03"));
    buffer.readU16(status);
    ASSERT_TRUE(peer.sendTo(ownPath, octets("0A 0B 0C 0D")));
    interface.receive(buffer, 1000, status);
    EXPECT_EQ(buffer.readU16(status), 0x0C0DU);
    buffer.writeU8(0xEE, status);
    EXPECT_EQ(status.code, 0);
    EXPECT_EQ(buffer.data()[4], 0xEE);
}

TEST_F(UdsMsgTransferTest, ReceivingTellsWhereTheDatagramCameFrom) {
    ASSERT_TRUE(peer.sendTo(ownPath, octets("01")));
    tUdsMsgAddress source("a path that is longer than the sender's");
    interface.receive(buffer, source, 1000, status);
    EXPECT_EQ(status.code, 0);
    EXPECT_EQ(source.path(), remote);
}

TEST_F(UdsMsgTransferTest, SourcePathThatFillsItsFieldIsWhole) {
    const DatagramSocket far(std::string(108, 'f'));
    ASSERT_TRUE(far.sendTo(ownPath, octets("01")));
    tUdsMsgAddress source("");
    interface.receive(buffer, source, 1000, status);
    EXPECT_EQ(source.path(), std::string(108, 'f'));
}

TEST_F(UdsMsgTransferTest, EmptyDatagramIsReceivedAsLengthZero) {
    buffer = received(octets("01 02"));
    ASSERT_TRUE(peer.sendTo(ownPath, {}));
    interface.receive(buffer, 1000, status);
    EXPECT_EQ(status.code, 0);
    EXPECT_EQ(buffer.getLength(), 0U);
}

TEST_F(UdsMsgTransferTest, DatagramOf1500OctetsIsReceivedWhole) {
    ASSERT_TRUE(peer.sendTo(ownPath, Octets(1500, 0x55)));
    interface.receive(buffer, 1000, status);
    EXPECT_EQ(status.code, 0);
    EXPECT_EQ(contentOf(buffer), Octets(1500, 0x55));
}

TEST_F(UdsMsgTransferTest, OversizeDatagramIsCutTo1500Octets) {
    ASSERT_TRUE(peer.sendTo(ownPath, Octets(1501, 0x55)));
    ASSERT_TRUE(peer.sendTo(ownPath, octets("01")));
    interface.receive(buffer, 1000, status);
    EXPECT_EQ(status.code, 0);
    EXPECT_EQ(contentOf(buffer), Octets(1500, 0x55));
    interface.receive(buffer, 1000, status);
    EXPECT_EQ(contentOf(buffer), octets("01"));
}

TEST_F(UdsMsgTransferTest, ReceivingWhileClosedIsNotInitialized) {
    interface.close();
    interface.receive(buffer, 0, status);
    expectError(-52010, "zeoskerr_resourceNotInitialized", 138);
}

TEST_F(UdsMsgTransferTest, TimeLimitZeroPollsOnce) {
    const auto start = Clock::now();
    interface.receive(buffer, 0, status);
    expectTimedOut();
    EXPECT_LT(since(start), milliseconds(1000));
    zeerr::LocalStatus second;
    ASSERT_TRUE(peer.sendTo(ownPath, octets("01")));
    interface.receive(buffer, 0, second);
    EXPECT_EQ(second.code, 0);
    EXPECT_EQ(buffer.getLength(), 1U);
}

TEST_F(UdsMsgTransferTest, TimeLimitIsInMilliseconds) {
    const auto start = Clock::now();
    interface.receive(buffer, 1050, status);
    expectTimedOut();
    EXPECT_GE(since(start), milliseconds(1050));
    EXPECT_LT(since(start), milliseconds(5000));
}

TEST_F(UdsMsgTransferTest, TimeOutLeavesTheBuffer) {
    buffer = received(octets("01 02"));
    interface.receive(buffer, 0, status);
    EXPECT_EQ(contentOf(buffer), octets("01 02"));
}

TEST_F(UdsMsgTransferTest, SignalCountsAsATimeOut) {
    const auto start = Clock::now();
    const AlarmAfter alarm(milliseconds(50));
    interface.receive(buffer, 60000, status);
    expectTimedOut();
    EXPECT_LT(since(start), milliseconds(30000));
}

// In 32 bits, this many milliseconds would be 704 microseconds.
TEST_F(UdsMsgTransferTest, LongTimeLimitDoesNotWrapAround) {
    const auto start = Clock::now();
    const AlarmAfter alarm(milliseconds(100));
    interface.receive(buffer, 4294968, status);
    expectTimedOut();
    EXPECT_GE(since(start), milliseconds(90));
}

TEST_F(UdsMsgTransferTest, FailureOfTheSystemsReceiveIsACommunicationsFault) {
    const int descriptor = descriptorBoundTo(ownPath);
    const int noSocket = open("/dev/null", O_RDONLY | O_CLOEXEC);
    ASSERT_EQ(dup2(noSocket, descriptor), descriptor);
    close(noSocket);
    interface.receive(buffer, 1000, status);
    expectError(-52024, "zeoskerr_communicationsFault", 176);
    EXPECT_EQ(buffer.getLength(), 0U);
}

TEST_F(UdsMsgTransferTest, FailureOfTheSystemsWaitingIsATimeOut) {
    ASSERT_EQ(close(descriptorBoundTo(ownPath)), 0);
    interface.receive(buffer, 60000, status);
    expectTimedOut();
}

TEST_F(UdsMsgTransferTest, DescriptorBeyondTheSetsRoomReportsATimeOutAtOnce) {
    interface.close();
    const OccupiedDescriptors occupied(FD_SETSIZE);
    if (!occupied.leaveRoom()) {
        GTEST_SKIP() << "this system allows no more than " << FD_SETSIZE << " descriptors";
    }
    interface.open(ownPath, status);
    ASSERT_EQ(status.code, 0);
    ASSERT_GE(descriptorBoundTo(ownPath), FD_SETSIZE);
    ASSERT_TRUE(peer.sendTo(ownPath, octets("01")));
    interface.receive(buffer, 60000, status);
    expectTimedOut();
    EXPECT_EQ(buffer.getLength(), 0U);
}

TEST_F(UdsMsgTransferTest, LastDescriptorWithinTheSetsRoomReceives) {
    interface.close();
    const OccupiedDescriptors occupied(FD_SETSIZE - 1);
    interface.open(ownPath, status);
    ASSERT_EQ(status.code, 0);
    ASSERT_EQ(descriptorBoundTo(ownPath), FD_SETSIZE - 1);
    ASSERT_TRUE(peer.sendTo(ownPath, octets("01")));
    interface.receive(buffer, 1000, status);
    EXPECT_EQ(status.code, 0);
    EXPECT_EQ(buffer.getLength(), 1U);
}

TEST_F(UdsMsgTransferTest, ReceivingWithAnErrorDoesNothing) {
    ASSERT_TRUE(peer.sendTo(ownPath, octets("01 02")));
    status.code = -1;
    tUdsMsgAddress source("kept");
    interface.receive(buffer, source, 60000, status);
    EXPECT_EQ(status.code, -1);
    EXPECT_EQ(textOf(status), "");
    EXPECT_EQ(buffer.getLength(), 0U);
    EXPECT_EQ(source.path(), "kept");
    zeerr::LocalStatus second;
    interface.receive(buffer, 0, second);
    EXPECT_EQ(buffer.getLength(), 2U);
}

TEST_F(UdsMsgTransferTest, ReceivingWithAWarningReceivesAndKeepsIt) {
    ASSERT_TRUE(peer.sendTo(ownPath, octets("01 02")));
    status.code = 1;
    interface.receive(buffer, 1000, status);
    EXPECT_EQ(status.code, 1);
    EXPECT_EQ(buffer.getLength(), 2U);
}

} // namespace
