#include "Record.h"

#include <algorithm>
#include <array>
#include <csignal>
#include <filesystem>
#include <fstream>
#include <thread>

#include <gmock/gmock.h>
#include <gtest/gtest.h>
#include <sys/resource.h>
#include <sys/stat.h>

#include "EventPrinter.h"
#include "RotatedName.h"
#include "Tool.h"
#include "UsageError.h"

using namespace vantelhost;
using testing::ElementsAre;
using testing::HasSubstr;
using testing::IsEmpty;
using testing::Not;

namespace fs = std::filesystem;

namespace {

Moment at(double seconds) {
    return {seconds, static_cast<std::uint64_t>((1000 + seconds) * 1e9)};
}

class RecordTest : public testing::Test {
protected:
    void SetUp() override { begin({}); }

    void begin(const RecordRules& rules) {
        record.reset(); // nobody else writes it
        record.emplace(file, rules);
        record->begin();
    }

    /// Takes a pair, and keeps what there is to tell.
    void takePair(int number) { take(pairEvent(5, 6, number), number); }

    void take(const Event& event, double seconds) {
        if (const auto told = record->take(event, at(seconds))) {
            news.push_back(told->name + ": " + told->text);
        }
    }

    std::vector<Json> linesOf(unsigned number) const {
        return Result{0, contentOf(rotatedName(file, number)), ""}.events();
    }

    /// The numbers of the pairs in a file.
    std::vector<int> pairsIn(unsigned number) const {
        std::vector<int> pairs;
        for (const auto& line : linesOf(number)) {
            if (line["event"] == "pair") {
                pairs.push_back(line["offset"]);
            }
        }
        return pairs;
    }

    /// Names in the folder, but for the file's own.
    std::vector<std::string> others() const {
        std::vector<std::string> names;
        for (const auto& entry : fs::directory_iterator(folder.path(""))) {
            if (entry.path() != file) {
                names.push_back(entry.path().filename());
            }
        }
        std::sort(names.begin(), names.end());
        return names;
    }

    Folder folder;
    std::string file = folder.path("run.jsonl");
    std::optional<Record> record;
    std::vector<std::string> news;
};

/// So large that two pairs fit into a file, or a head and one pair or more.
constexpr std::uint64_t twoPairs = 190;

} // namespace

TEST_F(RecordTest, HasALineForEachEvent) {
    takePair(1);
    take(stoppedEvent(), 2);
    EXPECT_EQ(contentOf(file),
              jsonLine(pairEvent(5, 6, 1), at(1)) + "\n" + jsonLine(stoppedEvent(), at(2)) + "\n");
    EXPECT_THAT(news, IsEmpty());
    EXPECT_THAT(others(), IsEmpty());
}

TEST_F(RecordTest, NoLineIsLostOrSplitWhenFilesAreFull) {
    begin({twoPairs, 20});
    for (int i = 0; i < 20; ++i) {
        takePair(i);
    }
    std::vector<int> pairs;
    for (unsigned number = 20; number-- > 0;) {
        if (fs::exists(rotatedName(file, number))) {
            const auto some = pairsIn(number);
            EXPECT_THAT(some, Not(IsEmpty()));
            pairs.insert(pairs.end(), some.begin(), some.end());
        }
    }
    ASSERT_EQ(pairs.size(), 20U);
    for (int i = 0; i < 20; ++i) {
        EXPECT_EQ(pairs[static_cast<std::size_t>(i)], i);
    }
    EXPECT_GE(others().size(), 9U);
    EXPECT_THAT(news, IsEmpty());
}

TEST_F(RecordTest, AFileIsNotLargerThanItMayBe) {
    begin({2000, 3});
    for (int i = 0; i < 100; ++i) {
        takePair(i);
    }
    EXPECT_THAT(others(), ElementsAre("run.jsonl.1", "run.jsonl.2", "run.jsonl.3"));
    for (unsigned number = 0; number <= 3; ++number) {
        const auto size = fs::file_size(rotatedName(file, number));
        EXPECT_LE(size, 2000U);
        EXPECT_GE(size, number == 0 ? 1U : 1900U);
    }
}

TEST_F(RecordTest, AFurtherFileBeginsWithWhatStillHolds) {
    begin({twoPairs, 9});
    constexpr std::array<double, 3> usable{2.5e-08, 1e-06, -1.0};
    take(loadedEvent("l", "n", 2), 0.25);
    take(epochOffsetEvent(7), 0.5);
    take(qualityEvent(usable.data(), "old"), 1);
    take(qualityEvent(usable.data(), "new"), 2);
    take(invalidMetadataEvent("x"), 3);
    takePair(4);
    const auto head = linesOf(0).at(0);
    EXPECT_EQ(head["event"], "continued");
    EXPECT_EQ(head["t"], 4);
    EXPECT_EQ(head["begin"], 1000000000000U);
    EXPECT_EQ(head["part"], others().size());
    const auto& before = head["before"];
    ASSERT_EQ(before.size(), 3U);
    EXPECT_EQ(before[0]["event"], "loaded");
    EXPECT_EQ(before[0]["library"], "l");
    EXPECT_EQ(before[1]["offset"], 7);
    EXPECT_EQ(before[2]["reason"], "new");
}

