#include "Client.h"
#include "Daemon.h"

#include <chrono>
#include <memory>

#include <gtest/gtest.h>

#include "support/Processes.h"

namespace {

using Ports = std::vector<std::string>;

/// Three ports, and the clock standing still.
class Simptp4lFault : public testing::Test {
protected:
    void start(const std::string& script) {
        daemon =
            std::make_unique<Daemon>("clock fixed 5000\nsync-interval 3600\nports 3\n" + script);
        ASSERT_TRUE(daemon->waitUntilBound());
        client = std::make_unique<Client>(daemon->folder.path("me"), daemon->socketPath());
    }

    /// The port numbers of all answers to a GET of PORT_DATA_SET.
    Ports answeringPorts() {
        client->send(requests::portDataSet());
        // An answer to this one comes behind them.
        client->send(requests::timeStatus("fe0f"));
        Ports ports;
        for (std::string answer = client->receive(); answer.substr(60, 4) != "fe0f";
             answer = client->receive()) {
            if (answer == "none") {
                return {"none"};
            }
            ports.push_back(answer.substr(56, 4));
        }
        return ports;
    }

    std::string statusOf(const std::string& sequence) {
        return client->ask(requests::timeStatus(sequence));
    }

    std::unique_ptr<Daemon> daemon;
    std::unique_ptr<Client> client;
};

TEST_F(Simptp4lFault, SilenceGivesNoAnswer) {
    start("on PORT_DATA_SET do silence\n");
    EXPECT_EQ(answeringPorts(), Ports{});
}

TEST_F(Simptp4lFault, AfterAndTimesCountMatchingRequests) {
    start("on PORT_DATA_SET after 1 times 2 do silence\n");
    const Ports all{"0001", "0002", "0003"};
    EXPECT_EQ(answeringPorts(), all);
    EXPECT_EQ(answeringPorts(), Ports{});
    EXPECT_EQ(answeringPorts(), Ports{});
    EXPECT_EQ(answeringPorts(), all);
}

TEST_F(Simptp4lFault, FromAndUntilLimitTheTime) {
    start("on PARENT_DATA_SET until 0 do error 6\non PARENT_DATA_SET from 900000 do error 6\n"
          "on DEFAULT_DATA_SET from 0 until 900000 do error 6\n");
    EXPECT_EQ(client->ask(requests::parentDataSet()).size(), 2 * 86U);
    EXPECT_EQ(client->ask(requests::defaultDataSet()).size(), 2 * 60U);
}

TEST_F(Simptp4lFault, DelayHoldsUpOneAnswerOnly) {
    start("on PARENT_DATA_SET do delay 0.3\n");
    const auto before = std::chrono::steady_clock::now();
    ASSERT_TRUE(client->send(requests::parentDataSet()));
    EXPECT_EQ(statusOf("0001").size(), 2 * 104U);
    EXPECT_EQ(client->receive().size(), 2 * 86U);
    EXPECT_GE(std::chrono::steady_clock::now() - before, std::chrono::milliseconds(300));
}

TEST_F(Simptp4lFault, DropLeavesOutOneAnswerOrAll) {
    start("on PORT_DATA_SET times 1 do drop 2\non PORT_DATA_SET after 1 do drop all\n");
    EXPECT_EQ(answeringPorts(), (Ports{"0001", "0003"}));
    EXPECT_EQ(answeringPorts(), Ports{});
}

TEST_F(Simptp4lFault, DuplicateRepeatsOneAnswerOrEach) {
    start("on PORT_DATA_SET times 1 do duplicate 3\non PORT_DATA_SET after 1 do duplicate\n");
    EXPECT_EQ(answeringPorts(), (Ports{"0001", "0002", "0003", "0003"}));
    EXPECT_EQ(answeringPorts(), (Ports{"0001", "0001", "0002", "0002", "0003", "0003"}));
}

TEST_F(Simptp4lFault, ReorderReversesThePorts) {
    start("on PORT_DATA_SET do reorder\n");
    EXPECT_EQ(answeringPorts(), (Ports{"0003", "0002", "0001"}));
}

TEST_F(Simptp4lFault, AnswersChangesTheirNumber) {
    start("on PORT_DATA_SET times 1 do answers -1\n"
          "on PORT_DATA_SET after 1 times 1 do answers +1\n"
          "on PORT_DATA_SET after 2 do answers 1\n");
    EXPECT_EQ(answeringPorts(), (Ports{"0001", "0002"}));
    EXPECT_EQ(answeringPorts(), (Ports{"0001", "0002", "0003", "0004"}));
    EXPECT_EQ(answeringPorts(), Ports{"0001"});
}

TEST_F(Simptp4lFault, OtherPortAnswersFromUnknownPorts) {
    start("on PORT_DATA_SET do other-port\n");
    EXPECT_EQ(answeringPorts(), (Ports{"0065", "0066", "0067"}));
}

TEST_F(Simptp4lFault, LengthChangesTheDatagramNotItsMessageLength) {
    start("on TIME_STATUS_NP times 1 do length +1\n"
          "on TIME_STATUS_NP after 1 times 1 do length -1\n"
          "on TIME_STATUS_NP after 2 do length 10\n");
    const std::string longer = statusOf("0000");
    EXPECT_EQ(longer.size(), 2 * 105U);
    EXPECT_EQ(longer.substr(0, 8), "0d020068");
    EXPECT_EQ(longer.substr(2 * 104), "00");
    const std::string shorter = statusOf("0000");
    EXPECT_EQ(shorter.size(), 2 * 103U);
    EXPECT_EQ(shorter.substr(0, 8), "0d020068");
    EXPECT_EQ(statusOf("0000"), "0d020068000000000000");
}

TEST_F(Simptp4lFault, GarbageIsReproducible) {
    start("seed 0\non TIME_STATUS_NP times 1 do garbage 4\n"
          "on TIME_STATUS_NP after 1 times 1 do garbage 0\n"
          "on TIME_STATUS_NP after 2 do garbage 65000\n");
    // The low octets of the first splitmix64 numbers of seed 0.
    EXPECT_EQ(statusOf("0000"), "aff44fec");
    EXPECT_EQ(statusOf("0000"), "");
    EXPECT_EQ(statusOf("0000").size(), 2 * 65000U);
}

TEST_F(Simptp4lFault, ErrorTakesThePlaceOfEveryAnswer) {
    start("clock-identity 0011223344556677\non PORT_DATA_SET do error 6\n");
    EXPECT_EQ(client->ask(requests::portDataSet()),
              "0d02003c000000000000000000000000000000000011223344556677"
              "00010000047f0000000000000000000100000200"
              "000200080006200400000000");
    EXPECT_EQ(client->receive(2).back().substr(2 * 28, 4), "0003");
}

TEST_F(Simptp4lFault, FloodSendsEachAnswerManyTimes) {
    start("on PORT_DATA_SET do flood 50\n");
    EXPECT_EQ(answeringPorts().size(), 150U);
}

TEST_F(Simptp4lFault, FloodOfAClientThatDoesNotReadIsDroppedAndLogged) {
    start("on TIME_STATUS_NP times 1 do flood 2000\n");
    ASSERT_TRUE(client->send(requests::timeStatus()));
    const Client other(daemon->folder.path("other"), daemon->socketPath());
    EXPECT_EQ(other.ask(requests::parentDataSet()).size(), 2 * 86U);
    EXPECT_TRUE(waitUntil([&] { return daemon->log().find("\"dropped\"") != std::string::npos; }));
}

TEST_F(Simptp4lFault, LateAnswersComeBeforeTheNextOnes) {
    start("on TIME_STATUS_NP times 1 do late\n");
    ASSERT_TRUE(client->send(requests::timeStatus("0001")));
    EXPECT_EQ(statusOf("0002").substr(60, 4), "0001");
    EXPECT_EQ(client->receive().substr(60, 4), "0002");
}

TEST_F(Simptp4lFault, LateAnswersReachAnAddressThatWasBoundAnew) {
    start("on TIME_STATUS_NP times 1 do late\n");
    ASSERT_TRUE(client->send(requests::timeStatus("0001")));
    ASSERT_TRUE(waitUntil([&] { return daemon->log().find("\"request\"") != std::string::npos; }));
    client.reset();
    const Client next(daemon->folder.path("me"), daemon->socketPath());
    EXPECT_EQ(next.ask(requests::parentDataSet()).substr(60, 4), "0001");
    EXPECT_EQ(next.receive().size(), 2 * 86U);
}

TEST_F(Simptp4lFault, StopReadingLeavesRequestsInTheSocket) {
    start("on PARENT_DATA_SET do stop-reading 0.3\n");
    const auto before = std::chrono::steady_clock::now();
    EXPECT_EQ(client->ask(requests::parentDataSet()).size(), 2 * 86U);
    EXPECT_EQ(statusOf("0001").size(), 2 * 104U);
    EXPECT_GE(std::chrono::steady_clock::now() - before, std::chrono::milliseconds(300));
}

TEST_F(Simptp4lFault, UnbindRemovesTheSocketFileAndRebindBringsItBack) {
    start("on PARENT_DATA_SET do unbind\nat 0.5 do rebind\n");
    EXPECT_EQ(client->ask(requests::parentDataSet()).size(), 2 * 86U);
    EXPECT_TRUE(waitUntil([&] { return client->send(requests::timeStatus()); }));
    EXPECT_EQ(client->receive().size(), 2 * 104U);
}

TEST_F(Simptp4lFault, ExitEndsWithoutAnAnswer) {
    start("on PARENT_DATA_SET do exit 42\n");
    ASSERT_TRUE(client->send(requests::parentDataSet()));
    EXPECT_EQ(daemon->process.wait(), 42);
    EXPECT_TRUE(client->isQuiet());
    EXPECT_FALSE(client->send(requests::timeStatus()));
}

} // namespace
