// The command "check", with the fake plug-in and a fake daemon; and the plug-in with linuxptp's
// ptp4l.

#include <sys/stat.h>
#include <unistd.h>

#include "Tool.h"
#include "support/Child.h"

using testing::AllOf;
using testing::HasSubstr;
using testing::IsEmpty;
using testing::StartsWith;
using vantelhost::Json;

namespace {

constexpr char realDaemon[] = "/usr/sbin/ptp4l";

class ToolCheckTest : public testing::Test {
protected:
    /// A plug-in whose file has the given content.
    std::string schema(const std::string& content) const {
        const auto text = [](const std::string& value) {
            return Json{{"dataType", "string"}, {"default", value}};
        };
        return "FAKE_SCHEMA=" + Json{{"configFile", text(folder.path("ptp4l.conf"))},
                                     {"udsAddress", text(folder.path("uds"))},
                                     {"content", text(content)},
                                     {"script", text("")},
                                     {"record", text(folder.path("record"))},
                                     {"fifo", text("")}}
                                    .dump();
    }

    Result check(const Words& options, const std::string& content = "[global]\n") const {
        Words words{HOST_TOOL,         "check",
                    "--ptp4l",         folder.path("ptp4l"),
                    "--socket-prefix", folder.path("own."),
                    "--fifo",          folder.path("fifo")};
        words.insert(words.end(), options.begin(), options.end());
        Child child(words, {schema(content)});
        const int status = child.wait();
        return {status, child.output(), child.errors()};
    }

    void installDaemon(const std::string& script) const {
        writeFile(folder.path("ptp4l"), "#!/bin/sh\n" + script + "\n");
        ::chmod(folder.path("ptp4l").c_str(), 0755);
    }

    /// The result of one check; null when there is none.
    static Json of(const Result& result, const std::string& name) {
        const Json output = Json::parse(result.output);
        for (const auto& check : output["checks"]) {
            if (check["check"] == name) {
                return check;
            }
        }
        return nullptr;
    }

    const Folder folder;
};

/// Without interfaces, capabilities alone depend on the machine.
const Words goodMachine{"--library", FAKE_PLUGIN, "--no-interfaces", "--create-fifo", "--json"};

Words with(Words words, const Words& more) {
    words.insert(words.end(), more.begin(), more.end());
    return words;
}

} // namespace

TEST_F(ToolCheckTest, WhatHoldsIsOk) {
    installDaemon("echo no interface specified");
    const auto result = check(goodMachine);
    for (const char* name : {"plug-in", "schema", "settings", "initialise", "daemon",
                             "configuration", "configFile", "udsAddress", "udsAddress folder",
                             "udsAddress in use", "plug-in's socket", "epoch FIFO"}) {
        EXPECT_EQ(of(result, name)["result"], "ok") << of(result, name);
    }
    EXPECT_EQ(of(result, "plug-in")["found"],
              std::string("\"Fake time referen\", API version 2, ") + FAKE_PLUGIN);
    EXPECT_EQ(result.errors, "");
}

TEST_F(ToolCheckTest, TheStatusFollowsFromTheChecks) {
    installDaemon("echo no interface specified");
    const auto result = check(goodMachine);
    const bool isCapable = of(result, "capabilities")["result"] != "fail";
    EXPECT_EQ(result.status, isCapable ? 0 : 1);
    EXPECT_EQ(Json::parse(result.output)["passed"], isCapable);
    installDaemon("echo no");
    EXPECT_EQ(check(goodMachine).status, 1);
}

TEST_F(ToolCheckTest, ALineForPeopleSaysHowToMend) {
    const auto result = check({"--library", FAKE_PLUGIN, "--interface", "none0"});
    EXPECT_EQ(result.status, 1);
    EXPECT_THAT(result.output,
                AllOf(StartsWith("ok    plug-in              \"Fake time referen\""),
                      HasSubstr("\nFAIL  daemon               " + folder.path("ptp4l") +
                                ": No such file or directory -- mend: "),
                      HasSubstr("\nFAIL  interface none0      No such device -- mend: "),
                      HasSubstr("\nskip  time stamping none0  ")));
}

