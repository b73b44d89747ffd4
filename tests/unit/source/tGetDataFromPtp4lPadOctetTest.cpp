// Debian's ptp4l drops a PORT_PROPERTIES_NP request whose messageLength leaves the pad octet out;
// see what the fetcher makes of it.

#include "tGetDataFromPtp4l.h"

#include <gtest/gtest.h>

#include "support/FetcherTest.h"

using zekelVantel::tGetDataFromPtp4l;

namespace {

class PtpFetchPadOctetTest : public FetcherTest {
protected:
    /// The messageLength of every PORT_PROPERTIES_NP request so far.
    std::vector<int> messageLengths() const {
        std::vector<int> lengths;
        for (const auto& request : requestsFor(FakePtp4l::portPropertiesNp)) {
            EXPECT_EQ(request.octets.size(), 68U);
            lengths.push_back(request.messageLength());
        }
        return lengths;
    }

    /// Compares the requests of the second call with those of the first.
    void expectTheSameRequestsButForTheLength() const {
        const auto requests = daemon.requests();
        ASSERT_GE(requests.size(), 12U);
        for (std::size_t index = 0; index < 6; ++index) {
            auto expected = requests[index].octets;
            expected[31] = static_cast<std::uint8_t>(expected[31] + 6);
            if (index == 5) {
                expected[3] = 68;
            }
            EXPECT_EQ(requests[index + 6].octets, expected) << index;
        }
    }
};

using Lengths = std::vector<int>;

void dropUncountedPads(const FakePtp4l::Request& request, FakePtp4l::Answers& answers) {
    if (request.messageLength() != request.octets.size()) {
        answers.clear();
    }
}

TEST_F(PtpFetchPadOctetTest, IsNotCountedWhileTheDaemonAnswers) {
    for (int call = 0; call < 3; ++call) {
        EXPECT_EQ(fetch(), 0);
    }
    EXPECT_EQ(messageLengths(), (Lengths{67, 67, 67}));
}

TEST_F(PtpFetchPadOctetTest, CountsForGoodAfterATimeOutBeforeTheFirstAnswer) {
    daemon.setScript(dropUncountedPads);
    EXPECT_EQ(fetch(), -52007);
    EXPECT_EQ(timeStatus.masterOffset, -42);
    EXPECT_EQ(metaData, zekelVantel::tPtp4lMetaData());
    EXPECT_EQ(messageLengths(), Lengths{67}) << "nothing is sent again inside a call";
    EXPECT_EQ(fetch(), 0);
    EXPECT_EQ(fetch(), 0);
    EXPECT_EQ(messageLengths(), (Lengths{67, 68, 68}));
    expectTheSameRequestsButForTheLength();

    daemon.setScript([](const FakePtp4l::Request& request, FakePtp4l::Answers& answers) {
        if (request.managementId() == FakePtp4l::portPropertiesNp) {
            answers.front().resize(10);
        }
    });
    EXPECT_EQ(fetch(), -52012);
    daemon.setScript(nullptr);
    EXPECT_EQ(fetch(), 0);
    EXPECT_EQ(messageLengths(), (Lengths{67, 68, 68, 68, 68}));

    tGetDataFromPtp4l another("./ptp4l_bc", 0);
    EXPECT_EQ(another.fetch(timeStatus, metaData), 0);
    EXPECT_EQ(messageLengths().back(), 67) << "each fetcher finds out by itself";
}

TEST_F(PtpFetchPadOctetTest, TimeOutAfterTheFirstAnswerChangesNothing) {
    daemon.setPorts(2);
    daemon.setScript([](const FakePtp4l::Request& request, FakePtp4l::Answers& answers) {
        if (request.managementId() == FakePtp4l::portPropertiesNp) {
            answers.pop_back();
        }
    });
    EXPECT_EQ(fetch(), -52007);
    daemon.setScript(nullptr);
    EXPECT_EQ(fetch(), 0);
    EXPECT_EQ(messageLengths(), (Lengths{67, 67}));
}

TEST_F(PtpFetchPadOctetTest, ShortAnswerChangesNothing) {
    daemon.setScript([](const FakePtp4l::Request& request, FakePtp4l::Answers& answers) {
        if (request.managementId() == FakePtp4l::portPropertiesNp) {
            answers.front().resize(66);
        }
    });
    EXPECT_EQ(fetch(), -52012);
    daemon.setScript(nullptr);
    EXPECT_EQ(fetch(), 0);
    EXPECT_EQ(messageLengths(), (Lengths{67, 67}));
}

TEST_F(PtpFetchPadOctetTest, DaemonWithoutPortsThatDropsTheRequestChangesNothing) {
    daemon.setPorts(0);
    daemon.setScript(dropUncountedPads);
    EXPECT_EQ(fetch(), 0);
    EXPECT_EQ(fetch(), 0);
    daemon.settle();
    EXPECT_EQ(messageLengths(), (Lengths{67, 67}));
}

} // namespace
