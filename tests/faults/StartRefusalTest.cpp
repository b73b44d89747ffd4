// A host that refuses its part of start.

#include <cstring>
#include <new>
#include <ostream>
#include <stdexcept>

#include <gmock/gmock.h>

#include "FaultTest.h"

namespace {

using testing::IsEmpty;

/// What a host does in its part of start, and what start then says.
struct Refusal {
    const char* name;
    RecordingHost::Reaction reaction;
    std::int32_t code;
    const char* text;
};

void PrintTo(const Refusal& refusal, std::ostream* out) {
    *out << refusal.name;
}

class StartRefusalTest : public FaultTest, public testing::WithParamInterface<Refusal> {
protected:
    /// Starts with a host that refuses one function, and expects that nothing runs.
    void expectRefused(Function function) {
        SimulatedDaemon::script("gm absent\n");
        session.initialise();
        host.onCall([=](const RecordingHost::Call& call, zeerr_Status& status) {
            if (call.function == function) {
                GetParam().reaction(call, status);
            }
        });
        HostStatus status;
        EXPECT_NO_THROW(session.start(status));
        EXPECT_EQ(status.code, GetParam().code);
        EXPECT_EQ(status.text(), GetParam().text);
        EXPECT_FALSE(hasChildren());
        expectOwnThreads(0);
        EXPECT_THAT(SimulatedDaemon::events(), IsEmpty());
        expectStopWithin({0, false});
    }
};

TEST_P(StartRefusalTest, OfTheFirstMetadataAbortsStart) {
    expectRefused(Function::updateMetaData);
    EXPECT_EQ(host.calls().size(), 1U);
}

TEST_P(StartRefusalTest, OfTheFirstQualityAbortsStart) {
    expectRefused(Function::setTRQuality);
    EXPECT_EQ(host.calls().size(), 2U);
}

const Refusal refusals[] = {
    {"StoppingWithText",
     [](const RecordingHost::Call&, zeerr_Status& status) {
         status.code = -52009;
         ASSERT_TRUE(status.resize(&status, 32));
         std::strcpy(status.json, R"({"host":"going down"})");
     },
     -52009, R"({"host":"going down"})"},
    {"ErrorWithoutText", [](const RecordingHost::Call&, zeerr_Status& status) { status.code = -1; },
     -1, ""},
    {"StandardException",
     [](const RecordingHost::Call&, zeerr_Status&) { throw std::runtime_error("no \"way\""); },
     -52003,
     R"({"error_constant":"zeoskerr_softwareFaultOSKInternalUseOnly",)"
     R"("file":"exception_errStatus","line":69,"component":"vantel_bc",)"
     R"("std_exception_what":"no \"way\""})"},
    {"OtherException", [](const RecordingHost::Call&, zeerr_Status&) { throw 42; }, -52003,
     R"({"error_constant":"zeoskerr_softwareFaultOSKInternalUseOnly",)"
     R"("file":"exception_errStatus","line":74,"component":"vantel_bc"})"},
    {"NoMemory", [](const RecordingHost::Call&, zeerr_Status&) { throw std::bad_alloc(); }, -52000,
     R"({"error_constant":"zeoskerr_memoryFull","file":"exception_errStatus","line":62,)"
     R"("component":"vantel_bc","std_exception_what":"std::bad_alloc"})"},
};

INSTANTIATE_TEST_SUITE_P(Hosts, StartRefusalTest, testing::ValuesIn(refusals),
                         [](const auto& testInfo) { return testInfo.param.name; });

} // namespace
