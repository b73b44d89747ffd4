#include "Journal.h"

#include <array>

#include <fcntl.h>
#include <gmock/gmock.h>
#include <gtest/gtest.h>
#include <unistd.h>

#include "Tool.h"

using namespace vantelhost;

namespace {

class JournalTest : public testing::Test {
protected:
    ~JournalTest() override { ::close(file); }

    std::vector<Json> events() const { return Result{0, contentOf(path), {}}.events(); }

    Folder folder;
    std::string path = folder.path("out");
    int file = ::open(path.c_str(), O_WRONLY | O_CREAT | O_CLOEXEC, 0600);
    int lost = 0;
    Journal journal{EventPrinter(file, Format::jsonLines), [this] { ++lost; }};
};

} // namespace

TEST_F(JournalTest, TheOffsetIsTheModuloDifferenceWithItsSign) {
    journal.pair(1000, 990);
    journal.pair(0xFFFFFFFFFFFFFFFF, 1);
    journal.pair(1, 0xFFFFFFFFFFFFFFFF);
    journal.pair(0, 0x8000000000000000);
    const auto shown = events();
    ASSERT_EQ(shown.size(), 4U);
    EXPECT_EQ(shown[0]["offset"], -10);
    EXPECT_EQ(shown[1]["offset"], 2);
    EXPECT_EQ(shown[1]["reference"], 0xFFFFFFFFFFFFFFFF);
    EXPECT_EQ(shown[2]["offset"], -2);
    EXPECT_EQ(shown[3]["offset"], std::numeric_limits<std::int64_t>::min());
    EXPECT_EQ(journal.tally().offsets.count, 4U);
}

TEST_F(JournalTest, ARepeatedQualityIsShownButIsNoChange) {
    constexpr std::array usable{2.5e-08, 1e-06, -1.0};
    journal.quality(usable.data(), "a");
    journal.quality(usable.data(), "a");
    journal.quality(usable.data(), "b");
    EXPECT_EQ(events().size(), 3U);
    EXPECT_EQ(journal.tally().qualityChanges, 2U);
}

TEST_F(JournalTest, MetadataMustBeAJsonObject) {
    journal.metadata(R"({"a":1})");
    EXPECT_TRUE(journal.isClean());
    for (const char* text : {"", "[]", "{\"a\":}", "{} x"}) {
        journal.metadata(text);
    }
    EXPECT_FALSE(journal.isClean());
    const auto shown = events();
    ASSERT_EQ(shown.size(), 5U);
    EXPECT_EQ(shown[0]["metadata"].dump(), R"({"a":1})");
    EXPECT_EQ(shown[0]["valid"], true);
    EXPECT_EQ(shown[3]["valid"], false);
    EXPECT_EQ(shown[3]["text"], "{\"a\":}");
    EXPECT_EQ(journal.tally().metadataUpdates, 1U);
    EXPECT_EQ(journal.tally().errors, 4U);
}

TEST_F(JournalTest, RefusalsAndNotesLeaveTheRunClean) {
    journal.note(startedEvent());
    journal.refusal();
    journal.timeRequest();
    EXPECT_TRUE(journal.isClean());
    journal.error(failureEvent("x", "y"));
    EXPECT_FALSE(journal.isClean());
    journal.summary();
    const auto summary = events().back();
    EXPECT_EQ(summary["errors"], 1);
    EXPECT_EQ(summary["refused"], 1);
    EXPECT_EQ(summary["timeRequests"], 1);
}

TEST_F(JournalTest, LostOutputIsToldOnceAndIsNotClean) {
    const int full = ::open("/dev/full", O_WRONLY | O_CLOEXEC);
    Journal lossy(EventPrinter(full, Format::readable), [this] { ++lost; });
    lossy.note(startedEvent());
    lossy.note(stoppedEvent());
    EXPECT_EQ(lost, 1);
    EXPECT_FALSE(lossy.isClean());
    ::close(full);
}
