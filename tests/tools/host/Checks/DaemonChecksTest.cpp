#include "Checks/DaemonChecks.h"

#include <fcntl.h>
#include <poll.h>
#include <unistd.h>

#include "Checks/CheckTest.h"

using namespace vantelhost;

namespace {

/// With a daemon that is a script, and a file for it.
class DaemonChecksTest : public CheckTest {
protected:
    DaemonChecksTest() {
        subject.rendered = folder.path("rendered");
        writeFile(*subject.rendered, "[global]\npriority1 128\n");
    }

    void installDaemon(const std::string& script, mode_t mode = 0755) const {
        writeFile(subject.daemon, "#!/bin/sh\n" + script + "\n");
        ::chmod(subject.daemon.c_str(), mode);
    }

    void addProcess(const std::string& name, const std::string& command) const {
        ::mkdir((subject.proc + "/" + name).c_str(), 0755);
        writeFile(subject.proc + "/" + name + "/status",
                  "Name:\t" + command + "\nUmask:\t0022\nPPid:\t1\n");
    }
};

} // namespace

TEST_F(DaemonChecksTest, AnExecutableDaemonIsGood) {
    installDaemon("exit 0");
    EXPECT_THAT(checkDaemon(subject), isGood());
}

TEST_F(DaemonChecksTest, AMissingDaemonIsLinked) {
    subject.usualDaemon = HOST_TOOL;
    EXPECT_THAT(checkDaemon(subject), says(Verdict::fail, "ptp4l: No such file or directory"));
    EXPECT_EQ(checkDaemon(subject).mend, std::string("ln -sf ") + HOST_TOOL + " " + subject.daemon);
}

TEST_F(DaemonChecksTest, ADaemonThatIsMissingEverywhereIsInstalled) {
    subject.usualDaemon = folder.path("sbin/ptp4l");
    EXPECT_EQ(checkDaemon(subject).mend,
              "install linuxptp, then ln -sf " + subject.usualDaemon + " " + subject.daemon);
    subject.daemon = subject.usualDaemon;
    EXPECT_EQ(checkDaemon(subject).mend, "install linuxptp");
}

TEST_F(DaemonChecksTest, ADaemonThatIsNotExecutableIsMadeSo) {
    installDaemon("exit 0", 0644);
    EXPECT_THAT(checkDaemon(subject),
                says(Verdict::fail, "is not executable", "chmod +x " + subject.daemon));
}

TEST_F(DaemonChecksTest, AFolderIsNoDaemon) {
    ::mkdir(subject.daemon.c_str(), 0755);
    EXPECT_THAT(checkDaemon(subject), says(Verdict::fail, "is not a program"));
}

TEST_F(DaemonChecksTest, TheComplaintAboutAMissingInterfaceMeansThatTheFileIsTaken) {
    installDaemon("echo no interface specified >&2; exit 255");
    EXPECT_THAT(checkConfiguration(subject), says(Verdict::ok, "ptp4l takes it"));
}

TEST_F(DaemonChecksTest, TheDaemonGetsTheFileAndNoInterfaceAndNoEnvironment) {
    const std::string record = folder.path("record");
    installDaemon("echo \"$*\" > " + record + "; echo \"home ${HOME-none}\" >> " + record);
    checkConfiguration(subject);
    EXPECT_EQ(contentOf(record), "-f " + *subject.rendered + " -m -q\nhome none\n");
}

TEST_F(DaemonChecksTest, ARefusalIsShownInTheDaemonsWords) {
    installDaemon("echo '300 is an out of range value for option priority1 at line 2' >&2\n"
                  "echo 'failed to parse configuration file' >&2; exit 254");
    EXPECT_THAT(checkConfiguration(subject),
                says(Verdict::fail,
                     "it says: 300 is an out of range value for option priority1 at line 2",
                     "--set priority1="));
}

TEST_F(DaemonChecksTest, ARefusedLineIsLookedUpInTheFile) {
    writeFile(*subject.rendered, "[global]\npriority1 128\nuds_address \n");
    installDaemon("echo could not parse line 3 in global section; exit 254");
    EXPECT_THAT(checkConfiguration(subject),
                says(Verdict::fail, "it says: could not parse line 3", "--set udsAddress="));
}

TEST_F(DaemonChecksTest, AWordlessEndIsAFailure) {
    installDaemon("exit 3");
    EXPECT_THAT(checkConfiguration(subject),
                says(Verdict::fail, "it ended with status 3, without a word"));
    installDaemon("kill -KILL $$");
    EXPECT_THAT(checkConfiguration(subject),
                says(Verdict::fail, "it was ended by signal 9, without a word"));
}

