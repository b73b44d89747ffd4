// A program of its own: operator new is the one below, which can be told to fail.

#include "tGetDataFromPtp4l.h"

#include <cstdlib>
#include <cstring>
#include <filesystem>
#include <memory>
#include <new>

#include <gtest/gtest.h>

#include "support/FetcherTest.h"

namespace {

enum class Shortage { none, once, fromThenOn };

// Of one thread: the daemon goes on in another one.
thread_local Shortage shortage = Shortage::none;
thread_local int allocationsBefore = 0;
thread_local int refusals = 0;

bool refuses() {
    if (shortage == Shortage::none || allocationsBefore-- > 0) {
        return false;
    }
    if (shortage == Shortage::once) {
        shortage = Shortage::none;
    }
    ++refusals;
    return true;
}

void* allocate(std::size_t size) {
    return refuses() ? nullptr : std::malloc(size == 0 ? 1 : size);
}

void* allocateOrThrow(std::size_t size) {
    void* const memory = allocate(size);
    if (memory == nullptr) {
        throw std::bad_alloc();
    }
    return memory;
}

} // namespace

void* operator new(std::size_t size) {
    return allocateOrThrow(size);
}

void* operator new[](std::size_t size) {
    return allocateOrThrow(size);
}

void* operator new(std::size_t size, const std::nothrow_t& /*tag*/) noexcept {
    return allocate(size);
}

void* operator new[](std::size_t size, const std::nothrow_t& /*tag*/) noexcept {
    return allocate(size);
}

void operator delete(void* memory) noexcept {
    std::free(memory);
}

void operator delete[](void* memory) noexcept {
    std::free(memory);
}

void operator delete(void* memory, std::size_t /*size*/) noexcept {
    std::free(memory);
}

void operator delete[](void* memory, std::size_t /*size*/) noexcept {
    std::free(memory);
}

namespace {

class PtpFetchMemoryTest : public FetcherTest, public testing::WithParamInterface<Shortage> {
protected:
    /// One fetch during which memory runs out. @return whether it did.
    bool fetchWith(Shortage kind, int allocations, zekelVantel::tGetDataFromPtp4l& asked) {
        timeStatus = {};
        metaData = {};
        refusals = 0;
        allocationsBefore = allocations;
        shortage = kind;
        try {
            code = asked.fetch(timeStatus, metaData);
            shortage = Shortage::none;
        } catch (...) {
            shortage = Shortage::none;
            ADD_FAILURE() << "an exception left the fetch, after allocation " << allocations;
            code = 1;
        }
        return refusals > 0;
    }

    std::int32_t code = 0;
};

TEST_P(PtpFetchMemoryTest, EveryAllocationThatFailsIsMemoryFull) {
    daemon.setPorts(3);
    int allocations = 0;
    for (; fetchWith(GetParam(), allocations, fetcher); ++allocations) {
        EXPECT_EQ(code, -52000) << allocations;
        daemon.settle();
    }
    EXPECT_EQ(code, 0);
    EXPECT_GT(allocations, 3); // one for each list of ports, at least
    EXPECT_EQ(timeStatus.masterOffset, -42);
    EXPECT_NE(metaData, zekelVantel::tPtp4lMetaData());
}

TEST_P(PtpFetchMemoryTest, FailureThatFindsNoMemoryKeepsItsCode) {
    zekelVantel::tGetDataFromPtp4l lonely("./missing", 0);
    std::vector<std::int32_t> codes;
    for (int allocations = 0; fetchWith(GetParam(), allocations, lonely); ++allocations) {
        codes.push_back(code);
    }
    ASSERT_FALSE(codes.empty());
    EXPECT_EQ(codes.back(), -52024);
    for (const std::int32_t each : codes) {
        EXPECT_TRUE(each == -52024 || each == -52000) << each;
    }
    EXPECT_EQ(code, -52024);
}

TEST_P(PtpFetchMemoryTest, DestructionNeedsNoMemory) {
    auto another = std::make_unique<zekelVantel::tGetDataFromPtp4l>("./ptp4l_bc", 0);
    ASSERT_EQ(another->fetch(timeStatus, metaData), 0);
    refusals = 0;
    allocationsBefore = 0;
    shortage = GetParam();
    another.reset();
    shortage = Shortage::none;
    EXPECT_EQ(refusals, 0);
    EXPECT_FALSE(std::filesystem::exists(localPath));
}

std::string nameOf(const testing::TestParamInfo<Shortage>& kind) {
    return kind.param == Shortage::once ? "FailsOnce" : "IsGone";
}

INSTANTIATE_TEST_SUITE_P(Memory, PtpFetchMemoryTest,
                         testing::Values(Shortage::once, Shortage::fromThenOn), nameOf);

bool resizeWithoutMemory(zeerr::Status& status, std::uint32_t size) {
    allocationsBefore = 0;
    shortage = Shortage::fromThenOn;
    const bool hasSucceeded = zeerr::defaultResize(&status, size);
    shortage = Shortage::none;
    return hasSucceeded;
}

TEST(DefaultResizeMemoryTest, WithoutMemoryAFreshStatusStaysSo) {
    zeerr::LocalStatus status;
    EXPECT_FALSE(resizeWithoutMemory(status, 1));
    EXPECT_EQ(status.json, nullptr);
    EXPECT_EQ(status.capacity, 0U);
}

TEST(DefaultResizeMemoryTest, WithoutMemoryTheTextStays) {
    zeerr::LocalStatus status;
    ASSERT_TRUE(zeerr::defaultResize(&status, 512));
    std::strcpy(status.json, "{\"a\":1}");
    const char* const text = status.json;
    EXPECT_FALSE(resizeWithoutMemory(status, 513));
    EXPECT_EQ(status.json, text);
    EXPECT_EQ(status.capacity, 512U);
    EXPECT_STREQ(status.json, "{\"a\":1}");
}

} // namespace
