#include "CommandLine.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

using namespace vantelhost;
using testing::ElementsAre;

namespace {

std::variant<int, RunOptions, SchemaOptions> read(const std::vector<const char*>& words) {
    std::vector<const char*> argv{"vantel-host"};
    argv.insert(argv.end(), words.begin(), words.end());
    testing::internal::CaptureStdout();
    testing::internal::CaptureStderr();
    auto result = readCommandLine(static_cast<int>(argv.size()), argv.data());
    testing::internal::GetCapturedStdout();
    testing::internal::GetCapturedStderr();
    return result;
}

RunOptions run(std::vector<const char*> words) {
    words.insert(words.begin(), "run");
    return std::get<RunOptions>(read(words));
}

} // namespace

TEST(CommandLine, DefaultsOfRun) {
    const auto options = run({});
    EXPECT_EQ(options.pluginPath, "libvantel_bc.so.19");
    EXPECT_EQ(options.configFile, "");
    EXPECT_EQ(options.seconds, std::nullopt);
    EXPECT_EQ(options.fifo, "/tmp/quillEpochOffset");
    EXPECT_FALSE(options.useFifo || options.createFifo || options.jsonLines ||
                 options.noInterfaces || options.refuseWhileStopping);
}

TEST(CommandLine, AllOptionsOfRun) {
    const auto options =
        run({"--library", "l.so", "--config", "-", "--set", "a=1", "--set", "b=x,y", "--interface",
             "eth0", "--interface", "eth1", "--seconds", "2.5", "--json", "--create-fifo", "--fifo",
             "f", "--refuse-while-stopping"});
    EXPECT_EQ(options.pluginPath, "l.so");
    EXPECT_EQ(options.configFile, "-");
    EXPECT_THAT(options.assignments, ElementsAre("a=1", "b=x,y"));
    EXPECT_THAT(options.interfaces, ElementsAre("eth0", "eth1"));
    EXPECT_EQ(options.seconds, 2.5);
    EXPECT_EQ(options.fifo, "f");
    EXPECT_TRUE(options.useFifo && options.createFifo && options.jsonLines &&
                options.refuseWhileStopping);
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

TEST(CommandLine, OptionsOfSchema) {
    const auto options = std::get<SchemaOptions>(read({"schema", "--library", "l", "--json"}));
    EXPECT_EQ(options.pluginPath, "l");
    EXPECT_TRUE(options.raw);
}

TEST(CommandLine, HelpIsNoMistake) {
    for (const auto& words : std::vector<std::vector<const char*>>{
             {"--help"}, {"run", "--help"}, {"schema", "--help"}}) {
        EXPECT_EQ(std::get<int>(read(words)), 0);
    }
}

TEST(CommandLine, MistakesGiveTheStatusOfUsageErrors) {
    for (const auto& words : std::vector<std::vector<const char*>>{
             {},
             {"walk"},
             {"run", "--nonsense"},
             {"run", "extra"},
             {"run", "schema"},
             {"run", "--seconds", "-1"},
             {"run", "--seconds", "soon"},
             {"run", "--seconds"},
             {"run", "--epoch-offset", "1.5"},
             {"run", "--epoch-offset-at", "5"},
             {"run", "--epoch-offset-at", "x:5"},
             {"run", "--epoch-offset-at", "-1:5"},
             {"run", "--epoch-offset-at", "1:"},
             {"run", "--no-interfaces", "--interface", "eth0"},
         }) {
        const auto result = read(words);
        ASSERT_TRUE(std::holds_alternative<int>(result)) << testing::PrintToString(words);
        EXPECT_EQ(std::get<int>(result), 2) << testing::PrintToString(words);
    }
}
