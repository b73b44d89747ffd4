// A program of its own: select and setsockopt are those below, which write down the time limits
// that they get. No time passes in this select.

#include "tUdsMsgInterface.h"

#include <cstring>
#include <utility>
#include <vector>

#include <gmock/gmock.h>
#include <sys/select.h>
#include <sys/socket.h>
#include <sys/time.h>

#include "PtpMgmtNodeExchange.h"
#include "support/Descriptors.h"
#include "support/NextFunction.h"

using testing::ElementsAre;
using testing::IsEmpty;
using testing::Pair;
using zekelVantel::tUdsMsgAddress;

namespace {

/// Seconds and microseconds.
using TimeLimit = std::pair<std::int64_t, std::int64_t>;

std::vector<TimeLimit> limitsOfWaits;
std::vector<std::pair<int, TimeLimit>> limitsOfSends; ///< behind the descriptor

} // namespace

extern "C" {

int select(int count, fd_set* readable, fd_set* writable, fd_set* exceptional, timeval* timeout) {
    limitsOfWaits.emplace_back(timeout->tv_sec, timeout->tv_usec);
    *timeout = {};
    return nextFunction<decltype(select)>("select")(count, readable, writable, exceptional,
                                                    timeout);
}

int setsockopt(int descriptor, int level, int name, const void* value, socklen_t length) noexcept {
    if (level == SOL_SOCKET && name == SO_SNDTIMEO && length == sizeof(timeval)) {
        timeval limit{};
        std::memcpy(&limit, value, sizeof(limit));
        limitsOfSends.emplace_back(descriptor, TimeLimit(limit.tv_sec, limit.tv_usec));
    }
    return nextFunction<decltype(setsockopt)>("setsockopt")(descriptor, level, name, value, length);
}

} // extern "C"

namespace {

class UdsMsgTimeLimitTest : public PtpMgmtNodeExchangeTest {
protected:
    UdsMsgTimeLimitTest() {
        limitsOfWaits.clear();
        limitsOfSends.clear();
    }
};

TEST_F(UdsMsgTimeLimitTest, SendingMayTakeTwoSeconds) {
    EXPECT_THAT(limitsOfSends, ElementsAre(Pair(descriptorBoundTo("local"), Pair(2, 0))));
}

TEST_F(UdsMsgTimeLimitTest, ReceivingWaitsForTheMillisecondsItIsGiven) {
    for (const auto& [milliseconds, limit] : {std::pair(0U, TimeLimit(0, 0)),
                                              {1U, {0, 1000}},
                                              {999U, {0, 999000}},
                                              {1000U, {1, 0}},
                                              {1001U, {1, 1000}},
                                              {1234U, {1, 234000}},
                                              {2000U, {2, 0}},
                                              {4294967295U, {4294967, 295000}}}) {
        limitsOfWaits.clear();
        zekelVantel::tMsgBuffer buffer;
        zeerr::LocalStatus result;
        interface.receive(buffer, milliseconds, result);
        EXPECT_EQ(result.code, -52007);
        EXPECT_THAT(limitsOfWaits, ElementsAre(limit)) << milliseconds;
    }
}

TEST_F(UdsMsgTimeLimitTest, ReceivingThatTellsTheSenderWaitsAsLong) {
    zekelVantel::tMsgBuffer buffer;
    tUdsMsgAddress source("");
    interface.receive(buffer, source, 1234, status);
    EXPECT_EQ(status.code, -52007);
    EXPECT_THAT(limitsOfWaits, ElementsAre(Pair(1, 234000)));
}

TEST_F(UdsMsgTimeLimitTest, SingleAnswerMayTakeTwoSeconds) {
    getSingle<zekelVantel::tPtp4lTimeStatusMgmtTlv>(status);
    EXPECT_EQ(status.code, -52007);
    EXPECT_THAT(limitsOfWaits, ElementsAre(Pair(2, 0)));
}

TEST_F(UdsMsgTimeLimitTest, AnswerOfEachPortMayTakeTwoSeconds) {
    answer(portNpAnswer(1));
    answer(portNpAnswer(2));
    EXPECT_EQ(getNp(3, status).size(), 2U);
    EXPECT_EQ(status.code, -52007);
    EXPECT_THAT(limitsOfWaits, ElementsAre(Pair(2, 0), Pair(2, 0), Pair(2, 0)));
}

TEST_F(UdsMsgTimeLimitTest, RequestThatIsNotSentIsNotWaitedFor) {
    zekelVantel::tPtp4lDefaultDataSetMgmtTlv tlv;
    node.getSingle(interface, tUdsMsgAddress("nobody"), tlv, status);
    EXPECT_EQ(status.code, -52024);
    EXPECT_THAT(limitsOfWaits, IsEmpty());
}

} // namespace
