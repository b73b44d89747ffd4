// What zekeltr_initialize costs beside one parse of the same text, in turns.

#include <array>
#include <cstdlib>
#include <stdexcept>

#include <cjson/cJSON.h>
#include <vantel_bc/zekeltr.h>

#include "Clocks.h"
#include "Measurements.h"
#include "Program.h"
#include "Row.h"
#include "Session.h"
#include "Statistics.h"
#include "errors/Status.h"
#include "support/TemporaryFolder.h"

namespace {

constexpr int calls = 200; ///< in one round

/// CPU time of a call, without what cleans up behind it.
template <typename Call, typename Clean>
double secondsPerCall(Call call, Clean clean) {
    std::array<void*, calls> made{};
    const double before = secondsOf(CLOCK_THREAD_CPUTIME_ID);
    for (void*& each : made) {
        call(each);
    }
    const double spent = secondsOf(CLOCK_THREAD_CPUTIME_ID) - before;
    for (void*& each : made) {
        if (each == nullptr) {
            throw std::runtime_error("a call failed");
        }
        clean(each);
    }
    return spent / calls;
}

double secondsOfInitialize(const std::string& text) {
    return secondsPerCall(
        [&](void*& slot) {
            zeerr::LocalStatus status;
            zekeltr_initialize(&slot, text.c_str(), &status);
        },
        [](void*& slot) { zekeltr_finalize(&slot); });
}

double secondsOfParse(const std::string& text) {
    return secondsPerCall([&](void*& document) { document = cJSON_Parse(text.c_str()); },
                          [](void*& document) { cJSON_Delete(static_cast<cJSON*>(document)); });
}

std::string withFile(std::string text, const std::string& file) {
    const std::string usual = "ptp4l.conf";
    return text.replace(text.find(usual), usual.size(), file);
}

void compare(int rounds) {
    setenv("TMPDIR", "/dev/shm", 1); // a tmpfs, as /var/run is
    const TemporaryFolder folder;
    const std::string text = withFile(useSimulator(""), folder.path("ptp4l.conf"));
    const std::string noFile = withFile(useSimulator(""), folder.path("missing/ptp4l.conf"));
    std::vector<double> initialize;
    std::vector<double> withoutFile;
    std::vector<double> parse;
    secondsOfInitialize(text); // the first calls do not count
    for (int round = 0; round < rounds; ++round) {
        initialize.push_back(secondsOfInitialize(text));
        withoutFile.push_back(secondsOfInitialize(noFile));
        parse.push_back(secondsOfParse(text));
    }
    print({"CPU: cJSON_Parse of a configuration", "", median(parse) * 1e6, "us"});
    print({"CPU: zekeltr_initialize, with its file on a tmpfs", "", median(initialize) * 1e6, "us",
           medianRatio(initialize, parse), 20});
    print({"CPU: zekeltr_initialize, with a file that cannot be written", "",
           median(withoutFile) * 1e6, "us", medianRatio(withoutFile, parse), 20});
}

} // namespace

void addInitializeCost(Program& program) {
    const auto rounds = std::make_shared<int>(25);
    Options options = program.add(
        "initialize_cost", "Prints what zekeltr_initialize costs beside one parse of its text.",
        [rounds] { compare(*rounds); });
    options.add("--rounds", *rounds, "turns of each");
}