TEST_F(DaemonChecksTest, ADaemonThatDoesNotEndIsKilledWithItsChildren) {
    // Daemon and child hold the FIFO open for writing: reading ends when both are gone.
    const std::string fifo = folder.path("alive");
    ASSERT_EQ(::mkfifo(fifo.c_str(), 0600), 0);
    const int reader = ::open(fifo.c_str(), O_RDONLY | O_NONBLOCK | O_CLOEXEC);
    installDaemon("exec 3> " + fifo + "\nsleep 1000\nsleep 1000");
    EXPECT_THAT(checkConfigurationWithin(subject, std::chrono::milliseconds(500)),
                says(Verdict::fail, "did not end without an interface"));
    char octet = 0;
    const auto end = std::chrono::steady_clock::now() + std::chrono::seconds(20);
    while (::read(reader, &octet, 1) != 0 && std::chrono::steady_clock::now() < end) {
        ::poll(nullptr, 0, 5);
    }
    EXPECT_EQ(::read(reader, &octet, 1), 0);
    ::close(reader);
}

TEST_F(DaemonChecksTest, WhatCannotBeExecutedIsAFailure) {
    writeFile(subject.daemon, "\x7f"
                              "ELF");
    ::chmod(subject.daemon.c_str(), 0755);
    EXPECT_EQ(checkConfiguration(subject).verdict, Verdict::fail);
}

TEST_F(DaemonChecksTest, AFileThatNamesAnInterfaceIsNotTried) {
    installDaemon("touch " + folder.path("started"));
    for (const char* text : {"[global]\n[eth0]\n", "[eth0]\n[global]\n", "[eth0]\n"}) {
        writeFile(*subject.rendered, text);
        EXPECT_THAT(checkConfiguration(subject), says(Verdict::skip, "adds a section")) << text;
    }
    EXPECT_NE(::access(folder.path("started").c_str(), F_OK), 0);
}

TEST_F(DaemonChecksTest, WithoutFileOrDaemonThereIsNothingToTry) {
    EXPECT_THAT(checkConfiguration(subject), says(Verdict::skip, "there is no daemon"));
    installDaemon("exit 0");
    subject.rendered.reset();
    EXPECT_THAT(checkConfiguration(subject), says(Verdict::skip, "wrote no file"));
}

TEST(MendForTest, NamesTheSettingBehindTheOption) {
    EXPECT_THAT(mendFor("network_transport"),
                testing::StartsWith("--set networkTransport=UDPv4 --set ptpDstMac="));
    EXPECT_EQ(mendFor("ptp_dst_mac"), "another value: --set ptpDstMac=...");
    EXPECT_EQ(mendFor("neighborPropDelayThresh"),
              "another value: --set neighborPropDelayThreshold=...");
}

TEST(MendForTest, IsSilentAboutWhatNoSettingChanges) {
    for (const char* option : {"", "p2p_dst_mac", "priority12", "xpriority1"}) {
        EXPECT_EQ(mendFor(option), "") << option;
    }
}

TEST_F(DaemonChecksTest, AScriptIsToldFromAProgram) {
    installDaemon("exec ptp4l -S \"$@\"");
    EXPECT_TRUE(isScript(subject.daemon));
    EXPECT_FALSE(isScript("/proc/self/exe"));
    EXPECT_FALSE(isScript(folder.path("none")));
    EXPECT_FALSE(isScript(folder.path("proc")));
}

TEST_F(DaemonChecksTest, AScriptThatMayNotBeExecutedIsNone) {
    installDaemon("exit 0", 0644);
    EXPECT_FALSE(isScript(subject.daemon));
}

TEST_F(DaemonChecksTest, OtherDaemonsAreListed) {
    addProcess("12", "ptp4l");
    addProcess("13", "bash");
    addProcess("self", "ptp4l");
    EXPECT_THAT(checkOtherDaemons(subject), says(Verdict::warn, "ptp4l runs already: process 12"));
}

TEST_F(DaemonChecksTest, NoOtherDaemonIsGood) {
    addProcess("13", "ptp4l_not");
    EXPECT_THAT(checkOtherDaemons(subject), isGood());
}

TEST_F(DaemonChecksTest, WithoutProcNoDaemonIsSeen) {
    subject.proc = folder.path("none");
    EXPECT_THAT(checkOtherDaemons(subject), says(Verdict::skip, "No such file or directory"));
}
