#include <algorithm>
#include <array>
#include <filesystem>
#include <iterator>

#include "PluginFixture.h"

namespace {

using EntryPointsTest = PluginFixture;

std::ptrdiff_t openDescriptors() {
    return std::distance(std::filesystem::directory_iterator("/proc/self/fd"),
                         std::filesystem::directory_iterator());
}

TEST_F(EntryPointsTest, ApiVersionIsTwo) {
    EXPECT_EQ(plugin().getAPIVersion(), 2U);
    EXPECT_EQ(ZEKELTR_API_VERSION, 2);
}

TEST_F(EntryPointsTest, NameFillsItsEighteenOctetsAndNoOthers) {
    constexpr std::size_t canaries = 16;
    std::array<char, canaries + 18 + canaries> memory{};
    memory.fill('\xa5');
    plugin().getName(memory.data() + canaries);
    EXPECT_EQ(std::string(memory.data() + canaries, 18), std::string("IEEE 1588-2008 BC\0", 18));
    EXPECT_EQ(std::string(memory.data(), canaries), std::string(canaries, '\xa5'));
    EXPECT_EQ(std::string(memory.data() + canaries + 18, canaries), std::string(canaries, '\xa5'));
    EXPECT_EQ(ZEKELTR_NAME_SIZE, 18);
}

TEST_F(EntryPointsTest, FinalizeOfAnEmptySlotDoesNothing) {
    void* slot = nullptr;
    EXPECT_NO_THROW(plugin().finalize(&slot));
    EXPECT_EQ(slot, nullptr);
}

TEST_F(EntryPointsTest, FinalizeLeavesTheSlotAsItIs) {
    void* slot = nullptr;
    HostStatus status;
    plugin().initialize(&slot, configuration().c_str(), &status);
    void* const session = slot;
    ASSERT_NE(session, nullptr);
    plugin().finalize(&slot);
    EXPECT_EQ(slot, session);
}

TEST_F(EntryPointsTest, SessionsStandSideBySide) {
    void* slots[2] = {};
    for (void*& slot : slots) {
        HostStatus status;
        plugin().initialize(&slot, configuration().c_str(), &status);
        ASSERT_EQ(status.code, 0);
    }
    EXPECT_NE(slots[0], slots[1]);
    for (void*& slot : slots) {
        plugin().finalize(&slot);
    }
}

TEST_F(EntryPointsTest, ThousandSessionsLeaveNoDescriptorBehind) {
    const auto before = openDescriptors();
    for (int session = 0; session < 1000; ++session) {
        void* slot = nullptr;
        HostStatus status;
        plugin().initialize(&slot, configuration().c_str(), &status);
        ASSERT_EQ(status.code, 0);
        ASSERT_NE(slot, nullptr);
        plugin().finalize(&slot);
    }
    EXPECT_EQ(openDescriptors(), before);
    EXPECT_TRUE(log.lines().empty());
}

} // namespace
