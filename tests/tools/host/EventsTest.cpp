#include "Events.h"

#include <array>
#include <cerrno>
#include <limits>
#include <map>

#include <fcntl.h>
#include <gmock/gmock.h>
#include <gtest/gtest.h>
#include <unistd.h>

#include "EventPrinter.h"
#include "Tool.h"

using namespace vantelhost;
using testing::HasSubstr;

namespace {

/// What the printer makes of one event.
std::string printed(const Event& event, Format format) {
    const Folder folder;
    const int file = ::open(folder.path("out").c_str(), O_WRONLY | O_CREAT | O_CLOEXEC, 0600);
    EXPECT_TRUE(EventPrinter(file, format)(event, {0.25, 1700000000123456789}));
    ::close(file);
    return contentOf(folder.path("out"));
}

} // namespace

TEST(Events, TheTwoQualitiesAreKnownByTheirValues) {
    constexpr std::array usable{2.5e-08, 1e-06, -1.0};
    constexpr std::array unusable{-2.0, -2.0, -1.0};
    constexpr std::array other{-2.0, -2.0, 1.0};
    EXPECT_EQ(qualityEvent(usable.data(), "r").text, "usable [2.5e-08, 1e-06, -1] r");
    EXPECT_EQ(qualityEvent(unusable.data(), "r").text, "unusable [-2, -2, -1] r");
    EXPECT_EQ(qualityEvent(other.data(), "r").text, "other [-2, -2, 1] r");
    EXPECT_EQ(qualityEvent(usable.data(), "r").members.dump(),
              R"({"quality":"usable","values":[2.5e-08,1e-06,-1.0],"reason":"r"})");
}

TEST(Events, AStatusShowsWhatItsTextTells) {
    const Event event =
        statusEvent("start", -52008,
                    R"({"error_constant":"zeoskerr_osFault","file":"f","line":12,)"
                    R"("component":"vantel_bc","additionalInfo":"Failed forking"})");
    EXPECT_EQ(event.name, "error");
    EXPECT_EQ(event.text, "start: code -52008, zeoskerr_osFault at f:12: Failed forking");
    EXPECT_EQ(event.members["code"], -52008);
    EXPECT_EQ(event.members["status"]["line"], 12);
}

TEST(Events, AStatusWithAStrangeTextIsStillShown) {
    EXPECT_EQ(statusEvent("start", -1, "").text, "start: code -1");
    EXPECT_EQ(statusEvent("start", -1, "oops").text, "start: code -1, oops");
    EXPECT_EQ(statusEvent("start", -1, "oops").members["status"], "oops");
    EXPECT_EQ(statusEvent("start", -1, "{}").text, "start: code -1, ? at ?:?");
}

TEST(Events, AStatusAboveZeroIsAWarning) {
    EXPECT_EQ(statusEvent("start", 5, "{}").name, "warning");
}

TEST(Events, MetadataIsSummedUp) {
    const Event event = metadataEvent(
        Json::parse(R"({"gmClockId":"00:01","gmClockClass":6,"gmClockAccuracy":"WITHIN_1US",)"
                    R"("Port1":{"portState":"PTP_SLAVE","interface":"eth0"},)"
                    R"("Port2":{"portState":"PTP_MASTER","interface":"eth1"}})"));
    EXPECT_EQ(event.text, "grandmaster 00:01 class 6 WITHIN_1US; Port1 PTP_SLAVE on eth0; "
                          "Port2 PTP_MASTER on eth1");
    EXPECT_EQ(event.members["metadata"]["gmClockClass"], 6);
}

TEST(Events, MetadataWithoutTheUsualMembersIsSummedUpToo) {
    EXPECT_EQ(metadataEvent(Json::object()).text, "grandmaster ? class ? ?; no ports");
}

TEST(Events, ChronydTakesThePairsOrNot) {
    EXPECT_EQ(chronyEvent({7, 2, 0}, "").text, "takes the pairs; 7 sent, 2 failed");
    EXPECT_EQ(chronyEvent({7, 2, 3}, "").text, "takes the pairs; 7 sent, 2 failed, 3 withheld");
    EXPECT_EQ(chronyEvent({7, 2, 3}, "").members.dump(),
              R"({"reachable":true,"sent":7,"failed":2,"withheld":3,"problem":""})");
    EXPECT_EQ(chronyEvent({0, 1, 0}, "gone").text,
              "does not take the pairs: gone; 0 sent, 1 failed");
    EXPECT_EQ(chronyEvent({0, 1, 0}, "gone").members["reachable"], false);
}

