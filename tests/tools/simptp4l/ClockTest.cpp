#include "Client.h"
#include "Daemon.h"

#include <cstdint>
#include <ctime>
#include <gtest/gtest.h>

#include "support/Processes.h"

namespace {

std::int64_t numberAt(const std::string& hex, std::size_t at) {
    return static_cast<std::int64_t>(std::stoull(hex.substr(2 * at, 16), nullptr, 16));
}

std::int64_t offsetOf(const std::string& answer) {
    return numberAt(answer, 54);
}

std::int64_t ingressOf(const std::string& answer) {
    return numberAt(answer, 62);
}

bool hasGrandmaster(const std::string& answer) {
    return answer.substr(2 * 92, 8) == "00000001";
}

struct Session {
    explicit Session(const std::string& script)
        : daemon(script, {"v0"}),
          bound(daemon.waitUntilBound()),
          client(daemon.folder.path("me"), daemon.socketPath()) {}

    std::string status() const { return client.ask(requests::timeStatus()); }

    Daemon daemon;
    bool bound;
    Client client;
};

TEST(Simptp4lClock, KeepsTheMeasurementUntilTheNextSync) {
    const Session session("sync-interval 3600\n");
    const std::string first = session.status();
    EXPECT_EQ(session.status(), first);
    const std::int64_t age = std::int64_t{std::time(nullptr)} * 1000000000 - ingressOf(first);
    EXPECT_LT(age, 60000000000);
    EXPECT_GT(age, -2000000000);
}

TEST(Simptp4lClock, AdvancesByWholeIntervals) {
    const Session session("sync-interval 0.01\nclock monotonic\n");
    const std::int64_t first = ingressOf(session.status());
    std::int64_t next = first;
    ASSERT_TRUE(waitUntil([&] { return (next = ingressOf(session.status())) != first; }));
    EXPECT_GT(next, first);
    EXPECT_EQ((next - first) % 10000000, 0);
}

TEST(Simptp4lClock, DriftsWithTime) {
    const Session session("sync-interval 0.005\noffset 1000\ndrift-ppb 1000000\n");
    EXPECT_TRUE(waitUntil([&] { return offsetOf(session.status()) > 101000; }));
}

TEST(Simptp4lClock, JitterIsTheSameForTheSameSeed) {
    const std::string script = "sync-interval 3600\nsyncs-before-delay 0\njitter 1000000\nseed 5\n";
    const Session first(script);
    const Session second(script);
    EXPECT_EQ(offsetOf(first.status()), offsetOf(second.status()));
    EXPECT_NE(offsetOf(first.status()), 0);
}

TEST(Simptp4lClock, LosesTheGrandmasterAsPtp4lDoes) {
    const Session session("offset 7\nsyncs-before-delay 0\nclock fixed 5000\n"
                          "on PARENT_DATA_SET times 1 do gm off\n"
                          "on PARENT_DATA_SET after 1 do gm on\n");
    EXPECT_TRUE(hasGrandmaster(session.status()));
    EXPECT_EQ(session.client.ask(requests::portDataSet()).substr(2 * 64, 2), "08");
    session.client.ask(requests::parentDataSet());
    const std::string lost = session.status();
    EXPECT_FALSE(hasGrandmaster(lost));
    EXPECT_EQ(offsetOf(lost), 7);
    EXPECT_EQ(ingressOf(lost), 0);
    EXPECT_EQ(lost.substr(2 * 96), "020000fffe000001");
    EXPECT_EQ(session.client.ask(requests::portDataSet()).substr(2 * 64, 2), "06");
    session.client.ask(requests::parentDataSet());
    EXPECT_EQ(ingressOf(session.status()), 5000);
}

TEST(Simptp4lClock, ListensUntilAGrandmasterAppears) {
    const Session session("gm-after 0.2\n");
    EXPECT_TRUE(waitUntil([&] { return hasGrandmaster(session.status()); }));
    const Session never("gm absent\n");
    EXPECT_FALSE(hasGrandmaster(never.status()));
    EXPECT_EQ(never.client.ask(requests::portDataSet()).substr(2 * 64, 2), "04");
}

TEST(Simptp4lClock, StepsOffsetAndIngressTimeTogether) {
    const Session session("offset 7\nsyncs-before-delay 0\nclock fixed 5000\nsync-interval 3600\n"
                          "on TIME_STATUS_NP after 1 times 1 do clock-step -0.5\n");
    EXPECT_EQ(ingressOf(session.status()), 5000);
    const std::string stepped = session.status();
    EXPECT_EQ(ingressOf(stepped), 5000 - 500000000);
    EXPECT_EQ(offsetOf(stepped), 7 - 500000000);
    EXPECT_EQ(session.status(), stepped);
}

TEST(Simptp4lClock, ItsOffsetIsInTheIngressTimeAloneToTheNanosecond) {
    const Session session("offset 7\nsyncs-before-delay 0\nclock fixed 5000\n"
                          "clock-offset 37.000000001\n");
    const std::string status = session.status();
    EXPECT_EQ(ingressOf(status), 37000005001);
    EXPECT_EQ(offsetOf(status), 7);
}

TEST(Simptp4lClock, ItsOffsetMayBeNegativeAndGoesWithTheGrandmaster) {
    const Session session("clock fixed 5000000000\nclock-offset -1.5\n"
                          "on PARENT_DATA_SET do gm off\n");
    EXPECT_EQ(ingressOf(session.status()), 3500000000);
    session.client.ask(requests::parentDataSet());
    EXPECT_EQ(ingressOf(session.status()), 0);
}

TEST(Simptp4lClock, TimedLinesActWithoutARequest) {
    const Session session("at 0.1 do gm off\n");
    EXPECT_TRUE(waitUntil([&] { return !hasGrandmaster(session.status()); }));
}

} // namespace
