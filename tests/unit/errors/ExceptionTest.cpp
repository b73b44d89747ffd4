#include "errors/Exception.h"

#include <string>
#include <type_traits>

#include <gtest/gtest.h>

#include "ResizeOperations.h"

namespace {

constexpr char text[] = R"({"a":1})";

void fill(zeerr::Status& status, std::int32_t code) {
    ASSERT_TRUE(zeerr::resize(status, sizeof(text)));
    std::strcpy(status.json, text);
    status.code = code;
}

static_assert(!std::is_base_of_v<std::exception, zeerr::ExceptionBase>,
              "the base stands on its own");
static_assert(std::is_nothrow_copy_constructible_v<zeerr::Exception>,
              "copying while unwinding must not throw");

TEST(ExceptionTest, WhatIsEmptyWithoutAText) {
    zeerr::LocalStatus status;
    status.code = -1;
    const zeerr::Exception exception(status);
    EXPECT_STREQ(exception.what(), "");
}

TEST(ExceptionTest, WhatIsTheTextForEveryCatcher) {
    const auto raise = [] {
        zeerr::LocalStatus status;
        fill(status, -52005);
        throw zeerr::Exception(status);
    };
    try {
        raise();
        FAIL() << "nothing thrown";
    } catch (const std::exception& exception) {
        EXPECT_STREQ(exception.what(), text);
    }
    try {
        raise();
        FAIL() << "nothing thrown";
    } catch (const zeerr::ExceptionBase& exception) {
        EXPECT_STREQ(exception.what(), text);
    }
}

TEST(ExceptionTest, TakesTheTextOverFromTheDefaultOperation) {
    zeerr::LocalStatus status;
    fill(status, -52005);
    const char* const address = status.json;
    zeerr::Exception exception(status);
    EXPECT_EQ(exception.status().code, -52005);
    EXPECT_EQ(exception.status().json, address);
    EXPECT_EQ(status.json, nullptr);
    EXPECT_EQ(status.capacity, 0U);
}

TEST(ExceptionTest, CopiesTheTextFromAnotherOperation) {
    HostStatus status(&countingResize);
    fill(status, -52005);
    zeerr::Exception exception(status);
    EXPECT_STREQ(exception.what(), text);
    EXPECT_STREQ(status.json, text);
    EXPECT_NE(exception.status().json, status.json);
    EXPECT_EQ(exception.status().resize, &zeerr::defaultResize);
}

TEST(ExceptionTest, CopyLeavesBothWithATextOfTheirOwn) {
    zeerr::LocalStatus status;
    fill(status, -52005);
    zeerr::Exception original(status);
    {
        zeerr::Exception copy(original);
        EXPECT_EQ(copy.status().code, -52005);
        EXPECT_STREQ(copy.what(), text);
        EXPECT_NE(copy.what(), original.what());
        copy.status().json[0] = '!';
    }
    EXPECT_EQ(original.status().code, -52005);
    EXPECT_STREQ(original.what(), text);
}

TEST(ExceptionTest, ReleasesItsTextThroughTheStatusOwnOperation) {
    requestedSizes.clear();
    {
        zeerr::LocalStatus status;
        status.code = -1;
        zeerr::Exception exception(status);
        exception.status().resize = &countingResize;
        ASSERT_TRUE(zeerr::resize(exception.status(), 8));
    }
    EXPECT_EQ(requestedSizes, (std::vector<std::uint32_t>{8, 0}));
}

} // namespace