TEST_F(ToolCheckTest, ThePlugInIsNotStartedAndNothingIsLeftBehind) {
    const std::string temporary = folder.path("temporary");
    ::mkdir(temporary.c_str(), 0755);
    installDaemon("cp \"$2\" " + folder.path("seen") + "; echo no interface specified");
    Child child({HOST_TOOL, "check", "--library", FAKE_PLUGIN, "--no-interfaces", "--ptp4l",
                 folder.path("ptp4l"), "--fifo", folder.path("fifo"), "--create-fifo"},
                {schema("[global]\nkey value\n"), "TMPDIR=" + temporary});
    child.wait();
    EXPECT_EQ(contentOf(folder.path("seen")), "[global]\nkey value\n");
    EXPECT_THAT(contentOf(folder.path("record")),
                AllOf(StartsWith("initialise {\"configFile\":\"" + temporary + "/vantel-host."),
                      HasSubstr(",\"udsAddress\":\"" + temporary + "/vantel-host."),
                      testing::EndsWith("\nfinalise\n"), testing::Not(HasSubstr("\nstart"))));
    EXPECT_EQ(::rmdir(temporary.c_str()), 0);
    for (const char* name : {"ptp4l.conf", "uds", "fifo"}) {
        EXPECT_NE(::access(folder.path(name).c_str(), F_OK), 0) << name;
    }
}

TEST_F(ToolCheckTest, APlugInThatCannotBeLoadedLeavesTheRestToCheck) {
    installDaemon("exit 0");
    for (const char* library : {FAKE_PLUGIN_VERSION3, FAKE_PLUGIN_INCOMPLETE, "/none.so"}) {
        const auto result = check({"--json", "--library", library, "--interface", "lo"});
        EXPECT_EQ(result.status, 1);
        EXPECT_EQ(of(result, "plug-in")["result"], "fail") << library;
        EXPECT_EQ(of(result, "initialise")["result"], "skip");
        EXPECT_EQ(of(result, "configuration")["result"], "skip");
        EXPECT_EQ(of(result, "udsAddress")["result"], "skip");
        EXPECT_EQ(of(result, "daemon")["result"], "ok");
        EXPECT_EQ(of(result, "interface lo")["result"], "ok");
    }
}

TEST_F(ToolCheckTest, ASchemaThatMakesNoSenseFails) {
    for (const char* text : {"fails", "[]"}) {
        Child child({HOST_TOOL, "check", "--json", "--library", FAKE_PLUGIN},
                    {std::string("FAKE_SCHEMA=") + text});
        const int status = child.wait();
        const Result result{status, child.output(), child.errors()};
        EXPECT_EQ(of(result, "schema")["result"], "fail");
        EXPECT_EQ(of(result, "settings")["result"], "skip");
    }
}

TEST_F(ToolCheckTest, BadSettingsFailAndUnknownOnesAreAWarning) {
    const auto result = check({"--json", "--library", FAKE_PLUGIN});
    EXPECT_EQ(of(result, "settings")["result"], "fail");
    EXPECT_THAT(std::string(of(result, "settings")["found"]), StartsWith("interface: is missing"));
    EXPECT_EQ(of(check(with(goodMachine, {"--set", "scrIpt=1"})), "settings")["result"], "warn");
}

TEST_F(ToolCheckTest, ThePlugInsRefusalIsShown) {
    const auto result = check(with(goodMachine, {"--set", "script=initialise-fails"}));
    EXPECT_EQ(of(result, "initialise")["result"], "fail");
    EXPECT_THAT(std::string(of(result, "initialise")["found"]),
                HasSubstr("code -52005, zeoskerr_invalidParameter at fake:7"));
    EXPECT_EQ(of(result, "udsAddress")["result"], "skip");
}

