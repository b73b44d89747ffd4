// What a report of a long record takes: time, and the memory that it needs at most.

#include <cmath>
#include <cstdint>
#include <cstdio>
#include <fstream>
#include <memory>
#include <stdexcept>
#include <string>
#include <vector>

#include <fcntl.h>
#include <fmt/format.h>
#include <spawn.h>
#include <sys/resource.h>
#include <sys/wait.h>
#include <unistd.h>

#include "Clocks.h"
#include "Measurements.h"
#include "Program.h"
#include "Row.h"
#include "support/TemporaryFolder.h"

namespace {

constexpr std::uint64_t second = 1000000000;
constexpr std::uint64_t start = 1795000000 * second;
constexpr int pairsPerSecond = 8;
constexpr int daysInFile = 3;

/// Numbers that look random, the same ones each time.
class Noise {
public:
    /// From -1 to 1.
    double next() {
        state_ = state_ * 6364136223846793005U + 1442695040888963407U;
        return static_cast<double>(static_cast<std::int64_t>(state_)) * 0x1p-63;
    }

private:
    std::uint64_t state_ = 1;
};

std::string head(double t, const char* event, const std::string& members) {
    const auto time = start + static_cast<std::uint64_t>(t * 1e9);
    return fmt::format("{{\"event\":\"{}\",\"t\":{:.6f},\"time\":{}{}}}\n", event, t, time,
                       members);
}

/// The pair number i: some hundred nanoseconds from the reference, found up to 125 ms later.
std::string pairLine(std::uint64_t i, Noise& noise) {
    const auto jitter = static_cast<std::int64_t>(noise.next() * 20000);
    const auto local =
        start + second * (i + 8) / pairsPerSecond + static_cast<std::uint64_t>(jitter);
    const auto offset = static_cast<std::int64_t>(300 * noise.next() +
                                                  200 * std::sin(static_cast<double>(i) * 1e-5));
    const auto time = local + static_cast<std::uint64_t>((noise.next() + 1) * 62e6);
    return fmt::format(
        "{{\"event\":\"pair\",\"t\":{:.6f},\"time\":{},\"reference\":{},\"local\":{},"
        "\"offset\":{}}}\n",
        static_cast<double>(time - start) * 1e-9, time, local - static_cast<std::uint64_t>(offset),
        local, offset);
}

/// A record in files as a service leaves them behind, oldest first.
/// @return the folder's files
std::vector<std::string> writeRecord(const TemporaryFolder& folder, int days) {
    constexpr std::uint64_t perDay = std::uint64_t{86400} * pairsPerSecond;
    Noise noise;
    std::vector<std::string> paths;
    std::ofstream file;
    const auto pairs = perDay * static_cast<std::uint64_t>(days);
    for (std::uint64_t i = 0; i < pairs; ++i) {
        if (i % (perDay * daysInFile) == 0) {
            file.close();
            paths.push_back(folder.path(fmt::format("{:03}.jsonl", paths.size())));
            file.open(paths.back());
        }
        if (i == 0) {
            file << head(0.001, "loaded", R"(,"name":"bench","library":"bench.so")")
                 << head(
                        0.5, "quality",
                        R"(,"quality":"usable","reason":"PTP role has changed.","values":[0,0,0])");
        }
        file << pairLine(i, noise);
    }
    file.flush();
    if (!file) {
        throw std::runtime_error("the record cannot be written");
    }
    return paths;
}

struct Cost {
    double seconds;
    double mebibytes;
};

Cost costOfReport(const std::string& folder) {
    std::vector<std::string> words{VANTEL_HOST, "report", folder, "-o", "/dev/null"};
    std::vector<char*> arguments;
    for (auto& word : words) {
        arguments.push_back(word.data());
    }
    arguments.push_back(nullptr);
    const double before = secondsOf(CLOCK_MONOTONIC);
    pid_t pid = -1;
    int status = -1;
    rusage usage{};
    if (::posix_spawn(&pid, arguments[0], nullptr, nullptr, arguments.data(), environ) != 0 ||
        ::wait4(pid, &status, 0, &usage) != pid || status != 0) {
        throw std::runtime_error("the report failed");
    }
    return {secondsOf(CLOCK_MONOTONIC) - before, static_cast<double>(usage.ru_maxrss) / 1024};
}

void measureReport(int days) {
    const TemporaryFolder folder;
    writeRecord(folder, days);
    const auto [seconds, mebibytes] = costOfReport(folder.path(""));
    const auto figure = [&](const char* what) {
        return fmt::format("report of {} days, 8 pairs/s: {}", days, what);
    };
    print({figure("time"), "", seconds, "s", std::nullopt, 60});
    print({figure("memory at most"), "", mebibytes, "MiB", std::nullopt, 300});
}

} // namespace

void addReportCost(Program& program) {
    const auto days = std::make_shared<int>(30);
    Options options = program.add("report_cost", "Prints what a report of a long record takes.",
                                  [days] { measureReport(*days); });
    options.add("--days", *days, "length of the record");
}
