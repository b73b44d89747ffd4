#include "Report/TimeLine.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

using namespace vantelhost;
using testing::ElementsAre;

namespace vantelhost {

static bool operator==(const Span& a, const Span& b) {
    return a.row == b.row && a.begin == b.begin && a.end == b.end && a.label == b.label;
}

} // namespace vantelhost

TEST(TimeLine, QualityLastsUntilTheNextOrTheEnd) {
    Recording recording;
    recording.duration = 10;
    recording.qualities.add({1, "unusable", "a"});
    recording.qualities.add({3, "usable", "b"});
    recording.qualities.add({4, "unusable", "a"});
    const auto timeLine = qualityTimeLine(recording);
    EXPECT_THAT(timeLine.rows, ElementsAre("unusable", "usable"));
    EXPECT_THAT(timeLine.spans,
                ElementsAre(Span{0, 1, 3, "unusable: a"}, Span{1, 3, 4, "usable: b"},
                            Span{0, 4, 10, "unusable: a"}));
    EXPECT_THAT(labelsOf(timeLine), ElementsAre("unusable: a", "usable: b"));
    EXPECT_EQ(timeIn(timeLine, "unusable"), 8);
    EXPECT_EQ(timeIn(timeLine, "other"), 0);
}

TEST(TimeLine, EveryPortHasARowWithAGapWhileItIsNotReported) {
    Recording recording;
    recording.duration = 10;
    recording.portChanges.add({1, "p1", "A"});
    recording.portChanges.add({1, "p2", "A"});
    recording.portChanges.add({2, "p1", "B"});
    recording.portChanges.add({5, "p1", ""});
    recording.portChanges.add({7, "p1", "A"});
    const auto timeLine = portTimeLine(recording);
    EXPECT_THAT(timeLine.rows, ElementsAre("p1", "p2"));
    EXPECT_THAT(timeLine.spans, ElementsAre(Span{0, 1, 2, "A"}, Span{0, 2, 5, "B"},
                                            Span{0, 7, 10, "A"}, Span{1, 1, 10, "A"}));
}

TEST(TimeLine, EndsWhereChangesWereOnlyCounted) {
    Recording recording;
    recording.duration = 9000;
    for (int i = 0; i <= 5000; ++i) {
        recording.qualities.add({static_cast<double>(i), "usable", std::to_string(i)});
    }
    EXPECT_EQ(qualityTimeLine(recording).spans.back().end, 5000);
}

TEST(TimeLine, NeighboursThatAreNotUsableAreOneOutage) {
    Recording recording;
    recording.duration = 10;
    recording.qualities.add({1, "unusable", "a"});
    recording.qualities.add({2, "other", "b"});
    recording.qualities.add({4, "usable", "c"});
    recording.qualities.add({7, "unusable", "a"});
    EXPECT_THAT(outages(recording), ElementsAre(Span{0, 1, 4, ""}, Span{0, 7, 10, ""}));
}

TEST(TimeLine, NoStateIsKnownBetweenRuns) {
    Recording recording;
    recording.duration = 10;
    recording.qualities.add({1, "unusable", "a"});
    recording.qualities.keep({3, "", ""});
    recording.qualities.add({6, "unusable", "a"});
    EXPECT_THAT(qualityTimeLine(recording).spans,
                ElementsAre(Span{0, 1, 3, "unusable: a"}, Span{0, 6, 10, "unusable: a"}));
    EXPECT_THAT(outages(recording), ElementsAre(Span{0, 1, 3, ""}, Span{0, 6, 10, ""}));
    EXPECT_EQ(recording.qualities.count(), 2U);
}

TEST(TimeLine, HealthHasARowForEachState) {
    Recording recording;
    recording.duration = 10;
    recording.healths.add({1, "starting", ""});
    recording.healths.add({3, "locked", "pairs arrive"});
    const auto timeLine = healthTimeLine(recording);
    EXPECT_THAT(timeLine.rows, ElementsAre("starting", "locked"));
    EXPECT_THAT(timeLine.spans, ElementsAre(Span{0, 1, 3, "starting"}, Span{1, 3, 10, "locked"}));
}

TEST(TimeLine, OfNothingIsEmpty) {
    EXPECT_TRUE(qualityTimeLine({}).spans.empty());
    EXPECT_TRUE(outages({}).empty());
    EXPECT_TRUE(portTimeLine({}).rows.empty());
}
