#include <string>

#include <gtest/gtest.h>

#include "ResizeOperations.h"
#include "errors/Status.h"

namespace {

TEST(MergeTest, SameOperationMovesTheTextAndClearsTheSource) {
    HostStatus source(&countingResize, "{\"a\":1}", 20);
    HostStatus target(&countingResize);
    source.code = -52008;
    const char* const text = source.json;
    bool changed = false;
    EXPECT_TRUE(zeerr::merge(target, source, &changed));
    EXPECT_TRUE(changed);
    EXPECT_EQ(target.code, -52008);
    EXPECT_EQ(target.json, text);
    EXPECT_EQ(target.capacity, 20U);
    EXPECT_EQ(source.json, nullptr);
    EXPECT_EQ(source.capacity, 0U);
}

TEST(MergeTest, SameOperationReleasesTheTargetsFormerText) {
    HostStatus source(&countingResize, "{\"a\":1}", 20);
    HostStatus target(&countingResize, "{\"warning\":1}", 40);
    source.code = -52008;
    target.code = 1;
    EXPECT_TRUE(zeerr::merge(target, source));
    EXPECT_EQ(requestedSizes, std::vector<std::uint32_t>{0});
    EXPECT_STREQ(target.json, "{\"a\":1}");
}

TEST(MergeTest, SameOperationWithoutASourceTextLeavesNoText) {
    HostStatus source(&countingResize);
    HostStatus target(&countingResize, "{\"warning\":1}", 40);
    source.code = -52008;
    target.code = 1;
    EXPECT_TRUE(zeerr::merge(target, source));
    EXPECT_EQ(target.json, nullptr);
    EXPECT_EQ(target.capacity, 0U);
}

TEST(MergeTest, OtherOperationCopiesTheTextAndLeavesTheSource) {
    zeerr::LocalStatus source;
    ASSERT_TRUE(zeerr::resize(source, 16));
    std::strcpy(source.json, "{\"a\":1}");
    source.code = -52008;
    HostStatus target(&countingResize);
    bool changed = false;
    EXPECT_TRUE(zeerr::merge(target, source, &changed));
    EXPECT_TRUE(changed);
    EXPECT_EQ(target.code, -52008);
    EXPECT_STREQ(target.json, "{\"a\":1}");
    EXPECT_STREQ(source.json, "{\"a\":1}");
    EXPECT_NE(target.json, source.json);
    EXPECT_EQ(requestedSizes, std::vector<std::uint32_t>{8});
}

TEST(MergeTest, CopyReplacesALongerWarning) {
    zeerr::LocalStatus source;
    ASSERT_TRUE(zeerr::resize(source, 16));
    source.code = -52008;
    HostStatus target(&countingResize, "{\"warning\":1}", 40);
    target.code = 1;
    EXPECT_TRUE(zeerr::merge(target, source));
    EXPECT_EQ(target.code, -52008);
    EXPECT_STREQ(target.json, "{}");
}

TEST(MergeTest, FailedCopyReportsTheCodeAndThatTheTextIsMissing) {
    for (const zeerr_Resize operation : {zeerr_Resize(nullptr), &refusingResize, &notGrowingResize,
                                         &forgettingResize, &throwingResize}) {
        zeerr::LocalStatus source;
        ASSERT_TRUE(zeerr::resize(source, 16));
        source.code = -52008;
        HostStatus target(operation);
        bool changed = true;
        EXPECT_TRUE(zeerr::merge(target, source, &changed));
        EXPECT_FALSE(changed);
        EXPECT_EQ(target.code, -52008);
        EXPECT_EQ(target.json, nullptr);
    }
}

TEST(MergeTest, FailedCopyLeavesNoTextOfTheFormerWarning) {
    zeerr::LocalStatus source;
    ASSERT_TRUE(zeerr::resize(source, 512));
    const std::string text(500, ' ');
    std::strcpy(source.json, text.c_str());
    source.code = -52008;
    HostStatus target(&refusingResize, "{\"warning\":1}", 14);
    target.code = 1;
    bool changed = true;
    EXPECT_TRUE(zeerr::merge(target, source, &changed));
    EXPECT_FALSE(changed);
    EXPECT_EQ(target.code, -52008);
    EXPECT_STREQ(target.json, "{}");
}

TEST(MergeTest, OtherOperationWithoutASourceTextIsComplete) {
    zeerr::LocalStatus source;
    source.code = -52008;
    HostStatus target(&refusingResize);
    bool changed = false;
    EXPECT_TRUE(zeerr::merge(target, source, &changed));
    EXPECT_TRUE(changed);
    EXPECT_EQ(target.code, -52008);
    EXPECT_TRUE(requestedSizes.empty());
}

TEST(MergeTest, RefusedMergeChangesNothingAndStillSetsTheFlag) {
    HostStatus source(&countingResize, "{\"a\":1}", 20);
    HostStatus target(&countingResize, "{\"b\":2}", 20);
    source.code = -52005;
    target.code = -52008;
    bool changed = false;
    EXPECT_FALSE(zeerr::merge(target, source, &changed));
    EXPECT_TRUE(changed);
    EXPECT_EQ(target.code, -52008);
    EXPECT_STREQ(target.json, "{\"b\":2}");
    EXPECT_STREQ(source.json, "{\"a\":1}");
}

TEST(MergeTest, CleanSourceIsRefused) {
    HostStatus source(&countingResize, "{\"a\":1}", 20);
    HostStatus target(&countingResize);
    EXPECT_FALSE(zeerr::merge(target, source));
    EXPECT_EQ(target.json, nullptr);
}

TEST(MergeTest, SourceTextThatIsNotTerminatedIsCopiedWithinItsCapacity) {
    char text[] = {'{', '}', 'x'};
    zeerr::Status source{-1, 2, nullptr, text};
    HostStatus target(&countingResize);
    EXPECT_TRUE(zeerr::merge(target, source));
    EXPECT_STREQ(target.json, "{}");
}

TEST(CopyTextTest, WithoutASourceTextSucceedsAndAsksForNothing) {
    const zeerr::LocalStatus source;
    HostStatus target(&countingResize);
    EXPECT_TRUE(zeerr::copyText(target, source));
    EXPECT_TRUE(requestedSizes.empty());
}

// The operation of this host gives memory back.
TEST(CopyTextTest, ShorterTextTakesThePlaceOfALongerOne) {
    for (const char* const text : {"{}", ""}) {
        HostStatus source(&countingResize, text, 3);
        HostStatus target(&countingResize, "{\"warning\":1}", 40);
        EXPECT_TRUE(zeerr::copyText(target, source));
        EXPECT_EQ(requestedSizes, std::vector{zeerr::textLength(source) + 1});
        EXPECT_STREQ(target.json, text);
    }
}

} // namespace
