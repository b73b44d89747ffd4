#include "Callbacks.h"

#include <array>
#include <chrono>
#include <thread>

#include <fcntl.h>
#include <gmock/gmock.h>
#include <gtest/gtest.h>
#include <unistd.h>

#include <vantel_bc/zekel.h>

#include "EventPrinter.h"
#include "HostStatus.h"
#include "Tool.h"

using namespace vantelhost;

namespace {

constexpr std::array usable{2.5e-08, 1e-06, -1.0};

std::uint64_t now() {
    timespec time{};
    ::clock_gettime(CLOCK_REALTIME, &time);
    return static_cast<std::uint64_t>(time.tv_sec) * 1000000000U +
           static_cast<std::uint64_t>(time.tv_nsec);
}

class CallbacksTest : public testing::Test {
protected:
    ~CallbacksTest() override { ::close(file); }

    std::vector<Json> events() const { return Result{0, contentOf(path), {}}.events(); }

    /// Calls each function once, with statuses that begin with a code.
    /// @return the codes after the calls.
    std::vector<std::int32_t> callAll(void** context, std::int32_t code = 0) {
        std::array<HostStatus, 4> statuses;
        for (auto& each : statuses) {
            each.get()->code = code;
        }
        std::uint64_t time = 0;
        zekel_getTime(context, &time, statuses[0].get());
        zekel_adjustTime(context, 1, 2, statuses[1].get());
        zekel_setTRQuality(context, usable.data(), "r", statuses[2].get());
        zekel_updateMetaData(context, "{}", statuses[3].get());
        lastText = statuses[3].text();
        return {statuses[0].code(), statuses[1].code(), statuses[2].code(), statuses[3].code()};
    }

    Folder folder;
    std::string path = folder.path("out");
    int file = ::open(path.c_str(), O_WRONLY | O_CREAT | O_CLOEXEC | O_APPEND, 0600);
    Journal journal{EventPrinter(file, Format::jsonLines), [](const std::string&) {}};
    std::string lastText;
};

using Codes = std::vector<std::int32_t>;

} // namespace

TEST_F(CallbacksTest, CallsWithTheSlotAreTaken) {
    Callbacks callbacks(journal, false);
    EXPECT_EQ(callAll(callbacks.slot()), (Codes{0, 0, 0, 0}));
    EXPECT_TRUE(journal.isClean());
    EXPECT_EQ(journal.tally().timeRequests, 1U);
    EXPECT_EQ(journal.tally().offsets.count, 1U);
    EXPECT_EQ(journal.tally().qualityChanges, 1U);
    EXPECT_EQ(journal.tally().metadataUpdates, 1U);
}

TEST_F(CallbacksTest, WhatIsToldWhenASignalEndsTheRunIsExpectedButPairsCount) {
    Callbacks callbacks(journal, false, [] { return true; });
    EXPECT_EQ(callAll(callbacks.slot()), (Codes{0, 0, 0, 0}));
    const auto shown = events();
    ASSERT_EQ(shown.size(), 3U);
    EXPECT_EQ(shown[0]["event"], "pair");
    EXPECT_EQ(shown[1]["event"], "expected");
    EXPECT_EQ(shown[2]["event"], "expected");
    EXPECT_EQ(journal.tally().metadataUpdates, 0U);
}

TEST_F(CallbacksTest, TheTimeIsTheRealtimeClockInNanoseconds) {
    Callbacks callbacks(journal, false);
    HostStatus status;
    std::uint64_t time = 0;
    const auto before = now();
    zekel_getTime(callbacks.slot(), &time, status.get());
    EXPECT_GE(time, before);
    EXPECT_LE(time, now());
}

TEST_F(CallbacksTest, TheTimeIsThatOfAnotherClockWhereOneIsGiven) {
    Callbacks callbacks(
        journal, false, [] { return false; }, [] { return std::uint64_t{12345}; });
    HostStatus status;
    std::uint64_t time = 0;
    zekel_getTime(callbacks.slot(), &time, status.get());
    EXPECT_EQ(time, 12345U);
    EXPECT_EQ(journal.tally().timeRequests, 1U);
}

