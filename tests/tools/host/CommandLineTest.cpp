#include "CommandLine.h"

#include <memory>
#include <optional>

#include <CLI/CLI.hpp>
#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include "RunOptions.h"

using namespace vantelhost;
using testing::ElementsAre;

namespace {

using Arguments = std::vector<const char*>;

/// The options of the last "run" that was accepted.
std::optional<RunOptions> accepted;

/// What the last reading wrote.
std::string output;
std::string errors;

std::function<int()> prepareRun(CLI::App& command) {
    const auto options = std::make_shared<RunOptions>();
    addRunOptions(command, *options);
    return [options] {
        accepted = *options;
        return 42;
    };
}

std::function<int()> prepareOther(CLI::App&) {
    return [] { return 43; };
}

/// The exit status.
int read(const Arguments& words) {
    accepted.reset();
    Arguments argv{"vantel-host"};
    argv.insert(argv.end(), words.begin(), words.end());
    testing::internal::CaptureStdout();
    testing::internal::CaptureStderr();
    const int status = execute({{"run", "", prepareRun}, {"other", "", prepareOther}},
                               static_cast<int>(argv.size()), argv.data());
    output = testing::internal::GetCapturedStdout();
    errors = testing::internal::GetCapturedStderr();
    return status;
}

RunOptions run(Arguments words) {
    words.insert(words.begin(), "run");
    EXPECT_EQ(read(words), 42);
    return accepted.value();
}

} // namespace

TEST(CommandLine, DefaultsOfRun) {
    const auto options = run({});
    EXPECT_EQ(options.pluginPath, "libvantel_bc.so.19");
    EXPECT_EQ(options.configFile, "");
    EXPECT_EQ(options.seconds, std::nullopt);
    EXPECT_EQ(options.fifo, VANTEL_EPOCH_FIFO_PATH);
    EXPECT_FALSE(options.useFifo || options.createFifo || options.jsonLines || options.plain ||
                 options.noInterfaces || options.refuseWhileStopping || options.force);
}

TEST(CommandLine, AllOptionsOfRun) {
    const auto options = run({"--library",
                              "l.so",
                              "--config",
                              "-",
                              "--set",
                              "a=1",
                              "--set",
                              "b=x,y",
                              "--interface",
                              "eth0",
                              "--interface",
                              "eth1",
                              "--seconds",
                              "2.5",
                              "--json",
                              "--create-fifo",
                              "--fifo",
                              "f",
                              "--refuse-while-stopping",
                              "--force",
                              "--record",
                              "r.jsonl",
                              "--chrony",
                              "c.sock"});
    EXPECT_EQ(options.pluginPath, "l.so");
    EXPECT_EQ(options.configFile, "-");
    EXPECT_THAT(options.assignments, ElementsAre("a=1", "b=x,y"));
    EXPECT_THAT(options.interfaces, ElementsAre("eth0", "eth1"));
    EXPECT_EQ(options.seconds, 2.5);
    EXPECT_EQ(options.fifo, "f");
    EXPECT_EQ(options.recordFile, "r.jsonl");
    EXPECT_EQ(options.chronySocket, "c.sock");
    EXPECT_TRUE(options.useFifo && options.createFifo && options.jsonLines &&
                options.refuseWhileStopping && options.force);
}

TEST(CommandLine, TheClockIsAutoRealtimeOrADevice) {
    EXPECT_EQ(run({}).clock, "auto");
    for (const char* clock : {"auto", "realtime", "/dev/ptp1"}) {
        EXPECT_EQ(run({"--clock", clock}).clock, clock);
    }
}

TEST(CommandLine, TheTaiOffsetIsTheKernelsOrSeconds) {
    EXPECT_EQ(run({}).taiOffset, std::nullopt);
    EXPECT_EQ(run({"--tai-offset", "kernel"}).taiOffset, std::nullopt);
    EXPECT_EQ(run({"--tai-offset", "37"}).taiOffset, 37);
    EXPECT_EQ(run({"--tai-offset", "0"}).taiOffset, 0);
    EXPECT_EQ(run({"--tai-offset", "1000"}).taiOffset, 1000);
    for (const char* const wrong : {"-1", "1001", "37.5", "37s", "Kernel", ""}) {
        EXPECT_EQ(read({"run", "--tai-offset", wrong}), 2) << wrong;
    }
    EXPECT_NE(errors.find("must be kernel, or an integer of seconds from 0 to 1000"),
              std::string::npos);
}

