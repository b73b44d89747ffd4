#include <ostream>
#include <string>

#include <gtest/gtest.h>

#include "ResizeOperations.h"
#include "errors/ErrorText.h"

using zeerr::addInt;
using zeerr::addObject;
using zeerr::addString;
using zeerr::beginMembers;
using zeerr::Resizer;

namespace {

TEST(ErrorTextGrowthTest, AsksForTwiceTheCapacityLessTwoUntilTheMemberFits) {
    HostStatus status(&countingResize, "{}", 5);
    Resizer resizer(status);
    ASSERT_NE(addString(beginMembers(status), "a", "b", resizer), nullptr);
    EXPECT_EQ(requestedSizes, (std::vector<std::uint32_t>{5, 8, 14}));
    EXPECT_STREQ(status.json, R"({"a":"b"})");
}

TEST(ErrorTextGrowthTest, FreshStatusBeginsWithRoomForTwoMore) {
    HostStatus status(&countingResize);
    ASSERT_NE(beginMembers(status), nullptr);
    EXPECT_EQ(requestedSizes, std::vector<std::uint32_t>{5});
    EXPECT_STREQ(status.json, "{}");
}

TEST(ErrorTextGrowthTest, ExistingTextBeginsWithRoomForTwoMore) {
    HostStatus status(&countingResize, R"({"a":1})", 8);
    ASSERT_NE(beginMembers(status), nullptr);
    EXPECT_EQ(requestedSizes, std::vector<std::uint32_t>{10});
}

TEST(ErrorTextGrowthTest, TextThatFillsItsCapacityExactlyDoesNotGrow) {
    // {"k":"..."} has 8 octets around the value and a terminating zero.
    for (const std::uint32_t length : {503U, 504U}) {
        zeerr::LocalStatus status;
        Resizer resizer(status);
        const std::string value(length, 'x');
        ASSERT_NE(addString(beginMembers(status), "k", value, resizer), nullptr);
        EXPECT_EQ(status.capacity, length == 503U ? 512U : 1024U);
        EXPECT_EQ(status.json, "{\"k\":\"" + value + "\"}");
    }
}

TEST(ErrorTextGrowthTest, PositionFollowsTheTextWhenItMoves) {
    HostStatus status(&countingResize);
    Resizer resizer(status);
    char* position = beginMembers(status);
    for (int member = 0; member < 100; ++member) {
        position = addInt(position, "n", member % 10, resizer);
        ASSERT_NE(position, nullptr);
        ASSERT_EQ(position, status.json + 6 * (member + 1));
        ASSERT_STREQ(position, "}");
    }
}

TEST(ErrorTextGrowthTest, VeryLongValuesAreWrittenWhole) {
    zeerr::LocalStatus status;
    Resizer resizer(status);
    std::string escapes;
    for (int octet = 0; octet < 100000; ++octet) {
        escapes += "\\u0001";
    }
    char* position = addString(beginMembers(status), "k", std::string(100000, '\x01'), resizer);
    ASSERT_NE(position, nullptr);
    EXPECT_EQ(status.json, "{\"k\":\"" + escapes + "\"}");
    EXPECT_EQ(status.capacity, 1048576U);
}

TEST(ErrorTextGrowthTest, OperationsThatGiveNoMemoryYieldNullAndKeepTheCode) {
    for (const zeerr_Resize operation : {zeerr_Resize(nullptr), &refusingResize, &notGrowingResize,
                                         &forgettingResize, &throwingResize}) {
        HostStatus status(operation);
        ASSERT_TRUE(zeerr::setCode(status, -52005));
        EXPECT_EQ(beginMembers(status), nullptr);
        EXPECT_EQ(status.code, -52005);
        EXPECT_EQ(status.json, nullptr);
    }
}

TEST(ErrorTextGrowthTest, RefusalWhileWritingYieldsNullAndKeepsWhatFitted) {
    HostStatus status(&smallResize);
    status.code = -52005;
    Resizer resizer(status);
    char* position = addInt(beginMembers(status), "a", 1, resizer);
    ASSERT_NE(position, nullptr);
    position = addString(position, "b", std::string(64, 'x'), resizer);
    EXPECT_EQ(position, nullptr);
    EXPECT_EQ(addInt(position, "c", 3, resizer), nullptr);
    EXPECT_STREQ(status.json, R"({"a":1})");
    EXPECT_EQ(status.code, -52005);
}

TEST(ErrorTextGrowthTest, SuccessWithoutGrowingDoesNotLoop) {
    HostStatus status(&notGrowingResize, "{}", 5);
    Resizer resizer(status);
    EXPECT_EQ(addString(beginMembers(status), "a", "b", resizer), nullptr);
    EXPECT_EQ(requestedSizes, (std::vector<std::uint32_t>{5, 8}));
    EXPECT_STREQ(status.json, "{}");
}

TEST(ErrorTextGrowthTest, CapacityThatCannotBeDoubledDoesNotGrow) {
    for (const std::uint32_t capacity : {1U, 2U, 0x80000001U}) {
        HostStatus status(&countingResize, "", 2);
        status.capacity = capacity;
        EXPECT_EQ(Resizer(status).insert(status.json, capacity), nullptr) << capacity;
        EXPECT_TRUE(requestedSizes.empty()) << capacity;
    }
}

TEST(ErrorTextGrowthTest, FreshStatusHasNothingToDouble) {
    HostStatus status(&countingResize);
    EXPECT_EQ(Resizer(status).insert(status.json, 1), nullptr);
    EXPECT_TRUE(requestedSizes.empty());
}

TEST(ErrorTextGrowthTest, PositionBehindTheTextIsRefused) {
    HostStatus status(&countingResize, "{}", 8);
    EXPECT_EQ(Resizer(status).insert(status.json + 3, 1), nullptr);
    EXPECT_STREQ(status.json, "{}");
    EXPECT_EQ(Resizer(status).insert(status.json + 2, 1), status.json + 2);
}

bool anewResize(zeerr::Status* status, std::uint32_t size) {
    const bool resized = garbageResize(status, size);
    if (resized && size > 2) {
        std::strcpy(status->json, "{}");
    }
    return resized;
}

TEST(ErrorTextGrowthTest, TextThatAnotherReplacedWhileItGrewIsRefused) {
    HostStatus status(&anewResize, R"({"a":1})", 10);
    EXPECT_EQ(Resizer(status).insert(status.json + 7, 20), nullptr);
    EXPECT_STREQ(status.json, "{}");
}

TEST(ErrorTextGrowthTest, OctetBehindTheCapacityStays) {
    char text[] = {'{', '}', '\0', 'x', 'x', 'x', 'x', 'x', '!'};
    zeerr::Status status{0, 8, nullptr, text};
    EXPECT_EQ(Resizer(status).insert(text + 1, 5), text + 1);
    EXPECT_STREQ(text + 6, "}");
    EXPECT_EQ(text[8], '!');
}

struct Operation {
    const char* name;
    zeerr_Resize resize;
};

void PrintTo(const Operation& operation, std::ostream* out) {
    *out << operation.name;
}

class TextLosingResizeTest : public testing::TestWithParam<Operation> {};

TEST_P(TextLosingResizeTest, NothingIsWrittenOutOfBounds) {
    HostStatus status(GetParam().resize);
    status.code = -52005;
    Resizer resizer(status);
    char* position = beginMembers(status);
    position = addString(position, "error_constant", "zeoskerr_invalidParameter", resizer);
    position = zeerr::addSourceLocation(position, "tPtp4lTimeRef", 337, "vantel_bc", resizer);
    position = addObject(position, "zesync_debug", resizer);
    addString(position, "message", std::string(300, 'x'), resizer);
    ASSERT_NE(status.json, nullptr);
    EXPECT_LT(zeerr::textLength(status), status.capacity);
    EXPECT_EQ(status.code, -52005);
}

INSTANTIATE_TEST_SUITE_P(Operations, TextLosingResizeTest,
                         testing::Values(Operation{"garbage", &garbageResize},
                                         Operation{"zeros", &zeroingResize},
                                         Operation{"anew", &anewResize}),
                         [](const auto& row) { return row.param.name; });

} // namespace
