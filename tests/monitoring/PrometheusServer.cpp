#include "PrometheusServer.h"

#include <regex>

#include <gtest/gtest.h>
#include <unistd.h>

#include "support/Http.h"
#include "support/TemporaryFolder.h"

namespace {

constexpr char program[] = "/usr/bin/prometheus";

Child::Words prepare(const std::string& folder, const std::vector<int>& ports) {
    std::string targets;
    for (const int port : ports) {
        targets += (targets.empty() ? "" : ", ") + ("'127.0.0.1:" + std::to_string(port)) + "'";
    }
    const std::string file = folder + "/prometheus.yml";
    writeFile(file, "global: { scrape_interval: 200ms, scrape_timeout: 200ms }\n"
                    "scrape_configs:\n"
                    "  - job_name: vantel\n"
                    "    static_configs: [{ targets: [" +
                        targets + "] }]\n");
    // It logs to its standard error.
    return {"/bin/sh",
            "-c",
            "exec \"$0\" \"$@\" 2>&1",
            program,
            "--config.file=" + file,
            "--storage.tsdb.path=" + folder + "/data",
            "--web.listen-address=127.0.0.1:0"};
}

} // namespace

bool PrometheusServer::isInstalled() {
    return ::access(program, X_OK) == 0;
}

PrometheusServer::PrometheusServer(const std::string& folder, const std::vector<int>& ports)
    : program_(prepare(folder, ports)) {
    static const std::regex address("\"Listening on\" address=127.0.0.1:(\\d+)");
    std::smatch found;
    // In whichever order.
    if (program_.waitForOutput("\"Listening on\" address=") &&
        program_.waitForOutput("ready to receive web requests") &&
        std::regex_search(program_.output(), found, address)) {
        port_ = std::stoi(found[1]);
    }
}

nlohmann::json PrometheusServer::query(const std::string& expression) const {
    const std::string text = httpGet(port_, "/api/v1/query?query=" + percentEncoded(expression));
    const auto answer = nlohmann::json::parse(text, nullptr, false);
    if (answer.is_object() && answer.value("status", "") == "success") {
        return answer["data"]["result"];
    }
    ADD_FAILURE() << expression << ": " << text;
    return nlohmann::json::array();
}