TEST_F(CallbacksTest, AnotherContextIsRefusedAndCounted) {
    Callbacks callbacks(journal, false);
    void* elsewhere = nullptr;
    EXPECT_EQ(callAll(&elsewhere), (Codes{-52005, -52005, -52005, -52005}));
    EXPECT_EQ(callAll(nullptr), (Codes{-52005, -52005, -52005, -52005}));
    EXPECT_EQ(journal.tally().errors, 8U);
    EXPECT_EQ(journal.tally().offsets.count, 0U);
    const Json text = Json::parse(lastText);
    EXPECT_EQ(text["error_constant"], "zeoskerr_invalidParameter");
    EXPECT_THAT(text["additionalInfo"], testing::HasSubstr("zekel_updateMetaData"));
}

TEST_F(CallbacksTest, NullDataAreRefusedAndCounted) {
    Callbacks callbacks(journal, false);
    std::array<HostStatus, 4> statuses;
    zekel_getTime(callbacks.slot(), nullptr, statuses[0].get());
    zekel_setTRQuality(callbacks.slot(), nullptr, "r", statuses[1].get());
    zekel_setTRQuality(callbacks.slot(), usable.data(), nullptr, statuses[2].get());
    zekel_updateMetaData(callbacks.slot(), nullptr, statuses[3].get());
    for (const auto& status : statuses) {
        EXPECT_EQ(status.code(), -52005);
    }
    EXPECT_EQ(journal.tally().errors, 4U);
}

TEST_F(CallbacksTest, ACallWithoutAStatusIsCounted) {
    Callbacks callbacks(journal, false);
    zekel_adjustTime(callbacks.slot(), 1, 2, nullptr);
    EXPECT_EQ(journal.tally().errors, 1U);
    EXPECT_EQ(journal.tally().offsets.count, 0U);
}

TEST_F(CallbacksTest, ACallWithAnErrorInItsStatusDoesNothing) {
    Callbacks callbacks(journal, false);
    EXPECT_EQ(callAll(callbacks.slot(), -7), (Codes{-7, -7, -7, -7}));
    EXPECT_TRUE(events().empty());
    EXPECT_TRUE(journal.isClean());
}

TEST_F(CallbacksTest, CallsAreTakenWhileStopping) {
    Callbacks callbacks(journal, false);
    callbacks.stoppingBegins();
    EXPECT_EQ(callAll(callbacks.slot()), (Codes{0, 0, 0, 0}));
}

TEST_F(CallbacksTest, CallsAreRefusedWhileStoppingIfAskedForAndThatIsNoError) {
    Callbacks callbacks(journal, true);
    EXPECT_EQ(callAll(callbacks.slot()), (Codes{0, 0, 0, 0}));
    callbacks.stoppingBegins();
    EXPECT_EQ(callAll(callbacks.slot()), (Codes{-52009, -52009, -52009, -52009}));
    EXPECT_TRUE(journal.isClean());
    EXPECT_EQ(journal.tally().refused, 4U);
}

TEST_F(CallbacksTest, WithoutASessionEveryCallIsRefused) {
    void* slot = nullptr;
    EXPECT_EQ(callAll(&slot), (Codes{-52005, -52005, -52005, -52005}));
    EXPECT_EQ(callAll(&slot, -7), (Codes{-7, -7, -7, -7}));
}

TEST_F(CallbacksTest, CallsFromSeveralThreadsAreAllTakenAndTheirLinesAreWhole) {
    Callbacks callbacks(journal, false);
    const auto work = [&] {
        for (int i = 0; i < 200; ++i) {
            callAll(callbacks.slot());
        }
    };
    // lastText is shared: these threads have their own.
    const auto pairs = [&] {
        for (std::uint64_t i = 0; i < 400; ++i) {
            HostStatus status;
            zekel_adjustTime(callbacks.slot(), i, i + 3, status.get());
        }
    };
    std::thread first(pairs);
    std::thread second(pairs);
    work();
    first.join();
    second.join();
    EXPECT_EQ(journal.tally().offsets.count, 1000U);
    EXPECT_EQ(events().size(), 1000U + 200U + 200U + 1U) << "one tells that it is locked";
    EXPECT_TRUE(journal.isClean());
}