TEST_F(RecordTest, WhatASessionToldDoesNotHoldInTheNextOne) {
    begin({twoPairs, 3});
    take(loadedEvent("l", "n", 2), 1);
    take(epochOffsetEvent(7), 2);
    take({"restart", "", Json::object()}, 3);
    takePair(4);
    takePair(5);
    const auto before = linesOf(0).at(0)["before"];
    ASSERT_EQ(before.size(), 1U);
    EXPECT_EQ(before[0]["event"], "loaded");
}

TEST_F(RecordTest, ALongLineHasAFileOfItsOwn) {
    begin({twoPairs, 3});
    takePair(1);
    take(causeEvent(std::string(1000, 'x')), 2);
    takePair(3);
    EXPECT_EQ(linesOf(1).at(1)["event"], "cause");
    EXPECT_EQ(pairsIn(2), std::vector<int>{1});
    EXPECT_EQ(pairsIn(0), std::vector<int>{3});
}

TEST_F(RecordTest, AppendingGoesOnBehindWhatIsThere) {
    takePair(1);
    begin({0, 9, true});
    takePair(2);
    EXPECT_THAT(pairsIn(0), ElementsAre(1, 2));
    begin({});
    takePair(3);
    EXPECT_THAT(pairsIn(0), ElementsAre(3));
}

TEST_F(RecordTest, AppendingEndsALineThatWasCut) {
    writeFile(file, "{\"event\":\"pa");
    begin({0, 9, true});
    takePair(2);
    EXPECT_EQ(contentOf(file), "{\"event\":\"pa\n" + jsonLine(pairEvent(5, 6, 2), at(2)) + "\n");
}

TEST_F(RecordTest, AppendingToAFullFileBeginsANewOneWithoutAHead) {
    writeFile(file, std::string(twoPairs, '\n'));
    begin({twoPairs, 3, true});
    takePair(1);
    EXPECT_EQ(linesOf(0).at(0)["event"], "pair");
    EXPECT_EQ(fs::file_size(rotatedName(file, 1)), twoPairs);
}

TEST_F(RecordTest, FewerOldFilesThanBeforeAreKept) {
    for (unsigned number = 1; number <= 6; ++number) {
        writeFile(rotatedName(file, number), std::to_string(number));
    }
    begin({twoPairs, 2});
    takePair(1);
    takePair(2);
    takePair(3);
    EXPECT_THAT(others(), ElementsAre("run.jsonl.1", "run.jsonl.2"));
    EXPECT_EQ(contentOf(rotatedName(file, 2)), "1");
}

TEST_F(RecordTest, AMissingNumberIsFilledBeforeAFileIsRemoved) {
    writeFile(rotatedName(file, 1), "1");
    writeFile(rotatedName(file, 3), "3");
    begin({twoPairs, 3});
    takePair(1);
    takePair(2);
    takePair(3);
    EXPECT_THAT(pairsIn(1), ElementsAre(1, 2));
    EXPECT_EQ(contentOf(rotatedName(file, 2)), "1");
    EXPECT_EQ(contentOf(rotatedName(file, 3)), "3");
}

TEST_F(RecordTest, ARotationThatWasCutShortDoesNoHarm) {
    takePair(1);
    fs::create_hard_link(file, rotatedName(file, 1));
    writeFile(file + ".new", "half");
    begin({twoPairs, 3, true});
    takePair(2);
    takePair(3);
    EXPECT_THAT(others(), ElementsAre("run.jsonl.1"));
    EXPECT_THAT(pairsIn(1), ElementsAre(1, 2));
    EXPECT_THAT(pairsIn(0), ElementsAre(3));
}

TEST_F(RecordTest, NobodyElseWritesItAlsoAfterARotation) {
    begin({twoPairs, 3});
    for (int i = 0; i < 9; ++i) {
        takePair(i);
        EXPECT_THROW(Record(file, {}), UsageError);
    }
    EXPECT_GE(others().size(), 3U);
    record.reset();
    EXPECT_NO_THROW(Record(file, {}));
}