TEST_F(ToolCheckTest, AMistakeOnTheCommandLineIsNoCheck) {
    EXPECT_EQ(check({"--nonsense"}).status, 2);
    const auto result = check({"--config", folder.path("none.json")});
    EXPECT_EQ(result.status, 2);
    EXPECT_THAT(result.errors, HasSubstr("cannot read"));
    EXPECT_THAT(result.output, IsEmpty());
}

TEST_F(ToolCheckTest, AnOutputThatIsLostIsTold) {
    for (const std::string options : {"", " --json"}) {
        Child child({"/bin/sh", "-c",
                     "exec \"$0\" check --library \"$1\" --no-interfaces >/dev/full" + options,
                     HOST_TOOL, FAKE_PLUGIN},
                    {schema("[global]\n")});
        EXPECT_EQ(child.wait(), 1);
        EXPECT_EQ(child.errors(),
                  "vantel-host: cannot write the standard output: No space left on device\n");
    }
}

TEST_F(ToolCheckTest, TheHelpNamesWhatCannotBeSeen) {
    const auto result = check({"--help"});
    EXPECT_EQ(result.status, 0);
    EXPECT_THAT(result.output, AllOf(HasSubstr("VANTEL_PTP4L_PATH"), HasSubstr("Exit status: 0")));
}

TEST_F(ToolCheckTest, ThePathsOfTheBuildAreTheDefaults) {
    const auto result = check({"--help"});
    for (const char* path :
         {VANTEL_PTP4L_PATH, VANTEL_EPOCH_FIFO_PATH, VANTEL_LOCAL_SOCKET_PREFIX}) {
        EXPECT_THAT(result.output, HasSubstr(path));
    }
}

TEST_F(ToolCheckTest, AnInterfaceThatIsNamedTwiceIsRefused) {
    installDaemon("echo no interface specified");
    const auto result = check({"--json", "--library", FAKE_PLUGIN, "--create-fifo", "--interface",
                               "lo", "--interface", "lo"});
    EXPECT_EQ(result.status, 1);
    EXPECT_EQ(of(result, "interfaces")["result"], "fail");
}

TEST_F(ToolCheckTest, SoftwareTimeStampsAreNoFailureWhenAskedFor) {
    const Words words{"--json", "--library", FAKE_PLUGIN, "--create-fifo", "--interface", "lo"};
    EXPECT_EQ(of(check(words), "time stamping lo")["result"], "fail");
    EXPECT_NE(of(check(with(words, {"--software"})), "time stamping lo")["result"], "fail");
}

TEST_F(ToolCheckTest, TheRealDaemonRefusesTheDefaultTransportAndTakesTheMendedOne) {
    if (::access(realDaemon, X_OK) != 0) {
        GTEST_SKIP() << "SKIPPED: there is no " << realDaemon << " (package linuxptp)";
    }
    ASSERT_EQ(::symlink(realDaemon, folder.path("ptp4l").c_str()), 0);
    const Words words{"--json", "--library", VANTEL_BC_LIBRARY, "--no-interfaces"};
    const Json refused = of(check(words), "configuration");
    EXPECT_EQ(refused["result"], "fail");
    EXPECT_THAT(std::string(refused["found"]),
                StartsWith("it says: UDPv4RAW is a bad value for option network_transport at "
                           "line "));
    EXPECT_THAT(std::string(refused["mend"]),
                StartsWith("--set networkTransport=UDPv4 --set ptpDstMac=01:1B:19:00:00:00"));
    const auto mended = check(
        with(words, {"--set", "networkTransport=UDPv4", "--set", "ptpDstMac=01:1B:19:00:00:00"}));
    EXPECT_EQ(of(mended, "configuration")["result"], "ok") << mended.output;
    const auto badMechanism =
        check(with(words, {"--set", "networkTransport=UDPv4", "--set", "priority1=200", "--set",
                           "delayMechanism=NONSENSE"}));
    EXPECT_THAT(std::string(of(badMechanism, "configuration")["mend"]),
                "another value: --set delayMechanism=...");
}
