#include "Clock/LocalTime.h"

#include <cerrno>

#include "Moment.h"
#include "Tool.h"
#include "UsageError.h"
#include "support/PtpDevice.h"

using namespace vantelhost;
using testing::HasSubstr;

namespace {

constexpr std::int64_t ahead = 37000000000;

/// An interface's clock has the number that its name ends in; "none" has none.
TimeStamping byLastDigit(const std::string& interface) {
    TimeStamping result;
    result.clock = interface == "none" ? -1 : interface.back() - '0';
    return result;
}

TimeStamping unsupported(const std::string&) {
    TimeStamping result;
    result.error = EOPNOTSUPP;
    result.clock = 0;
    return result;
}

Json settingsWith(const std::vector<std::string>& interfaces) {
    return {{"interface", interfaces}};
}

class LocalTimeTest : public testing::Test {
protected:
    LocalTimeTest() { writePtpDevice(device, {ahead, PtpDevice::Best::precise, 0}); }

    LocalTime make(const std::string& option, bool always = true) {
        return {option, always, [this](const Event& event) { errors.push_back(event.text); },
                clocks};
    }

    Folder folder;
    const std::string device = folder.path("ptp3");
    PtpClocks clocks{folder.path("."), byLastDigit};
    std::vector<std::string> errors;
};

bool isAhead(std::uint64_t time) {
    const auto difference = static_cast<std::int64_t>(time - realtimeNanoseconds());
    return difference > ahead - 20000000000 && difference <= ahead;
}

} // namespace

TEST_F(LocalTimeTest, AutoIsTheClockOfTheFirstInterfaceAndTold) {
    LocalTime time = make("auto");
    const auto event = time.choose(settingsWith({"eth3", "eth4"}));
    ASSERT_TRUE(event);
    EXPECT_EQ(event->name, "clock");
    EXPECT_THAT(event->members["clock"].get<std::string>(), testing::EndsWith("/ptp3"));
    EXPECT_EQ(event->members["problem"], "");
    EXPECT_TRUE(isAhead(time.now()));
    const auto local = time.now();
    const auto carried = time.carry(local).time;
    ASSERT_TRUE(carried);
    EXPECT_EQ(carried->realtime, local - ahead);
    EXPECT_TRUE(carried->isOfOtherClock);
}

TEST_F(LocalTimeTest, AutoWithoutAClockIsRealtimeWhichGoesWithoutSaying) {
    for (const auto& interfaces :
         {std::vector<std::string>{"none", "eth3"}, std::vector<std::string>()}) {
        LocalTime time = make("auto");
        EXPECT_FALSE(time.choose(settingsWith(interfaces)));
        EXPECT_FALSE(isAhead(time.now()));
        const auto local = time.now();
        EXPECT_EQ(time.carry(local).time->realtime, local);
        EXPECT_FALSE(time.carry(local).time->isOfOtherClock);
    }
    clocks.timeStamping = unsupported;
    EXPECT_FALSE(make("auto").choose(settingsWith({"eth0"})));
    EXPECT_FALSE(make("auto").choose(Json::object()));
}

TEST_F(LocalTimeTest, AutoWithoutAClockCarriesNothingThatNobodyTakes) {
    LocalTime time = make("auto", false);
    time.choose(settingsWith({"none"}));
    const auto result = time.carry(990);
    EXPECT_FALSE(result.time);
    EXPECT_FALSE(result.news);
    time.choose(settingsWith({"eth3"}));
    EXPECT_TRUE(time.carry(990).news);
}

TEST_F(LocalTimeTest, AnInterfacesClockThatCannotBeOpenedIsToldAndRealtimeIsUsed) {
    LocalTime time = make("auto");
    const auto event = time.choose(settingsWith({"eth5"}));
    ASSERT_TRUE(event);
    EXPECT_EQ(event->members["clock"], "CLOCK_REALTIME");
    EXPECT_THAT(event->members["problem"].get<std::string>(),
                HasSubstr("/ptp5: No such file or directory"));
    EXPECT_FALSE(isAhead(time.now()));
    EXPECT_TRUE(errors.empty());
}

