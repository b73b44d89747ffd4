// The dashboard with a real Prometheus that scrapes two hosts, each with a fault of its own.

#include <optional>
#include <regex>
#include <set>
#include <string>
#include <vector>

#include <gmock/gmock.h>
#include <gtest/gtest.h>
#include <nlohmann/json.hpp>

#include "PrometheusServer.h"
#include "support/Processes.h"
#include "support/SimulatedRun.h"
#include "support/TemporaryFolder.h"

using nlohmann::json;

namespace {

/// As Grafana does for a user who has chosen these instances, as a regular expression.
std::string filledIn(std::string expression, const std::string& instances) {
    expression = std::regex_replace(expression, std::regex("\\$__rate_interval"), "5s");
    return std::regex_replace(expression, std::regex("\\$instance"), instances);
}

struct Panel {
    std::string title;
    std::vector<std::string> expressions;
};

std::vector<Panel> panelsOf(const json& dashboard) {
    std::vector<Panel> panels;
    for (const auto& panel : dashboard["panels"]) {
        panels.push_back({panel["title"], {}});
        for (const auto& target : panel["targets"]) {
            panels.back().expressions.push_back(target["expr"]);
        }
    }
    return panels;
}

class DashboardTest : public testing::Test {
protected:
    std::string expression(const std::string& title) const {
        for (const Panel& panel : panels) {
            if (panel.title == title) {
                return panel.expressions.at(0);
            }
        }
        ADD_FAILURE() << "there is no panel " << title;
        return "";
    }

    using Values = std::set<std::string>;

    /// The values of a label among the samples of a panel, for some instances.
    Values labels(const std::string& title, const std::string& label,
                  const std::string& instances) const {
        Values values;
        for (const auto& sample : prometheus->query(filledIn(expression(title), instances))) {
            values.insert(sample["metric"].value(label, ""));
        }
        return values;
    }

    /// They become these in time.
    void expectLabels(const std::string& title, const std::string& label,
                      const std::string& instances, const Values& expected) const {
        EXPECT_TRUE(waitUntil([&] { return labels(title, label, instances) == expected; }))
            << title << ": " << testing::PrintToString(labels(title, label, instances));
    }

    static std::string instance(SimulatedRun& run) {
        return "127.0.0.1:" + std::to_string(run.metricsPort());
    }

    const json dashboard =
        json::parse(readFile(VANTEL_PROJECT_FOLDER "/monitoring/dashboard.json"));
    const std::vector<Panel> panels = panelsOf(dashboard);
    const TemporaryFolder folder;
    std::optional<PrometheusServer> prometheus;
};

} // namespace

TEST_F(DashboardTest, EachExpressionHasDataAndTwoFaultsAreToldApart) {
    if (!PrometheusServer::isInstalled()) {
        GTEST_SKIP() << "SKIPPED: Prometheus is missing; run scripts/setup.sh checks";
    }
    SimulatedRun lost(folder.path("lost"), "offset 250\nat 4 do gm off\n",
                      {"--chrony", folder.path("chrony.sock")});
    SimulatedRun unmeasured(folder.path("unmeasured"), "offset 250\nsyncs-before-delay all\n");
    const std::string lostInstance = instance(lost);
    const std::string unmeasuredInstance = instance(unmeasured);
    prometheus.emplace(folder.path(), std::vector{lost.metricsPort(), unmeasured.metricsPort()});
    ASSERT_TRUE(prometheus->isReady());

    for (const Panel& panel : panels) {
        for (const std::string& expression : panel.expressions) {
            EXPECT_TRUE(waitUntil([&] {
                return !prometheus->query(filledIn(expression, ".+")).empty();
            })) << panel.title
                << ": " << expression;
        }
    }
    expectLabels("Health", "state", lostInstance, {"lost"});
    expectLabels("Health", "state", unmeasuredInstance, {"unmeasured"});
    expectLabels("Quality and its reason", "quality", lostInstance, {"unusable"});
    expectLabels("Quality and its reason", "quality", unmeasuredInstance, {"usable"});
    expectLabels("Offset", "instance", ".+", {lostInstance});
    expectLabels("Time pairs", "instance", ".+", {lostInstance, unmeasuredInstance});
}

TEST(Dashboard, NeedsNothingThatGrafanaDoesNotBring) {
    const json dashboard =
        json::parse(readFile(VANTEL_PROJECT_FOLDER "/monitoring/dashboard.json"));
    const std::set<std::string> own{"stat", "state-timeline", "table", "timeseries"};
    std::set<int> ids;
    for (const auto& panel : dashboard["panels"]) {
        EXPECT_EQ(own.count(panel["type"]), 1U) << panel["type"];
        EXPECT_EQ(panel["datasource"]["uid"], "${datasource}") << panel["title"];
        EXPECT_TRUE(ids.insert(panel["id"].get<int>()).second) << panel["title"];
        for (const auto& target : panel["targets"]) {
            EXPECT_THAT(target["expr"].get<std::string>(),
                        testing::HasSubstr("{instance=~\"$instance\""));
        }
    }
    EXPECT_FALSE(ids.empty());
}
