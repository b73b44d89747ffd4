// What goes wrong on the plug-in's side.

#include "Tool.h"
#include "support/Child.h"

using testing::Contains;
using testing::ElementsAre;
using testing::HasSubstr;
using testing::StartsWith;

namespace {

Result runWith(const std::string& library, const std::vector<std::string>& environment = {}) {
    Child child(
        {HOST_TOOL, "run", "--json", "--library", library, "--interface", "eth0", "--seconds", "0"},
        environment);
    const int status = child.wait();
    return {status, child.output(), child.errors()};
}

} // namespace

TEST_F(ToolTest, AnInitialiseThatFailsEndsTheRunWithoutStart) {
    const auto result = play("initialise-fails");
    EXPECT_EQ(result.status, 1);
    const auto errors = result.events("error");
    ASSERT_EQ(errors.size(), 1U);
    EXPECT_EQ(errors[0]["operation"], "initialize");
    EXPECT_EQ(errors[0]["code"], -52005);
    EXPECT_EQ(errors[0]["status"]["additionalInfo"], "no \nsuch thing");
    EXPECT_THAT(record(), ElementsAre(StartsWith("initialise "), "blocked yes"));
    EXPECT_EQ(result.events("summary").at(0)["errors"], 1);
}

TEST_F(ToolTest, AReadableErrorNamesConstantPlaceAndInfo) {
    const auto result =
        run({"--interface", "eth0", "--seconds", "0", "--set", "script=initialise-fails"});
    EXPECT_THAT(result.output, HasSubstr("error        initialize: code -52005, "
                                         "zeoskerr_invalidParameter at fake:7: no \\x0Asuch"));
}

TEST_F(ToolTest, AStartThatFailsIsStoppedAndFinalised) {
    const auto result = play("start-fails");
    EXPECT_EQ(result.status, 1);
    EXPECT_EQ(result.events("error").at(0)["status"], "not JSON");
    EXPECT_EQ(result.events("stopping").at(0)["cause"], "start failed");
    EXPECT_TRUE(result.events("started").empty());
    EXPECT_THAT(record(),
                ElementsAre(StartsWith("initialise "), "blocked yes", "start", "stop", "finalise"));
}

TEST_F(ToolTest, AWarningIsShownAndTheRunStaysClean) {
    const auto result = play("initialise-warns");
    EXPECT_EQ(result.status, 0);
    EXPECT_EQ(result.events("warning").at(0)["code"], 3);
}

TEST_F(ToolTest, AWrongContextIsRefusedAndMakesTheRunUnclean) {
    const auto result = play("wrong-context");
    EXPECT_EQ(result.status, 1);
    EXPECT_THAT(result.events("error").at(0)["problem"], HasSubstr("unknown context"));
    EXPECT_THAT(record(), Contains(StartsWith("answer time -52005 {")));
}

TEST_F(ToolTest, NullDataAreRefusedAndMakeTheRunUnclean) {
    EXPECT_EQ(play("null-data").status, 1);
    EXPECT_THAT(record(), Contains(StartsWith("answer metadata -52005 {")));
}

TEST_F(ToolTest, MetadataThatIsNotJsonMakesTheRunUnclean) {
    const auto result = play("bad-metadata");
    EXPECT_EQ(result.status, 1);
    const auto events = result.events("metadata");
    ASSERT_EQ(events.size(), 1U);
    EXPECT_EQ(events[0]["valid"], false);
    EXPECT_EQ(events[0]["text"], "{\"gmClockId\":");
}

TEST_F(ToolTest, AnotherApiVersionIsRefused) {
    const auto result = runWith(FAKE_PLUGIN_VERSION3);
    EXPECT_EQ(result.status, 2);
    EXPECT_THAT(result.errors, HasSubstr("has API version 3, this host needs 2"));
    EXPECT_EQ(result.output, "");
}

TEST_F(ToolTest, ALibraryWithoutAFunctionIsRefused) {
    const auto result = runWith(FAKE_PLUGIN_INCOMPLETE);
    EXPECT_EQ(result.status, 2);
    EXPECT_THAT(result.errors, HasSubstr("it has no zekeltr_stop"));
}

TEST_F(ToolTest, ALibraryThatIsNotThereIsRefused) {
    const auto result = runWith(folder.path("none.so"));
    EXPECT_EQ(result.status, 2);
    EXPECT_THAT(result.errors, HasSubstr("cannot load the plug-in: " + folder.path("none.so")));
}

TEST_F(ToolTest, ASchemaThatIsRefusedOrMakesNoSenseEndsTheRun) {
    for (const char* schema : {"fails", "", "[]", R"({"a":{"dataType":"int"}})"}) {
        const auto result = runWith(FAKE_PLUGIN, {std::string("FAKE_SCHEMA=") + schema});
        EXPECT_EQ(result.status, 1) << schema;
        EXPECT_EQ(result.events("error").at(0)["operation"], "getParameterValidationData");
        EXPECT_TRUE(result.events("initialised").empty());
    }
}