TEST_F(RecordTest, WithoutPlaceForANewFileItGrowsOnAndSaysSoOnce) {
    begin({twoPairs, 9});
    const auto blocked = file + ".new";
    fs::create_directory(blocked); // cannot be opened for writing
    fs::create_directory(blocked + "/x");
    for (int i = 0; i < 20; ++i) {
        takePair(i);
    }
    ASSERT_EQ(news.size(), 1U);
    EXPECT_THAT(news[0], HasSubstr("error: record " + file +
                                   ": it grows on, as no new file can "
                                   "be begun: cannot write " +
                                   blocked + ": Is a directory"));
    EXPECT_EQ(pairsIn(0).size(), 20U);
    fs::remove_all(blocked);
    for (int i = 20; i < 24; ++i) {
        takePair(i);
    }
    EXPECT_EQ(news.size(), 1U);
    std::size_t pairs = 0;
    for (unsigned number = 0; number <= others().size(); ++number) {
        pairs += pairsIn(number).size();
    }
    EXPECT_EQ(pairs, 24U);
    EXPECT_LE(fs::file_size(file), 300U);
}

TEST_F(RecordTest, AnOldFileThatCannotBeMovedLeavesTheOthersAsTheyWere) {
    fs::create_directory(rotatedName(file, 3));
    writeFile(rotatedName(file, 3) + "/x", "");
    writeFile(rotatedName(file, 2), "2");
    writeFile(rotatedName(file, 1), "1");
    begin({twoPairs, 3});
    for (int i = 0; i < 5; ++i) {
        takePair(i);
    }
    EXPECT_EQ(news.size(), 1U);
    EXPECT_EQ(contentOf(rotatedName(file, 2)), "2");
    EXPECT_EQ(contentOf(rotatedName(file, 1)), "1");
    EXPECT_EQ(pairsIn(0).size(), 5U);
    EXPECT_FALSE(fs::exists(file + ".new"));
}

TEST_F(RecordTest, APipeIsNeverRotated) {
    record.reset();
    const auto pipe = folder.path("pipe");
    ASSERT_EQ(::mkfifo(pipe.c_str(), 0600), 0);
    std::ifstream reader;
    std::thread opener([&] { reader.open(pipe); });
    Record toPipe(pipe, {10, 3});
    opener.join();
    toPipe.begin();
    for (int i = 0; i < 9; ++i) {
        EXPECT_FALSE(toPipe.take(stoppedEvent(), at(i)));
    }
    EXPECT_THAT(others(), ElementsAre("pipe"));
}

TEST(RecordLimitTest, AFullDiskIsToldOnceAndWhenItHasRoomAgainHowManyAreLost) {
    // A limit of the process plays the disk.
    Folder folder;
    const auto file = folder.path("run.jsonl");
    Record record(file, {});
    record.begin();
    rlimit old{};
    ASSERT_EQ(::getrlimit(RLIMIT_FSIZE, &old), 0);
    auto* const oldHandler = std::signal(SIGXFSZ, SIG_IGN);
    const auto twoLines = jsonLine(pairEvent(5, 6, 10), at(1)).size() +
                          jsonLine(pairEvent(5, 6, 11), at(1.1)).size() + 2;
    const rlimit small{twoLines + 40, old.rlim_max};
    ASSERT_EQ(::setrlimit(RLIMIT_FSIZE, &small), 0);
    std::vector<std::string> news;
    const auto take = [&](double seconds) {
        const auto told = record.take(pairEvent(5, 6, static_cast<int>(seconds * 10)), at(seconds));
        news.push_back(told ? told->name : "");
        return told;
    };
    take(1);
    take(1.1);
    const auto told = take(1.2);
    take(1.3);
    take(2.3);
    const auto size = fs::file_size(file);
    ASSERT_EQ(::setrlimit(RLIMIT_FSIZE, &old), 0);
    take(2.4); // too soon for another try
    const auto again = take(3.5);
    take(3.6);
    std::signal(SIGXFSZ, oldHandler);
    EXPECT_THAT(news, ElementsAre("", "", "error", "", "", "", "lost", ""));
    EXPECT_EQ(told->members["problem"], "File too large");
    EXPECT_EQ(again->members["events"], 4);
    EXPECT_NEAR(again->members["seconds"].get<double>(), 2.3, 1e-9);
    EXPECT_EQ(again->members["problem"], "File too large");
    EXPECT_EQ(size, twoLines) << "half a line is taken back";
    std::vector<int> offsets;
    for (const auto& line : Result{0, contentOf(file), ""}.events()) {
        offsets.push_back(line["offset"]);
    }
    EXPECT_THAT(offsets, ElementsAre(10, 11, 35, 36));
}

TEST_F(RecordTest, AFolderThatIsMissingIsAMistake) {
    EXPECT_THROW(Record(folder.path("none/run.jsonl"), {}), UsageError);
}
