#include <cstddef>
#include <type_traits>

#include <gtest/gtest.h>

#include <vantel_bc/status.h>

namespace {

constexpr bool narrow = sizeof(void*) == 4;

static_assert(std::is_same_v<zeerr_Status, zeerr::Status>, "one record, two names");
static_assert(std::is_standard_layout_v<zeerr::Status>, "as C lays it out");
static_assert(std::is_trivial_v<zeerr::Status>, "a plain record");

TEST(StatusLayoutTest, HasFourFieldsInOrder) {
    EXPECT_EQ(offsetof(zeerr::Status, code), 0U);
    EXPECT_EQ(offsetof(zeerr::Status, capacity), 4U);
    EXPECT_EQ(offsetof(zeerr::Status, resize), 8U);
    EXPECT_EQ(offsetof(zeerr::Status, json), narrow ? 12U : 16U);
}

TEST(StatusLayoutTest, Has24OctetsOr16WithNarrowPointers) {
    EXPECT_EQ(sizeof(zeerr::Status), narrow ? 16U : 24U);
    EXPECT_EQ(alignof(zeerr::Status), narrow ? 4U : 8U);
}

TEST(StatusLayoutTest, FieldsHaveTheirTypes) {
    EXPECT_TRUE((std::is_same_v<decltype(zeerr::Status::code), std::int32_t>));
    EXPECT_TRUE((std::is_same_v<decltype(zeerr::Status::capacity), std::uint32_t>));
    EXPECT_TRUE((std::is_same_v<decltype(zeerr::Status::json), char*>));
    EXPECT_TRUE(
        (std::is_same_v<decltype(zeerr::Status::resize), bool (*)(zeerr::Status*, std::uint32_t)>));
}

} // namespace
