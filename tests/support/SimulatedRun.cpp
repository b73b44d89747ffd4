#include "support/SimulatedRun.h"

#include <filesystem>
#include <fstream>
#include <regex>

namespace {

Child::Words prepare(const std::string& folder, const std::string& script,
                     const Child::Words& options, int port) {
    std::filesystem::create_directories(folder);
    std::filesystem::create_symlink(VANTEL_SIMPTP4L, folder + "/ptp4l");
    std::ofstream(folder + "/ptp4l.conf.sim") << script;
    Child::Words words{"/bin/sh",
                       "-c",
                       R"(cd "$0" && exec "$@")",
                       folder,
                       HOST_TOOL,
                       "run",
                       "--json",
                       "--library",
                       VANTEL_BC_TEST_LIBRARY,
                       "--interface",
                       "sim0",
                       "--fifo",
                       folder + "/quillEpochOffset",
                       "--create-fifo",
                       "--set",
                       "logSyncInterval=-3",
                       "--set",
                       "udsAddress=" + folder + "/uds",
                       "--set",
                       "configFile=" + folder + "/ptp4l.conf",
                       "--metrics",
                       "127.0.0.1:" + std::to_string(port)};
    words.insert(words.end(), options.begin(), options.end());
    return words;
}

} // namespace

SimulatedRun::SimulatedRun(const std::string& folder, const std::string& script,
                           const Child::Words& options, int port)
    : host_(prepare(folder, script, options, port)) {}

int SimulatedRun::metricsPort() {
    static const std::regex address("\"listening\":true,\"address\":\"127.0.0.1:(\\d+)\"");
    std::smatch found;
    return host_.waitForOutput("\"listening\":true") &&
                   std::regex_search(host_.output(), found, address)
               ? std::stoi(found[1])
               : 0;
}
