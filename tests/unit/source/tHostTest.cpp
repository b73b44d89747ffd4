#include "tHost.h"

#include <cstring>
#include <stdexcept>
#include <string>

#include <gtest/gtest.h>

#include "errors/Exception.h"
#include "support/RecordingHost.h"
#include "unit/errors/ResizeOperations.h"

using zekelVantel::tHost;
using zekelVantel::tQuality;

namespace {

using Function = RecordingHost::Function;

class HostTest : public testing::Test {
protected:
    RecordingHost recorder;
    void* slot = nullptr;
    tHost host{&slot};
};

/// Calls the host while an exception unwinds.
struct Unwinding {
    tHost& host;
    ~Unwinding() { host.updateMetaData("{}"); }
};

std::uint64_t bits(double value) {
    std::uint64_t pattern = 0;
    std::memcpy(&pattern, &value, sizeof(pattern));
    return pattern;
}

TEST_F(HostTest, EveryCallGetsTheContextAndAFreshStatus) {
    host.getTime();
    host.adjustTime(1, 2);
    host.setQuality(tQuality::usable, "why");
    host.updateMetaData("{}");
    const auto calls = recorder.calls();
    ASSERT_EQ(calls.size(), 4U);
    for (const auto& call : calls) {
        EXPECT_EQ(call.context, &slot);
        EXPECT_EQ(call.codeOnEntry, 0);
        EXPECT_FALSE(call.textOnEntry);
    }
}

TEST_F(HostTest, TimeIsZeroedBeforeTheHostFillsIt) {
    recorder.setTime(0xFEDCBA9876543210U);
    EXPECT_EQ(host.getTime(), 0xFEDCBA9876543210U);
    EXPECT_EQ(recorder.calls().at(0).timeOnEntry, 0U);
}

TEST_F(HostTest, AdjustTimePassesReferenceBeforeLocal) {
    host.adjustTime(0xFFFFFFFFFFFFFFFFU, 7);
    EXPECT_EQ(recorder.calls().at(0).referenceTime, 0xFFFFFFFFFFFFFFFFU);
    EXPECT_EQ(recorder.calls().at(0).localTime, 7U);
}

TEST_F(HostTest, QualitiesHaveTheirExactBitPatterns) {
    host.setQuality(tQuality::usable, "PTP role has changed.");
    host.setQuality(tQuality::unusable, "Waiting for ptp4l status");
    const auto calls = recorder.calls(Function::setTRQuality);
    ASSERT_EQ(calls.size(), 2U);
    EXPECT_EQ(bits(calls[0].quality[0]), 0x3E5AD7F29ABCAF48U);
    EXPECT_EQ(bits(calls[0].quality[1]), 0x3EB0C6F7A0B5ED8DU);
    EXPECT_EQ(bits(calls[0].quality[2]), 0xBFF0000000000000U);
    EXPECT_EQ(calls[0].text, "PTP role has changed.");
    EXPECT_EQ(bits(calls[1].quality[0]), 0xC000000000000000U);
    EXPECT_EQ(bits(calls[1].quality[1]), 0xC000000000000000U);
    EXPECT_EQ(bits(calls[1].quality[2]), 0xBFF0000000000000U);
    EXPECT_EQ(calls[1].text, "Waiting for ptp4l status");
}

TEST_F(HostTest, NegativeCodeIsThrownWithTheHostsText) {
    recorder.onCall([](const RecordingHost::Call&, zeerr_Status& status) {
        status.code = -52009;
        ASSERT_TRUE(status.resize(&status, 16));
        std::strcpy(status.json, "{\"a\":1}");
    });
    try {
        host.updateMetaData("{}");
        FAIL() << "nothing thrown";
    } catch (zeerr::Exception& exception) {
        EXPECT_EQ(exception.status().code, -52009);
        EXPECT_STREQ(exception.what(), "{\"a\":1}");
    }
}

TEST_F(HostTest, PositiveCodeIsNoError) {
    recorder.onCall([](const RecordingHost::Call&, zeerr_Status& status) { status.code = 1; });
    EXPECT_NO_THROW(host.adjustTime(1, 2));
}

TEST_F(HostTest, NothingIsThrownWhileAnotherExceptionUnwinds) {
    recorder.onCall([](const RecordingHost::Call&, zeerr_Status& status) { status.code = -1; });
    try {
        const Unwinding unwinding{host};
        throw 42;
    } catch (int value) {
        EXPECT_EQ(value, 42);
    }
    EXPECT_EQ(recorder.calls().size(), 1U);
}

class HostTextTest : public HostTest {
protected:
    /// The host puts a resize operation and a text of its own into the status, and then goes on.
    void answer(std::int32_t code, const RecordingHost::Reaction& goOn = nullptr) {
        recorder.onCall([=](const RecordingHost::Call& call, zeerr_Status& status) {
            ASSERT_EQ(status.json, nullptr);
            status.resize = &countingResize;
            ASSERT_TRUE(status.resize(&status, 16));
            std::strcpy(status.json, "{\"a\":1}");
            status.code = code;
            requestedSizes.clear();
            if (goOn) {
                goOn(call, status);
            }
        });
    }

