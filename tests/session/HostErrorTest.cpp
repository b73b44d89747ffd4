#include <atomic>
#include <cstring>
#include <memory>
#include <new>
#include <ostream>
#include <stdexcept>

#include <gmock/gmock.h>
#include <syslog.h>

#include "SessionFixture.h"

namespace {

using testing::ElementsAreArray;
using Function = RecordingHost::Function;

const std::string unableToCall = "Unable to call into KEL in vantel, got error: ";

/// What a host does wrong, and what the log then says.
struct Misdeed {
    RecordingHost::Reaction reaction;
    SyslogCapture::Line line;
};

void setText(zeerr_Status& status, const char* text) {
    ASSERT_TRUE(status.resize(&status, 64));
    std::strcpy(status.json, text);
}

const Misdeed misdeeds[] = {
    {[](const RecordingHost::Call&, zeerr_Status& status) { status.code = -52009; },
     {LOG_INFO, "KEL is stopping, ignoring the error: -52009"}},
    {[](const RecordingHost::Call&, zeerr_Status& status) {
         status.code = -52009;
         setText(status, R"({"host":"going down"})");
     },
     {LOG_INFO, "KEL is stopping, ignoring the error: -52009"}},
    {[](const RecordingHost::Call&, zeerr_Status& status) { status.code = -1; },
     {LOG_ERR, unableToCall + "-1"}},
    {[](const RecordingHost::Call&, zeerr_Status& status) {
         status.code = INT32_MIN;
         setText(status, "no JSON at all");
     },
     {LOG_ERR, unableToCall + "-2147483648"}},
    {[](const RecordingHost::Call&, zeerr_Status&) { throw std::runtime_error("no"); },
     {LOG_ERR, unableToCall + "-52003"}},
    {[](const RecordingHost::Call&, zeerr_Status&) { throw 42; },
     {LOG_ERR, unableToCall + "-52003"}},
    {[](const RecordingHost::Call&, zeerr_Status&) { throw std::bad_alloc(); },
     {LOG_ERR, unableToCall + "-52000"}},
};

/// The worker's calls in a pass in which a function of the host fails.
struct FailingPass {
    const char* name;
    Function function;
    std::vector<Function> calls;
};

void PrintTo(const FailingPass& pass, std::ostream* out) {
    *out << pass.name;
}

class HostErrorTest : public SessionTest, public testing::WithParamInterface<FailingPass> {
protected:
    HostErrorTest() {
        const auto next = std::make_shared<std::atomic<std::size_t>>(0);
        const auto starter = std::this_thread::get_id();
        host.onCall([=](const RecordingHost::Call& call, zeerr_Status& status) {
            if (call.function != GetParam().function || call.thread == starter) {
                return;
            }
            if (const std::size_t at = (*next)++; at < std::size(misdeeds)) {
                misdeeds[at].reaction(call, status);
            }
        });
    }
};

// What failed is reported again in the next pass: role, measurement and metadata are still news.
TEST_P(HostErrorTest, EndsThePassAndIsForgotten) {
    begin("clock fixed 1000\n");
    const std::size_t passes = std::size(misdeeds);
    ASSERT_TRUE(waitForCalls(Function::updateMetaData,
                             GetParam().function == Function::updateMetaData ? passes + 2 : 2));
    session.stop();

    std::vector<Function> expected = {Function::updateMetaData, Function::setTRQuality};
    for (std::size_t pass = 0; pass < passes; ++pass) {
        expected.insert(expected.end(), GetParam().calls.begin(), GetParam().calls.end());
    }
    for (const Function function : {Function::getTime, Function::setTRQuality, Function::adjustTime,
                                    Function::updateMetaData}) {
        expected.push_back(function);
    }
    std::vector<Function> functions;
    for (const auto& call : host.calls()) {
        functions.push_back(call.function);
    }
    ASSERT_GE(functions.size(), expected.size());
    functions.resize(expected.size());
    EXPECT_THAT(functions, ElementsAreArray(expected));
}

TEST_P(HostErrorTest, IsLoggedByItsCode) {
    begin("clock fixed 1000\n");
    ASSERT_TRUE(waitForLog(unableToCall + "-52000"));
    std::vector<SyslogCapture::Line> lines;
    for (const auto& line : log.lines()) {
        if (line.text.rfind("update Meta Data: ", 0) != 0) {
            lines.push_back(line);
        }
    }
    std::vector<SyslogCapture::Line> expected;
    for (const Misdeed& misdeed : misdeeds) {
        expected.push_back(misdeed.line);
    }
    EXPECT_THAT(lines, ElementsAreArray(expected));
}

const FailingPass failingPasses[] = {
    {"GetTime", Function::getTime, {Function::getTime}},
    {"SetTRQuality", Function::setTRQuality, {Function::getTime, Function::setTRQuality}},
    {"AdjustTime",
     Function::adjustTime,
     {Function::getTime, Function::setTRQuality, Function::adjustTime}},
    {"UpdateMetaData",
     Function::updateMetaData,
     {Function::getTime, Function::setTRQuality, Function::adjustTime, Function::updateMetaData}},
};

INSTANTIATE_TEST_SUITE_P(Functions, HostErrorTest, testing::ValuesIn(failingPasses),
                         [](const auto& testInfo) { return testInfo.param.name; });

using HostWarningTest = SessionTest;

TEST_F(HostWarningTest, IsNoError) {
    host.onCall([](const RecordingHost::Call&, zeerr_Status& status) { status.code = 52009; });
    begin("clock fixed 1000\n");
    ASSERT_TRUE(waitForCalls(Function::getTime, 3));
    EXPECT_EQ(qualities().size(), 2U);
    EXPECT_EQ(host.calls(Function::adjustTime).size(), 1U);
    EXPECT_EQ(metaData().size(), 2U);
    EXPECT_EQ(log.lines().size(), 2U);
}

} // namespace
