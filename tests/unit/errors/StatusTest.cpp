#include "errors/Status.h"

#include <ostream>
#include <string>

#include <gtest/gtest.h>

#include "ResizeOperations.h"

namespace {

struct PriorityCase {
    std::int32_t before;
    std::int32_t code;
    bool accepted;
};

void PrintTo(const PriorityCase& row, std::ostream* out) {
    *out << row.code << " on " << row.before;
}

class StatusPriorityTest : public testing::TestWithParam<PriorityCase> {};

TEST_P(StatusPriorityTest, FirstErrorWinsAndAnErrorReplacesAWarning) {
    const auto [before, code, accepted] = GetParam();
    zeerr::LocalStatus status;
    ASSERT_TRUE(zeerr::resize(status, 16));
    std::strcpy(status.json, "{\"old\":1}");
    status.code = before;
    EXPECT_EQ(zeerr::setCode(status, code), accepted);
    EXPECT_EQ(status.code, accepted ? code : before);
    EXPECT_STREQ(status.json, accepted ? "{}" : "{\"old\":1}");
}

INSTANTIATE_TEST_SUITE_P(
    EveryPair, StatusPriorityTest,
    testing::Values(PriorityCase{0, 0, false}, PriorityCase{0, 1, true},
                    PriorityCase{0, -52005, true}, PriorityCase{1, 0, false},
                    PriorityCase{1, 2, false}, PriorityCase{1, -52005, true},
                    PriorityCase{-52008, 0, false}, PriorityCase{-52008, 1, false},
                    PriorityCase{-52008, -52005, false}, PriorityCase{-52008, -52008, false},
                    PriorityCase{0, INT32_MIN, true}, PriorityCase{INT32_MAX, INT32_MIN, true}));

TEST(StatusTest, FreshStatusHasNoCodeAndNoText) {
    const zeerr::LocalStatus status;
    EXPECT_EQ(status.code, 0);
    EXPECT_EQ(status.capacity, 0U);
    EXPECT_EQ(status.json, nullptr);
    EXPECT_EQ(status.resize, &zeerr::defaultResize);
}

TEST(StatusTest, CodeAloneGivesAFreshStatusNoText) {
    zeerr::LocalStatus status;
    EXPECT_TRUE(zeerr::setCode(status, -52005));
    EXPECT_EQ(status.json, nullptr);
    EXPECT_EQ(status.capacity, 0U);
}

TEST(StatusTest, TextOfOneOctetIsResetToAnEmptyText) {
    HostStatus status(&countingResize, "", 1);
    EXPECT_TRUE(zeerr::setCode(status, -1));
    EXPECT_STREQ(status.json, "");
    EXPECT_TRUE(requestedSizes.empty());
}

TEST(StatusTest, TextWithoutCapacityIsNotTouched) {
    char constant[] = "host";
    zeerr::Status status{0, 0, &refusingResize, constant};
    EXPECT_TRUE(zeerr::setCode(status, -1));
    EXPECT_STREQ(constant, "host");
}

TEST(StatusTest, PredicatesTellErrorFromCleanFromWarning) {
    zeerr::LocalStatus status;
    EXPECT_TRUE(zeerr::isClean(status));
    EXPECT_FALSE(zeerr::isError(status));
    status.code = 1;
    EXPECT_FALSE(zeerr::isClean(status));
    EXPECT_FALSE(zeerr::isError(status));
    status.code = -1;
    EXPECT_FALSE(zeerr::isClean(status));
    EXPECT_TRUE(zeerr::isError(status));
}

struct SizeCase {
    std::uint32_t size;
    std::uint32_t capacity;
};

void PrintTo(const SizeCase& row, std::ostream* out) {
    *out << row.size;
}

class DefaultResizeSizesTest : public testing::TestWithParam<SizeCase> {};

TEST_P(DefaultResizeSizesTest, GivesTheSmallestPowerOfTwoFrom512) {
    zeerr::LocalStatus status;
    EXPECT_TRUE(zeerr::defaultResize(&status, GetParam().size));
    EXPECT_EQ(status.capacity, GetParam().capacity);
    EXPECT_STREQ(status.json, "{}");
}

INSTANTIATE_TEST_SUITE_P(Sizes, DefaultResizeSizesTest,
                         testing::Values(SizeCase{1, 512}, SizeCase{511, 512}, SizeCase{512, 512},
                                         SizeCase{513, 1024}, SizeCase{1024, 1024},
                                         SizeCase{1025, 2048}, SizeCase{65537, 131072}));

TEST(DefaultResizeTest, SizeZeroReleasesTheText) {
    zeerr::Status status{-1, 0, &zeerr::defaultResize, nullptr};
    ASSERT_TRUE(zeerr::defaultResize(&status, 1));
    EXPECT_TRUE(zeerr::defaultResize(&status, 0));
    EXPECT_EQ(status.json, nullptr);
    EXPECT_EQ(status.capacity, 0U);
    EXPECT_EQ(status.code, -1);
    EXPECT_TRUE(zeerr::defaultResize(&status, 0));
}

TEST(DefaultResizeTest, SizeWithTheTopBitFails) {
    for (const std::uint32_t size : {0x80000000U, 0xffffffffU}) {
        zeerr::LocalStatus status;
        EXPECT_FALSE(zeerr::defaultResize(&status, size));
        EXPECT_EQ(status.json, nullptr);
        EXPECT_EQ(status.capacity, 0U);
    }
}

TEST(DefaultResizeTest, SizeThatThereIsChangesNothing) {
    zeerr::LocalStatus status;
    ASSERT_TRUE(zeerr::defaultResize(&status, 2000));
    std::strcpy(status.json, "{\"a\":1}");
    const char* const text = status.json;
    for (const std::uint32_t size : {1U, 2048U}) {
        EXPECT_TRUE(zeerr::defaultResize(&status, size));
        EXPECT_EQ(status.json, text);
        EXPECT_EQ(status.capacity, 2048U);
    }
    EXPECT_STREQ(status.json, "{\"a\":1}");
}

TEST(DefaultResizeTest, GrowingKeepsTheText) {
    zeerr::LocalStatus status;
    ASSERT_TRUE(zeerr::defaultResize(&status, 512));
    const std::string text(511, 'x');
    std::strcpy(status.json, text.c_str());
    EXPECT_TRUE(zeerr::defaultResize(&status, 513));
    EXPECT_EQ(status.capacity, 1024U);
    EXPECT_EQ(status.json, text);
}

TEST(ResizeTest, MissingRefusingForgettingNotGrowingAndThrowingOperationsFail) {
    for (const zeerr_Resize operation : {zeerr_Resize(nullptr), &refusingResize, &notGrowingResize,
                                         &forgettingResize, &throwingResize}) {
        HostStatus status(operation);
        EXPECT_FALSE(zeerr::resize(status, 8));
        EXPECT_EQ(status.json, nullptr);
        EXPECT_EQ(status.capacity, 0U);
    }
}

TEST(ResizeTest, OperationThatDoesNotGrowFailsOnAnExistingText) {
    HostStatus status(&notGrowingResize, "{}", 8);
    EXPECT_TRUE(zeerr::resize(status, 8));
    EXPECT_FALSE(zeerr::resize(status, 9));
    EXPECT_STREQ(status.json, "{}");
}

bool claimingResize(zeerr::Status* status, std::uint32_t size) {
    status->capacity = size;
    return true;
}

TEST(ResizeTest, OperationThatOnlyClaimsToGiveMemoryFails) {
    zeerr::Status status{0, 0, &claimingResize, nullptr};
    EXPECT_FALSE(zeerr::resize(status, 8));
}

TEST(ResizeTest, MemoryBehindTheCapacityIsNotWritten) {
    for (const std::uint32_t size : {8U, 4U}) {
        char text[] = "{\"a\":12}host";
        zeerr::Status status{0, 8, &claimingResize, text};
        EXPECT_TRUE(zeerr::resize(status, size));
        EXPECT_EQ(status.capacity, size);
        EXPECT_STREQ(text, "{\"a\":12}host") << size;
    }
}

TEST(ResizeTest, UnsetMemoryBecomesAnEmptyObject) {
    for (const zeerr_Resize operation : {&countingResize, &garbageResize, &zeroingResize}) {
        HostStatus status(operation);
        EXPECT_TRUE(zeerr::resize(status, 8));
        EXPECT_STREQ(status.json, "{}");
    }
}

TEST(ResizeTest, TextStaysTerminatedWhateverTheNewMemoryHolds) {
    for (const zeerr_Resize operation : {&countingResize, &garbageResize, &zeroingResize}) {
        HostStatus status(operation, "{\"a\":1}", 8);
        EXPECT_TRUE(zeerr::resize(status, 32));
        EXPECT_LE(zeerr::textLength(status), 7U);
    }
}

TEST(ResizeTest, MemoryTooSmallForAnObjectBecomesAnEmptyText) {
    for (const auto& [size, text] : {std::pair(2U, ""), {3U, "{}"}}) {
        HostStatus status(&countingResize);
        EXPECT_TRUE(zeerr::resize(status, size));
        EXPECT_STREQ(status.json, text);
    }
}

TEST(ResizeTest, OperationThatThrowsAlsoForLessFails) {
    HostStatus status(&throwingResize, "{}", 8);
    EXPECT_FALSE(zeerr::resize(status, 4));
    EXPECT_STREQ(status.json, "{}");
}

TEST(SetCodeTest, CapacityWithoutATextIsNotWritten) {
    zeerr::Status status{0, 8, nullptr, nullptr};
    EXPECT_TRUE(zeerr::setCode(status, -7));
    EXPECT_EQ(status.json, nullptr);
}

TEST(TextLengthTest, NeverGoesBeyondTheCapacity) {
    char text[] = {'a', 'b', 'c'};
    zeerr::Status status{0, 3, nullptr, text};
    EXPECT_EQ(zeerr::textLength(status), 3U);
    status.capacity = 2;
    EXPECT_EQ(zeerr::textLength(status), 2U);
    status.json = nullptr;
    EXPECT_EQ(zeerr::textLength(status), 0U);
}

TEST(ReleaseTest, AsksTheStatusOwnOperationForSizeZeroAndKeepsTheCode) {
    HostStatus status(&countingResize, "{}", 3);
    status.code = -7;
    zeerr::release(status);
    EXPECT_EQ(requestedSizes, std::vector<std::uint32_t>{0});
    EXPECT_EQ(status.json, nullptr);
    EXPECT_EQ(status.code, -7);
}

TEST(ReleaseTest, WithoutAnOperationDoesNothing) {
    char text[] = "{}";
    zeerr::Status status{-7, 3, nullptr, text};
    zeerr::release(status);
    EXPECT_EQ(status.json, text);
}

bool throwingRelease(zeerr::Status*, std::uint32_t) {
    throw std::runtime_error("no");
}

TEST(ReleaseTest, OperationThatThrowsIsSurvived) {
    char text[] = "{}";
    zeerr::Status status{-7, 3, &throwingRelease, text};
    EXPECT_NO_THROW(zeerr::release(status));
}

TEST(LocalStatusTest, ReleasesItsTextWithItsOwnOperation) {
    requestedSizes.clear();
    {
        zeerr::LocalStatus status;
        status.resize = &countingResize;
        ASSERT_TRUE(zeerr::resize(status, 8));
    }
    EXPECT_EQ(requestedSizes, (std::vector<std::uint32_t>{8, 0}));
}

TEST(LocalStatusTest, AsksTheOperationOfAHostThoughThereIsNoText) {
    requestedSizes.clear();
    {
        zeerr::LocalStatus status;
        status.resize = &countingResize;
    }
    EXPECT_EQ(requestedSizes, std::vector<std::uint32_t>{0});
}

} // namespace
