// The metrics that a run serves, with the plug-in itself and the simulated ptp4l.

#include <csignal>
#include <map>
#include <regex>
#include <set>
#include <sstream>

#include <sys/socket.h>
#include <unistd.h>

#include "Tool.h"
#include "support/Http.h"
#include "support/Markdown.h"
#include "support/Processes.h"
#include "support/SimulatedRun.h"
#include "support/TcpConnection.h"

using testing::HasSubstr;
using vantelhost::Json;

namespace {

/// A metric without its samples.
struct Kind {
    std::string type;
    std::set<std::string> labels;

    bool operator==(const Kind& other) const {
        return type == other.type && labels == other.labels;
    }
};

void PrintTo(const Kind& kind, std::ostream* stream) {
    *stream << kind.type << " " << testing::PrintToString(kind.labels);
}

using Kinds = std::map<std::string, Kind>;

std::set<std::string> wordsIn(const std::string& text, const std::regex& word) {
    std::set<std::string> words;
    for (std::sregex_iterator found(text.begin(), text.end(), word), end; found != end; ++found) {
        words.insert((*found)[1]);
    }
    return words;
}

/// Of what Prometheus reads. The samples of a metric stand behind its type.
Kinds kindsIn(const std::string& page) {
    static const std::regex type("# TYPE (\\w+) (\\w+)");
    static const std::regex label("(\\w+)=\"(?:[^\"\\\\]|\\\\.)*\"");
    Kinds kinds;
    std::string name;
    std::istringstream lines(page);
    std::smatch found;
    for (std::string line; std::getline(lines, line);) {
        if (std::regex_match(line, found, type)) {
            name = found[1];
            kinds[name].type = found[2];
        } else if (line.compare(0, 1, "#") != 0) {
            kinds[name].labels.merge(wordsIn(line, label));
        }
        kinds[name].labels.erase("le"); // of each bucket of a histogram
    }
    kinds.erase("");
    return kinds;
}

Kinds documentedKinds() {
    static const std::regex label("(\\w+)");
    Kinds kinds;
    const std::string document = contentOf(VANTEL_PROJECT_FOLDER "/docs/metrics.md");
    for (const auto& row : markdown::tables(document, {"metric", "type", "labels", "meaning"})) {
        kinds[markdown::unquoted(row.at(0))] = {row.at(1), wordsIn(row.at(2), label)};
    }
    return kinds;
}

class ToolMetricsTest : public testing::Test {
protected:
    Folder folder;
};

} // namespace

TEST_F(ToolMetricsTest, ARunServesWhatTheDocumentHasAndNothingElse) {
    SimulatedRun run(folder.path(""), "offset 250\n", {"--chrony", folder.path("chrony.sock")});
    Child& host = run.host();
    const int port = run.metricsPort();
    ASSERT_TRUE(host.waitForOutput("\"offset\":250", 2)) << host.errors();
    const std::string page = httpGet(port, "/metrics");
    const Kinds documented = documentedKinds();
    ASSERT_FALSE(documented.empty());
    EXPECT_EQ(kindsIn(page), documented);
    EXPECT_THAT(page, HasSubstr("\nvantel_offset_seconds 2.5e-07\n"));
    EXPECT_THAT(page, HasSubstr("\nvantel_build_info{version=\"" VANTEL_VERSION "\"} 1\n"));
    EXPECT_THAT(page, HasSubstr("\nvantel_chrony_pairs_total{result=\"sent\"} 0\n"));
    EXPECT_THAT(page, HasSubstr("\nvantel_port_state{port=\"1\",interface=\"sim0\"} 8\n"));
    EXPECT_THAT(page, HasSubstr("{identity=\"00:1B:21:FF:FE:0A:0B:0C\",class=\"6\","
                                "accuracy=\"WITHIN_100NS\",priority1=\"128\",priority2=\"128\"}"));
}

TEST_F(ToolMetricsTest, PromtoolFindsNothingInThePage) {
    if (::access("/usr/bin/promtool", X_OK) != 0) {
        GTEST_SKIP() << "SKIPPED: promtool is missing; run scripts/setup.sh checks";
    }
    SimulatedRun run(folder.path(""), "offset 250\n");
    Child& host = run.host();
    const int port = run.metricsPort();
    ASSERT_TRUE(host.waitForOutput("\"offset\":250"));
    std::string page = httpGet(port, "/metrics");
    // Its own metrics are not ours to name.
    page.erase(page.find("# HELP exposer"),
               page.find("# HELP vantel") - page.find("# HELP exposer"));
    Child promtool({"/usr/bin/promtool", "check", "metrics"});
    promtool.write(page);
    EXPECT_EQ(promtool.wait(), 0);
    EXPECT_EQ(promtool.output() + promtool.errors(), "");
}

TEST_F(ToolMetricsTest, APortInUseIsToldAndTheRunGoesOn) {
    const SilentListener other;
    SimulatedRun run(folder.path(""), "offset 250\n", {}, other.port());
    Child& host = run.host();
    ASSERT_TRUE(host.waitForOutput("\"offset\":250"));
    EXPECT_THAT(host.output(), HasSubstr("\"listening\":false,\"address\":\"127.0.0.1:" +
                                         std::to_string(other.port()) +
                                         "\",\"problem\":\"Address already in use\""));
    host.signal(SIGTERM);
    EXPECT_EQ(host.wait(), 0);
}

TEST_F(ToolMetricsTest, CountersGoOnOverARestart) {
    SimulatedRun run(folder.path(""), "offset 250\nat 1 do exit 1\n", {"--restart"});
    Child& host = run.host();
    const int port = run.metricsPort();
    ASSERT_TRUE(host.waitForOutput("\"event\":\"restart\""));
    host.forgetOutput();
    ASSERT_TRUE(host.waitForOutput("\"state\":\"locked\""));
    std::string page;
    EXPECT_TRUE(waitUntil([&] {
        page = httpGet(port, "/metrics");
        return page.find("\nvantel_health{state=\"locked\"} 1\n") != std::string::npos;
    }));
    EXPECT_THAT(page, HasSubstr("\nvantel_session_restarts_total 1\n"));
    EXPECT_THAT(page, testing::Not(HasSubstr("\nvantel_pairs_total 1\n")));
}

TEST_F(ToolMetricsTest, AnAddressThatIsNoneIsRefused) {
    Child host({HOST_TOOL, "run", "--interface", "eth0", "--metrics", "localhost:9993"});
    EXPECT_EQ(host.wait(), 2);
    EXPECT_THAT(host.errors(), HasSubstr("ADDRESS:PORT"));
    EXPECT_THAT(host.errors(), HasSubstr("\"localhost:9993\""));
}

TEST_F(ToolMetricsTest, ClientsThatNeverReadHoldUpNeitherPairsNorTheEnd) {
    SimulatedRun run(folder.path(""), "offset 250\n");
    Child& host = run.host();
    const int port = run.metricsPort();
    std::vector<Descriptor> clients;
    for (int i = 0; i < 20; ++i) {
        clients.push_back(connectTo(port));
        const std::string request = "GET /metrics HTTP/1.1\r\nHost: x\r\n\r\n";
        ASSERT_GT(::send(clients.back().get(), request.data(), request.size(), MSG_NOSIGNAL), 0);
    }
    host.forgetOutput();
    EXPECT_TRUE(host.waitForOutput("\"event\":\"pair\"", 8));
    host.signal(SIGTERM);
    EXPECT_EQ(host.wait(), 0);
}