TEST(Events, APairThatIsLeftOutSaysWhy) {
    EXPECT_EQ(pairEvent(1, 4, 3).text, "reference 1 local 4 offset 3 ns");
    EXPECT_FALSE(pairEvent(1, 4, 3).members.contains("leftOut"));
    const std::map<PairKind, std::string> words{
        {PairKind::of1970, "1970"},   {PairKind::falseOffset, "no-delay"},
        {PairKind::repeated, "same"}, {PairKind::afterReturn, "return"},
        {PairKind::jump, "jump"},     {PairKind::unhealthy, "health"}};
    for (const auto& [kind, word] : words) {
        const Event event = pairEvent(1, 4, 3, kind);
        EXPECT_EQ(event.text, "reference 1 local 4 offset 3 ns, left out (" + word + ")");
        EXPECT_EQ(event.members["leftOut"], word);
        EXPECT_EQ(kindOfWord(word), kind);
    }
    EXPECT_FALSE(kindOfWord(""));
    EXPECT_FALSE(kindOfWord("new"));
}

TEST(Events, TheSummaryHasOffsetsOnlyIfThereWereSome) {
    Tally tally;
    EXPECT_THAT(summaryEvent(1, tally).text, HasSubstr("no offsets"));
    EXPECT_TRUE(summaryEvent(1, tally).members["offset"].is_null());
    tally.offsets.add(-3);
    tally.offsets.add(4);
    EXPECT_THAT(summaryEvent(1, tally).text,
                HasSubstr("2 pairs, 0 quality changes, 0 metadata updates, 0 errors, "
                          "offset min -3 mean 0.5 max 4 rms 3.5 ns"));
    EXPECT_EQ(summaryEvent(1, tally).members["leftOut"], Json::object());
    tally.leftOut = {{"jump", 1}, {"return", 2}};
    EXPECT_THAT(summaryEvent(1, tally).text, HasSubstr("2 pairs, 3 left out, 0 quality changes"));
    EXPECT_EQ(summaryEvent(1, tally).members["leftOut"], Json({{"jump", 1}, {"return", 2}}));
}

TEST(Events, ReadableEventsAreOneLineWhateverTheyHold) {
    EXPECT_EQ(printed({"name", "a\nb", Json::object()}, Format::readable),
              "     0.250 name         a\\x0Ab\n");
    EXPECT_EQ(printed({"started", "", Json::object()}, Format::readable), "     0.250 started\n");
}

TEST(Events, JsonEventsAreOneLineWhateverTheyHold) {
    const auto line = printed({"name", "unused", Json{{"reason", "a\nb\xFF"}}}, Format::jsonLines);
    EXPECT_EQ(line.find('\n'), line.size() - 1);
    const Json event = Json::parse(line);
    EXPECT_EQ(event["event"], "name");
    EXPECT_EQ(event["t"], 0.25);
    EXPECT_EQ(event["time"], 1700000000123456789);
    EXPECT_EQ(event["reason"], "a\nb\xEF\xBF\xBD");
}

TEST(Events, ALostLineIsReported) {
    const int full = ::open("/dev/full", O_WRONLY | O_CLOEXEC);
    EXPECT_FALSE(EventPrinter(full, Format::readable)(startedEvent(), {0, 0}));
    EXPECT_EQ(errno, ENOSPC);
    ::close(full);
}

TEST(Tally, OffsetsHaveMinMeanMaxAndRms) {
    OffsetStatistics offsets;
    EXPECT_EQ(offsets.mean(), 0);
    EXPECT_EQ(offsets.rms(), 0);
    for (const std::int64_t offset : {10, -30, 50}) {
        offsets.add(offset);
    }
    EXPECT_EQ(offsets.count, 3U);
    EXPECT_EQ(offsets.smallest, -30);
    EXPECT_EQ(offsets.largest, 50);
    EXPECT_DOUBLE_EQ(offsets.mean(), 10.0);
    EXPECT_NEAR(offsets.rms(), 34.1565, 1e-4);
}

TEST(Tally, ExtremeOffsetsDoNotOverflow) {
    OffsetStatistics offsets;
    offsets.add(std::numeric_limits<std::int64_t>::max());
    offsets.add(std::numeric_limits<std::int64_t>::max());
    EXPECT_DOUBLE_EQ(offsets.mean(), 9223372036854775807.0);
    EXPECT_DOUBLE_EQ(offsets.rms(), 9223372036854775807.0);
}
