#include "Checks/PathChecks.h"

#include <unistd.h>

#include "Checks/CheckTest.h"
#include "Checks/Listener.h"
#include "Checks/OrdinaryUser.h"

using namespace vantelhost;

namespace {

/// Lets others see what is in the folder.
void open(const Folder& folder) {
    ::chmod(folder.path("").c_str(), 0755);
}

const std::string otherPath = "choose another path: --set udsAddress=...";

} // namespace

TEST_F(CheckTest, AConfigFileThatCanBeMadeIsGood) {
    EXPECT_THAT(checkConfigFile(subject), says(Verdict::ok, "is writable"));
    EXPECT_NE(::access(folder.path("ptp4l.conf").c_str(), F_OK), 0);
}

TEST_F(CheckTest, AConfigFileThatIsThereIsGoodAndStays) {
    writeFile(folder.path("ptp4l.conf"), "old");
    EXPECT_THAT(checkConfigFile(subject), says(Verdict::ok, "will be replaced"));
    EXPECT_EQ(contentOf(folder.path("ptp4l.conf")), "old");
}

TEST_F(CheckTest, AConfigFileInAMissingFolderFails) {
    set("configFile", folder.path("a/b/c.conf"));
    EXPECT_THAT(checkConfigFile(subject), says(Verdict::fail, "a/b: No such file or directory",
                                               "mkdir -p " + folder.path("a/b") +
                                                   "; \"vantel-host run\" makes it by itself"));
}

TEST_F(CheckTest, AConfigFileBelowAFileFails) {
    writeFile(folder.path("a"), "");
    set("configFile", folder.path("a/c.conf"));
    EXPECT_THAT(checkConfigFile(subject), says(Verdict::fail, "a: is not a folder"));
}

TEST_F(CheckTest, AConfigFileThatIsAFolderFails) {
    set("configFile", folder.path("dev"));
    EXPECT_THAT(checkConfigFile(subject), says(Verdict::fail, "is not a file"));
}

TEST_F(CheckTest, WhatMayNotBeWrittenFails) {
    writeFile(folder.path("ptp4l.conf"), "old");
    ::chmod(folder.path("ptp4l.conf").c_str(), 0444);
    ::mkdir(folder.path("closed").c_str(), 0555);
    open(folder);
    const OrdinaryUser user;
    if (!user.isOne()) {
        GTEST_SKIP() << "SKIPPED: the user cannot be changed";
    }
    EXPECT_THAT(checkConfigFile(subject), says(Verdict::fail, "ptp4l.conf: Permission denied"));
    set("configFile", folder.path("closed/c.conf"));
    EXPECT_THAT(checkConfigFile(subject), says(Verdict::fail, "closed: Permission denied"));
    set("udsAddress", folder.path("closed/uds"));
    EXPECT_THAT(checkUdsFolder(subject), says(Verdict::fail, "closed: Permission denied"));
    subject.socketPrefix = folder.path("closed/own.");
    EXPECT_THAT(checkOwnSocket(subject), says(Verdict::fail, "closed: Permission denied"));
}

TEST_F(CheckTest, APathForASocketIsGood) {
    EXPECT_THAT(checkUdsAddress(subject), isGood());
    EXPECT_THAT(checkUdsFolder(subject), isGood());
    EXPECT_THAT(checkOwnSocket(subject), isGood());
}

TEST_F(CheckTest, SocketsInAMissingFolderFail) {
    set("udsAddress", folder.path("none/uds"));
    subject.socketPrefix = folder.path("none/own.");
    EXPECT_THAT(checkUdsFolder(subject), says(Verdict::fail, "none: No such file"));
    EXPECT_EQ(checkUdsFolder(subject).mend, "mkdir -p " + folder.path("none"));
    EXPECT_THAT(checkOwnSocket(subject), says(Verdict::fail, "none: No such file"));
}

TEST_F(CheckTest, ASocketPathOf107CharactersIsTheLongest) {
    set("udsAddress", "/" + std::string(106, 'x'));
    EXPECT_THAT(checkUdsAddress(subject), isGood());
    set("udsAddress", "/" + std::string(107, 'x'));
    EXPECT_THAT(
        checkUdsAddress(subject),
        says(Verdict::warn, "has 108 characters: plug-in and ptp4l cut it to 107", otherPath));
}

TEST_F(CheckTest, ThePlugInsSocketHasRoomForAProcessId) {
    subject.socketPrefix = folder.path("");
    subject.socketPrefix.append(100 - subject.socketPrefix.size(), 'x');
    EXPECT_THAT(checkOwnSocket(subject), isGood());
    subject.socketPrefix += "x";
    EXPECT_THAT(checkOwnSocket(subject),
                says(Verdict::warn, "has up to 108 characters", "VANTEL_LOCAL_SOCKET_PREFIX"));
}

TEST_F(CheckTest, AnEmptyOrUnprintableSocketPathFails) {
    set("udsAddress", "");
    EXPECT_THAT(checkUdsAddress(subject), says(Verdict::fail, "is empty", otherPath));
    set("udsAddress", "/tmp/a\npriority1 0");
    EXPECT_THAT(checkUdsAddress(subject), says(Verdict::fail, "control characters", otherPath));
}

TEST_F(CheckTest, ASocketPathWhereNobodyListensIsGood) {
    EXPECT_THAT(checkUdsInUse(subject), says(Verdict::ok, "no"));
}

TEST_F(CheckTest, ASocketThatWasLeftBehindIsGoodAndStays) {
    { const Listener gone(folder.path("uds"), SOCK_DGRAM); }
    EXPECT_THAT(checkUdsInUse(subject), says(Verdict::ok, "that was left there"));
    EXPECT_EQ(::access(folder.path("uds").c_str(), F_OK), 0);
}

TEST_F(CheckTest, ASocketWhereSomebodyListensFails) {
    const Listener datagrams(folder.path("uds"), SOCK_DGRAM);
    EXPECT_THAT(checkUdsInUse(subject), says(Verdict::fail, "uds: in use by somebody"));
    const Listener stream(folder.path("stream"), SOCK_STREAM);
    set("udsAddress", folder.path("stream"));
    EXPECT_THAT(checkUdsInUse(subject), says(Verdict::fail, "stream: in use by somebody"));
}

TEST_F(CheckTest, SomethingElseAtTheSocketsPathIsToldOf) {
    writeFile(folder.path("uds"), "");
    EXPECT_THAT(checkUdsInUse(subject), says(Verdict::warn, "is not a socket, ptp4l removes it"));
    set("udsAddress", folder.path("dev"));
    EXPECT_THAT(checkUdsInUse(subject), says(Verdict::fail, "a folder is there"));
}

TEST_F(CheckTest, WithoutSettingsPathsAreNotChecked) {
    subject.settings.reset();
    for (const auto check : {checkConfigFile, checkUdsAddress, checkUdsFolder, checkUdsInUse}) {
        EXPECT_EQ(check(subject).verdict, Verdict::skip);
    }
}