TEST_F(LocalTimeTest, OnlyAnotherClockThanBeforeIsTold) {
    LocalTime time = make("auto");
    EXPECT_TRUE(time.choose(settingsWith({"eth3"})));
    EXPECT_FALSE(time.choose(settingsWith({"eth3", "none"})));
    const auto event = time.choose(settingsWith({"none"}));
    ASSERT_TRUE(event);
    EXPECT_EQ(event->members["clock"], "CLOCK_REALTIME");
    EXPECT_EQ(event->members["problem"], "");
}

TEST_F(LocalTimeTest, ANamedClockIsUsedWhateverTheInterfacesHave) {
    LocalTime named = make(device);
    EXPECT_EQ(named.choose(settingsWith({"none"}))->members["clock"], device);
    EXPECT_TRUE(isAhead(named.now()));
    LocalTime realtime = make("realtime", false);
    EXPECT_EQ(realtime.choose(settingsWith({"eth3"}))->members["clock"], "CLOCK_REALTIME");
    EXPECT_FALSE(isAhead(realtime.now()));
    EXPECT_TRUE(realtime.carry(990).news) << "named, so it is seen to";
}

TEST_F(LocalTimeTest, ANamedClockThatIsNoneIsRefused) {
    writeFile(folder.path("file"), "");
    for (const auto* const name : {"missing", "file"}) {
        try {
            make(folder.path(name));
            FAIL() << name;
        } catch (const UsageError& error) {
            EXPECT_THAT(error.what(), HasSubstr("the clock " + folder.path(name) + ": "));
        }
    }
}

TEST_F(LocalTimeTest, AClockThatHasGoneIsToldOnceInASessionAndRealtimeAnswers) {
    LocalTime time = make(device);
    time.choose(settingsWith({}));
    writeFile(device, "");
    EXPECT_FALSE(isAhead(time.now()));
    EXPECT_FALSE(isAhead(time.now()));
    EXPECT_THAT(errors, testing::ElementsAre("clock: " + device +
                                             " cannot be read: Invalid argument; the plug-in is "
                                             "told CLOCK_REALTIME"));
    const auto event = time.choose(settingsWith({}));
    ASSERT_TRUE(event);
    EXPECT_EQ(event->members["problem"], device + ": Invalid argument");
    writePtpDevice(device, {ahead, PtpDevice::Best::precise, 0});
    EXPECT_EQ(time.choose(settingsWith({}))->members["problem"], "");
    EXPECT_TRUE(isAhead(time.now()));
}

TEST_F(LocalTimeTest, APairOfAnotherClockIsRefusedWithTheNameOfThat) {
    LocalTime time = make(device);
    time.choose(settingsWith({}));
    const auto result = time.carry(realtimeNanoseconds());
    ASSERT_TRUE(result.news);
    EXPECT_EQ(result.news->text, "clock: the local time of this pair is that of CLOCK_REALTIME, "
                                 "not of " +
                                     device + ": --clock realtime?");
    EXPECT_EQ(time.state()->members["refused"], 1);
    EXPECT_TRUE(time.carry(time.now()).time);
    EXPECT_FALSE(time.state());
}

TEST_F(LocalTimeTest, EpochOffsetsAreTakenOffAndNamesAreLookedForWithoutThem) {
    LocalTime time = make(device);
    time.choose(settingsWith({}));
    time.take(epochOffsetEvent(-ahead));
    const auto local = time.now();
    EXPECT_EQ(time.carry(local - ahead).time->realtime, local - ahead);
    EXPECT_THAT(time.carry(realtimeNanoseconds() - 2 * ahead).news->text, HasSubstr("nor of any"));
    time.take(initialisedEvent(settingsWith({})));
    EXPECT_TRUE(time.carry(time.now() - 10000000).time);
    EXPECT_THAT(time.carry(time.now() - ahead).news->text, HasSubstr("that of CLOCK_REALTIME"));
}
