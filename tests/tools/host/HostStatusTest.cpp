#include "HostStatus.h"

#include <cstring>

#include <gtest/gtest.h>

#include "Json.h"

using namespace vantelhost;

TEST(HostStatus, IsFreshAtFirst) {
    HostStatus status;
    EXPECT_EQ(status.code(), 0);
    EXPECT_EQ(status.get()->capacity, 0U);
    EXPECT_NE(status.get()->resize, nullptr);
    EXPECT_EQ(status.get()->json, nullptr);
    EXPECT_EQ(status.text(), "");
}

TEST(HostStatus, ErrorsAreNegativeAndWarningsPositive) {
    HostStatus status;
    EXPECT_FALSE(status.isError() || status.isWarning());
    status.get()->code = -1;
    EXPECT_TRUE(status.isError());
    status.get()->code = 1;
    EXPECT_FALSE(status.isError());
    EXPECT_TRUE(status.isWarning());
}

TEST(HostStatus, ANullTextBecomesAnEmptyObject) {
    for (const std::uint32_t size : {1U, 2U, 3U, 100U}) {
        HostStatus status;
        ASSERT_TRUE(status.get()->resize(status.get(), size));
        EXPECT_EQ(status.text(), "{}");
        EXPECT_GE(status.get()->capacity, size);
        EXPECT_GE(status.get()->capacity, 3U);
    }
}

TEST(HostStatus, TheTextIsKeptWhenItGrowsOrShrinks) {
    HostStatus status;
    ASSERT_TRUE(status.get()->resize(status.get(), 8));
    std::strcpy(status.get()->json, "{\"a\":1}");
    for (const std::uint32_t size : {5000U, 1U, 8U}) {
        ASSERT_TRUE(status.get()->resize(status.get(), size));
        EXPECT_EQ(status.text(), "{\"a\":1}");
        EXPECT_GE(status.get()->capacity, size);
    }
}

TEST(HostStatus, SizeZeroReleasesTheText) {
    HostStatus status;
    ASSERT_TRUE(status.get()->resize(status.get(), 50));
    ASSERT_TRUE(status.get()->resize(status.get(), 0));
    EXPECT_EQ(status.get()->json, nullptr);
    EXPECT_EQ(status.get()->capacity, 0U);
}

namespace {

int released = 0;
char foreignText[] = "{}";

bool foreignResize(zeerr_Status* status, std::uint32_t size) {
    released += size == 0 ? 1 : 0;
    status->json = nullptr;
    return true;
}

bool noMemory(zeerr_Status*, std::uint32_t) {
    return false;
}

} // namespace

TEST(HostStatus, ATextIsReleasedByItsOwner) {
    released = 0;
    {
        HostStatus status;
        *status.get() = {-1, 3, foreignResize, foreignText};
    }
    EXPECT_EQ(released, 1);
}

TEST(HostStatus, AFailureOfTheHostHasCodeAndText) {
    HostStatus status;
    fail(*status.get(), invalidParameter, "zeoskerr_invalidParameter", "so \"it\" is");
    EXPECT_EQ(status.code(), -52005);
    const Json text = Json::parse(status.text());
    EXPECT_EQ(text["error_constant"], "zeoskerr_invalidParameter");
    EXPECT_EQ(text["component"], "vantel-host");
    EXPECT_EQ(text["additionalInfo"], "so \"it\" is");
}

TEST(HostStatus, AFailureWithoutRoomForTextStillHasItsCode) {
    zeerr_Status without{0, 0, nullptr, nullptr};
    fail(without, memoryFull, "zeoskerr_memoryFull", "x");
    EXPECT_EQ(without.code, -52000);
    EXPECT_EQ(without.json, nullptr);
    zeerr_Status full{0, 0, noMemory, nullptr};
    fail(full, memoryFull, "zeoskerr_memoryFull", "x");
    EXPECT_EQ(full.code, -52000);
    EXPECT_EQ(full.json, nullptr);
}
