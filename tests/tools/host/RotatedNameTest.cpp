#include "RotatedName.h"

#include <gtest/gtest.h>

using namespace vantelhost;

TEST(RotatedName, HasItsNumberBehindAPoint) {
    EXPECT_EQ(rotatedName("/a/run.jsonl", 0), "/a/run.jsonl");
    EXPECT_EQ(rotatedName("/a/run.jsonl", 12), "/a/run.jsonl.12");
}

TEST(RotatedName, IsTakenApart) {
    EXPECT_EQ(rotatedName("/a/run.jsonl.12"), std::pair(std::string("/a/run.jsonl"), 12U));
    EXPECT_EQ(rotatedName("run.999"), std::pair(std::string("run"), 999U));
}

TEST(RotatedName, OtherNamesAreTheFileItself) {
    for (const std::string name : {"run", "run.jsonl", "run.0", "run.01", "run.1000",
                                   "run.20261122", "run.1x", "run.-1", "run.", "/a.1/run", ""}) {
        EXPECT_EQ(rotatedName(name), std::pair(name, 0U));
    }
}
