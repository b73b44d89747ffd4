#include "Report/RecordFiles.h"

#include <cstdint>
#include <filesystem>

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include "Tool.h"
#include "UsageError.h"
#include "support/Descriptors.h"

using namespace vantelhost;
using testing::ElementsAre;
using testing::HasSubstr;
using testing::StrEq;

namespace {

class RecordFilesTest : public testing::Test {
protected:
    /// A file whose first line is of this time, and of a host that was started at 1000 s.
    void add(const std::string& name, double seconds) const {
        const Json line{{"event", "started"},
                        {"t", seconds},
                        {"time", static_cast<std::uint64_t>((1000 + seconds) * 1e9)}};
        writeFile(folder.path(name), line.dump() + "\nrest\n");
    }

    std::vector<std::string> names(const std::vector<std::string>& paths) const {
        std::vector<std::string> names;
        for (const auto& path : findRecords(paths)) {
            names.push_back(std::filesystem::path(path).filename());
        }
        return names;
    }

    std::vector<std::string> namesOfFolder() const { return names({folder.path("")}); }

    std::string complaint(const std::vector<std::string>& paths) const {
        try {
            findRecords(paths);
        } catch (const UsageError& error) {
            return error.what();
        }
        return "";
    }

    Folder folder;
};

} // namespace

TEST_F(RecordFilesTest, OfAFolderTheHighestNumberIsTheOldest) {
    add("run.jsonl", 1);
    for (int i = 1; i <= 11; ++i) {
        add("run.jsonl." + std::to_string(i), 1 + i); // the clock was set back
    }
    EXPECT_THAT(namesOfFolder(),
                ElementsAre("run.jsonl.11", "run.jsonl.10", "run.jsonl.9", "run.jsonl.8",
                            "run.jsonl.7", "run.jsonl.6", "run.jsonl.5", "run.jsonl.4",
                            "run.jsonl.3", "run.jsonl.2", "run.jsonl.1", "run.jsonl"));
}

TEST_F(RecordFilesTest, FilesOutOfOrderArePutInOrder) {
    add("a", 3);
    add("b.1", 1);
    add("b", 9);
    add("c", 2);
    EXPECT_THAT(names({folder.path("a"), folder.path("b"), folder.path("c"), folder.path("b.1")}),
                ElementsAre("b.1", "b", "c", "a"));
}

TEST_F(RecordFilesTest, PartsOfARunAreOrderedByItsStartAlsoWhenTheClockIsSet) {
    add("a", 5);
    writeFile(folder.path("b"),
              R"({"event":"continued","begin":1000000000000,"part":2,"t":9,"time":1})"
              "\n");
    EXPECT_THAT(names({folder.path("b"), folder.path("a")}), ElementsAre("a", "b"));
}

TEST_F(RecordFilesTest, OtherFilesOfAFolderAreLeftAlone) {
    add("run.jsonl", 1);
    writeFile(folder.path("page.html"), "<html>\n");
    writeFile(folder.path("page.json"), "{}\n");
    writeFile(folder.path("empty"), "");
    std::filesystem::create_directory(folder.path("more"));
    EXPECT_THAT(namesOfFolder(), ElementsAre("run.jsonl"));
}

TEST_F(RecordFilesTest, AFileOfTheRotationIsTakenThoughItsFirstLineIsSpoilt) {
    add("run.jsonl", 9);
    writeFile(folder.path("run.jsonl.1"), std::string("\0\0\n", 3));
    add("run.jsonl.2", 1);
    EXPECT_THAT(namesOfFolder(), ElementsAre("run.jsonl.2", "run.jsonl.1", "run.jsonl"));
}

TEST_F(RecordFilesTest, AFileWithTwoNamesInAFolderIsTakenOnce) {
    add("run.jsonl", 1);
    std::filesystem::create_hard_link(folder.path("run.jsonl"), folder.path("run.jsonl.1"));
    EXPECT_EQ(namesOfFolder().size(), 1U);
}

TEST_F(RecordFilesTest, TheSameRecordTwiceIsAMistake) {
    add("a", 1);
    std::filesystem::copy(folder.path("a"), folder.path("b"));
    const auto a = folder.path("a");
    EXPECT_THAT(complaint({a, a}), StrEq(a + " and " + a + " hold the same record"));
    EXPECT_THAT(complaint({a, folder.path("b")}), HasSubstr("hold the same record"));
    EXPECT_THAT(complaint({folder.path("")}), HasSubstr("hold the same record"));
}

TEST_F(RecordFilesTest, SeveralEmptyFilesAreNoRecordTwice) {
    writeFile(folder.path("a"), "");
    writeFile(folder.path("b"), "");
    EXPECT_THAT(names({folder.path("b"), folder.path("a")}).size(), 2U);
}

TEST_F(RecordFilesTest, ThereMayBeMoreFilesThanDescriptors) {
    for (int i = 1; i <= 100; ++i) {
        add("run.jsonl." + std::to_string(i), i);
    }
    const DescriptorLimit limit(static_cast<rlim_t>(openDescriptors()) + 10);
    EXPECT_EQ(namesOfFolder().size(), 100U);
}

TEST_F(RecordFilesTest, WhatCannotBeLookedAtIsAMistake) {
    const auto loop = folder.path("loop");
    std::filesystem::create_symlink(loop, loop);
    EXPECT_EQ(complaint({loop}), "cannot read " + loop + ": Too many levels of symbolic links");
}

TEST_F(RecordFilesTest, AFolderWithoutARecordIsAMistake) {
    EXPECT_EQ(complaint({folder.path("")}), "there is no record in " + folder.path(""));
    EXPECT_EQ(complaint({folder.path("none")}),
              "cannot read " + folder.path("none") + ": No such file or directory");
}