    static void expectReleasedOnce() {
        EXPECT_EQ(requestedSizes, std::vector<std::uint32_t>{0});
        requestedSizes.clear();
    }
};

TEST_F(HostTextTest, IsReleasedOnceAfterSuccess) {
    answer(0);
    host.getTime();
    expectReleasedOnce();
    host.adjustTime(1, 2);
    expectReleasedOnce();
    host.setQuality(tQuality::usable, "why");
    expectReleasedOnce();
    host.updateMetaData("{}");
    expectReleasedOnce();
}

TEST_F(HostTextTest, IsReleasedOnceAfterAWarning) {
    answer(7);
    EXPECT_NO_THROW(host.adjustTime(1, 2));
    expectReleasedOnce();
}

TEST_F(HostTextTest, IsReleasedOnceAfterAnErrorAndTheExceptionHasACopy) {
    answer(-52009);
    try {
        host.setQuality(tQuality::unusable, "why");
        FAIL() << "nothing thrown";
    } catch (zeerr::Exception& exception) {
        expectReleasedOnce();
        EXPECT_EQ(exception.status().code, -52009);
        EXPECT_STREQ(exception.what(), "{\"a\":1}");
    }
    EXPECT_TRUE(requestedSizes.empty());
}

TEST_F(HostTextTest, IsReleasedOnceAfterACallbackThatThrows) {
    for (const std::int32_t code : {0, 7, -1}) {
        answer(code, [](const RecordingHost::Call&, zeerr_Status&) { throw 42; });
        EXPECT_THROW(host.updateMetaData("{}"), int);
        expectReleasedOnce();
    }
}

TEST_F(HostTextTest, IsReleasedOnceWhileAnotherExceptionUnwinds) {
    for (const std::int32_t code : {0, 7, -1}) {
        answer(code);
        try {
            const Unwinding unwinding{host};
            throw std::runtime_error("other");
        } catch (const std::runtime_error& exception) {
            expectReleasedOnce();
            EXPECT_STREQ(exception.what(), "other");
        }
    }
}

TEST_F(HostTextTest, IsReleasedOnceThoughThereIsNone) {
    recorder.onCall([](const RecordingHost::Call&, zeerr_Status& status) {
        status.resize = &countingResize;
        requestedSizes.clear();
    });
    host.getTime();
    expectReleasedOnce();
}

TEST_F(HostTest, ExceptionOfACallbackArrivesAsItIs) {
    recorder.onCall([](const RecordingHost::Call&, zeerr_Status& status) {
        status.code = -1;
        throw std::runtime_error("of the host");
    });
    for (const bool quality : {false, true}) {
        try {
            quality ? host.setQuality(tQuality::usable, "why") : host.adjustTime(1, 2);
            FAIL() << "nothing thrown";
        } catch (const std::runtime_error& exception) {
            EXPECT_STREQ(exception.what(), "of the host");
        }
    }
}

TEST_F(HostTest, CallAfterAnExceptionOfACallbackIsLikeAnyOther) {
    recorder.onCall([](const RecordingHost::Call&, zeerr_Status& status) {
        status.code = -1;
        throw std::runtime_error("of the host");
    });
    EXPECT_THROW(host.getTime(), std::runtime_error);
    recorder.onCall(nullptr);
    recorder.setTime(7);
    EXPECT_EQ(host.getTime(), 7U);
    const auto calls = recorder.calls();
    ASSERT_EQ(calls.size(), 2U);
    EXPECT_EQ(calls[1].context, &slot);
    EXPECT_EQ(calls[1].codeOnEntry, 0);
    EXPECT_FALSE(calls[1].textOnEntry);
}

} // namespace