TEST(CommandLine, OffsetsMayBeNegativeAndUseTheFifo) {
    EXPECT_EQ(run({"--epoch-offset", "-5"}).epochOffset, -5);
    EXPECT_EQ(run({"--epoch-offset=-6"}).epochOffset, -6);
    EXPECT_TRUE(run({"--epoch-offset", "0"}).useFifo);
    EXPECT_FALSE(run({"--epoch-offset", "0"}).createFifo);
    EXPECT_TRUE(run({"--fifo", "f"}).useFifo);
}

TEST(CommandLine, TimedOffsetsComeInTheOrderOfTheirTimes) {
    const auto options = run(
        {"--epoch-offset-at", "2:20", "--epoch-offset-at", "0.5:-5", "--epoch-offset-at", "2:21"});
    ASSERT_EQ(options.timedOffsets.size(), 3U);
    EXPECT_EQ(options.timedOffsets[0].seconds, 0.5);
    EXPECT_EQ(options.timedOffsets[0].nanoseconds, -5);
    EXPECT_EQ(options.timedOffsets[1].nanoseconds, 20);
    EXPECT_EQ(options.timedOffsets[2].nanoseconds, 21);
    EXPECT_TRUE(options.useFifo);
}

TEST(CommandLine, TheNamedSubcommandGivesTheStatus) {
    EXPECT_EQ(read({"run"}), 42);
    EXPECT_EQ(read({"other"}), 43);
}

TEST(CommandLine, TheVersionIsNoMistake) {
    EXPECT_EQ(read({"--version"}), 0);
    EXPECT_EQ(output, "vantel-host " VANTEL_VERSION "\n");
}

TEST(CommandLine, AMistakeIsToldWithWhatThereIs) {
    EXPECT_EQ(read({"frobnicate"}), 2);
    EXPECT_EQ(errors,
              "vantel-host: there is no command \"frobnicate\"; the commands are: run, other\n");
    EXPECT_EQ(read({}), 2);
    EXPECT_EQ(errors, "vantel-host: a command is missing; the commands are: run, other\n");
    EXPECT_EQ(read({"run", "extra", "more"}), 2);
    EXPECT_EQ(errors, "vantel-host: an argument too many: \"extra\", \"more\"\n");
    EXPECT_EQ(read({"run", "--nonsense"}), 2);
    EXPECT_EQ(errors,
              "vantel-host: there is no option \"--nonsense\"; --help behind a command lists "
              "them\n");
}

TEST(CommandLine, AMistakeInFrontOfTheCommandIsToldAlike) {
    for (const auto& words : std::vector<Arguments>{{"--frob"}, {"--frob", "run"}}) {
        EXPECT_EQ(read(words), 2);
        EXPECT_EQ(errors, "vantel-host: there is no option \"--frob\"; --help behind a command "
                          "lists them\n");
    }
    EXPECT_EQ(read({"--"}), 2);
    EXPECT_EQ(errors, "vantel-host: a command is missing; the commands are: run, other\n");
}

TEST(CommandLine, HelpIsNoMistake) {
    for (const auto& words :
         std::vector<Arguments>{{"--help"}, {"run", "--help"}, {"other", "--help"}}) {
        EXPECT_EQ(read(words), 0);
    }
}

TEST(CommandLine, MistakesGiveTheStatusOfUsageErrors) {
    for (const auto& words : std::vector<Arguments>{
             {},
             {"walk"},
             {"run", "--nonsense"},
             {"run", "extra"},
             {"run", "other"},
             {"run", "--seconds", "-1"},
             {"run", "--seconds", "soon"},
             {"run", "--seconds"},
             {"run", "--epoch-offset", "1.5"},
             {"run", "--epoch-offset-at", "5"},
             {"run", "--epoch-offset-at", "x:5"},
             {"run", "--epoch-offset-at", "-1:5"},
             {"run", "--epoch-offset-at", "1:"},
             {"run", "--no-interfaces", "--interface", "eth0"},
             {"run", "--json", "--plain"},
             {"run", "--json", "--quiet"},
             {"run", "--record"},
             {"run", "--chrony"},
             {"run", "--clock"},
             {"run", "--clock", ""},
             {"run", "--clock", "monotonic"},
             {"run", "--clock", "ptp0"},
         }) {
        EXPECT_EQ(read(words), 2) << testing::PrintToString(words);
        EXPECT_FALSE(accepted.has_value());
    }
}
