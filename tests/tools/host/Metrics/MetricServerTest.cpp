#include "Metrics/MetricServer.h"

#include <optional>

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include "Metrics/Metrics.h"
#include "support/Http.h"
#include "support/Processes.h"
#include "support/TcpConnection.h"

using namespace vantelhost;
using testing::HasSubstr;

namespace {

ListenAddress localAddress(int port) {
    return parseListenAddress("127.0.0.1:" + std::to_string(port)).value();
}

int portIn(const Event& event) {
    return parseListenAddress(event.members["address"]).value().port;
}

} // namespace

TEST(MetricServer, AnswersWhoAsks) {
    Metrics metrics(localAddress(0), Moment::Clock::now());
    const auto event = metrics.attend();
    ASSERT_TRUE(event.has_value());
    EXPECT_EQ(event->members["listening"], true);
    EXPECT_EQ(event->text, "served at 127.0.0.1:" + std::to_string(portIn(*event)));
    metrics.take(pairEvent(0, 1000, 1000), {0, 0});
    metrics.takeChrony({7, 3, 2});
    const std::string page = httpGet(portIn(*event), "/metrics");
    EXPECT_THAT(page, HasSubstr("\nvantel_offset_seconds 1e-06\n"));
    EXPECT_THAT(page, HasSubstr("\nvantel_chrony_pairs_total{result=\"sent\"} 7\n"));
    EXPECT_THAT(page, HasSubstr("\nvantel_chrony_pairs_total{result=\"failed\"} 3\n"));
    EXPECT_THAT(page, HasSubstr("\nvantel_chrony_pairs_total{result=\"withheld\"} 2\n"));
    EXPECT_EQ(httpGet(portIn(*event), "/"), "");
    EXPECT_FALSE(metrics.attend().has_value());
}

TEST(MetricServer, APortInUseIsToldOnceAndTriedAgainAfterTenSeconds) {
    using std::chrono::seconds;
    std::optional<SilentListener> other(std::in_place);
    MetricServer server(localAddress(other->port()), nullptr);
    const auto begin = Moment::Clock::now();
    const auto refused = server.attend(begin);
    ASSERT_TRUE(refused.has_value());
    EXPECT_EQ(refused->members["listening"], false);
    EXPECT_EQ(refused->members["problem"], "Address already in use");
    EXPECT_EQ(refused->text, "not served at 127.0.0.1:" + std::to_string(other->port()) +
                                 ": Address already in use; tried again");
    EXPECT_FALSE(server.attend(begin + seconds(10)).has_value());
    other.reset();
    EXPECT_FALSE(server.attend(begin + seconds(19)).has_value());
    const auto served = server.attend(begin + seconds(20));
    ASSERT_TRUE(served.has_value());
    EXPECT_EQ(served->members["listening"], true);
}

TEST(MetricServer, ClientsThatNeverAskAreSentAwayAndOthersAnswered) {
    Metrics metrics(localAddress(0), Moment::Clock::now());
    const int port = portIn(metrics.attend().value());
    const Descriptor silent[] = {connectTo(port), connectTo(port), connectTo(port)};
    ASSERT_TRUE(silent[2].isOpen());
    EXPECT_TRUE(waitUntil([&] { return !httpGet(port, "/metrics").empty(); }));
}
