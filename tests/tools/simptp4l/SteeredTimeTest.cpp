#include "Clock.h"

#include <cstdint>
#include <system_error>

#include <fcntl.h>
#include <gtest/gtest.h>
#include <unistd.h>

#include "support/TemporaryFolder.h"

namespace simptp4l {
namespace {

constexpr std::int64_t second = 1000000000;
constexpr std::int64_t begin = 1700000000 * second;

/// A clock whose Syncs come each second, in a time that the test writes into the file.
class SteeredTimeTest : public testing::Test {
protected:
    SteeredTimeTest() {
        script.clock = ClockSource::steered;
        script.steeredFile = folder.path("time");
        script.syncsBeforeDelay = 0;
    }

    /// In place, since the file is mapped.
    void write(const SteeredTime& time) const {
        const int descriptor = open(script.steeredFile.c_str(), O_WRONLY | O_CREAT, 0600);
        EXPECT_EQ(::write(descriptor, &time, sizeof(time)), static_cast<ssize_t>(sizeof(time)));
        close(descriptor);
    }

    static void expect(const ClockReading& reading, std::int64_t ingressTime,
                       std::int64_t masterOffset) {
        EXPECT_EQ(reading.ingressTime, ingressTime);
        EXPECT_EQ(reading.masterOffset, masterOffset);
    }

    const TemporaryFolder folder;
    Script script;
};

TEST_F(SteeredTimeTest, FrequencyMovesTheLocalClockFromWhereItWasSteered) {
    // 40 ppm are 40 us a second.
    write({begin, 0, begin - second, begin + 7, 40000});
    Clock clock(script, 0, 0);
    expect(clock.read(0), begin + second + 40007, second + 40007);
    write({begin + second, 0, begin - second, begin + 7, 40000});
    expect(clock.read(0), begin + 2 * second + 80007, second + 80007);
}

TEST_F(SteeredTimeTest, GrandmastersTimeMovesTheOffsetAlone) {
    write({begin, 250, begin, begin, 0});
    Clock clock(script, 0, 0);
    expect(clock.read(0), begin, -250);
}

TEST_F(SteeredTimeTest, SyncsArriveAsItGoesOnAndNotAsTheProcessDoes) {
    write({begin, 0, begin, begin, 0});
    Clock clock(script, 0, 0);
    expect(clock.read(0), begin, 0);
    expect(clock.read(5 * second), begin, 0);
    write({begin + 3 * second + 1, 0, begin, begin + 9, 0});
    expect(clock.read(5 * second), begin + 3 * second + 9, 9);
}

TEST_F(SteeredTimeTest, AGrandmastersSyncsBeginWhenItComes) {
    write({begin, 0, begin, begin, 0});
    Clock clock(script, 0, 0);
    clock.setGrandmaster(false, 0);
    expect(clock.read(0), 0, 0);
    write({begin + second / 2, 0, begin, begin, 0});
    clock.setGrandmaster(true, 0);
    write({begin + second, 0, begin, begin, 0});
    expect(clock.read(0), begin + second / 2, 0);
}

TEST_F(SteeredTimeTest, AMissingFileIsAnError) {
    EXPECT_THROW(Clock(script, 0, 0), std::system_error);
}

TEST_F(SteeredTimeTest, AFileThatIsTooShortIsAnError) {
    writeFile(script.steeredFile, std::string(39, '\0'));
    EXPECT_THROW(Clock(script, 0, 0), std::system_error);
}

} // namespace
} // namespace simptp4l
