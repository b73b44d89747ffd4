#include "Checks/FifoCheck.h"

#include <unistd.h>

#include "Checks/CheckTest.h"
#include "Checks/OrdinaryUser.h"

using namespace vantelhost;

TEST_F(CheckTest, AFifoOfOnesOwnIsGood) {
    ::mkfifo(subject.fifo.c_str(), 0600);
    EXPECT_THAT(checkFifo(subject), says(Verdict::ok, "its writer is not to be seen"));
}

TEST_F(CheckTest, AMissingFifoFails) {
    EXPECT_THAT(checkFifo(subject),
                says(Verdict::fail, "No such file or directory", "mkfifo -m 600 " + subject.fifo));
}

TEST_F(CheckTest, AMissingFifoThatWillBeCreatedIsGood) {
    subject.createFifo = true;
    EXPECT_THAT(checkFifo(subject), says(Verdict::ok, "will be created"));
    subject.fifo = folder.path("none/fifo");
    EXPECT_THAT(checkFifo(subject), says(Verdict::fail, "none: No such file or directory"));
}

TEST_F(CheckTest, AFifoBelowAFileFails) {
    writeFile(folder.path("file"), "");
    subject.fifo = folder.path("file/fifo");
    EXPECT_THAT(checkFifo(subject), says(Verdict::fail, "Not a directory"));
}

TEST_F(CheckTest, WhatIsNoFifoFails) {
    writeFile(subject.fifo, "12345678");
    EXPECT_THAT(checkFifo(subject), says(Verdict::fail, "is not a FIFO"));
    ::mkfifo(folder.path("other").c_str(), 0600);
    ::unlink(subject.fifo.c_str());
    ASSERT_EQ(::symlink(folder.path("other").c_str(), subject.fifo.c_str()), 0);
    EXPECT_THAT(checkFifo(subject), says(Verdict::fail, "is not a FIFO"));
}

TEST_F(CheckTest, AFifoThatMayNotBeReadFails) {
    ::mkfifo(subject.fifo.c_str(), 0000);
    ::chmod(folder.path("").c_str(), 0755);
    const OrdinaryUser user;
    if (!user.isOne()) {
        GTEST_SKIP() << "SKIPPED: the user cannot be changed";
    }
    EXPECT_THAT(checkFifo(subject), says(Verdict::fail, "Permission denied"));
}

TEST_F(CheckTest, AFifoThatMayOnlyBeReadFailsWhereOffsetsWillBeWritten) {
    ::mkfifo(subject.fifo.c_str(), 0444);
    ::chmod(folder.path("").c_str(), 0755);
    const OrdinaryUser user;
    if (!user.isOne()) {
        GTEST_SKIP() << "SKIPPED: the user cannot be changed";
    }
    EXPECT_THAT(checkFifo(subject), says(Verdict::ok, "its writer is not to be seen"));
    subject.writeFifo = true;
    EXPECT_THAT(checkFifo(subject), says(Verdict::fail, "Permission denied", "write it"));
}

TEST_F(CheckTest, AFifoThatOthersMayWriteIsAWarning) {
    ::mkfifo(subject.fifo.c_str(), 0600);
    ::chmod(subject.fifo.c_str(), 0620);
    EXPECT_THAT(checkFifo(subject),
                says(Verdict::warn, "has mode 0620: others can shift all time pairs", "0600"));
}

TEST_F(CheckTest, AFifoOfSomebodyElseIsAWarning) {
    ::mkfifo(subject.fifo.c_str(), 0600);
    if (::chown(subject.fifo.c_str(), 65533, 65533) != 0) {
        GTEST_SKIP() << "SKIPPED: not allowed to give files away";
    }
    EXPECT_THAT(checkFifo(subject), says(Verdict::warn, "belongs to user 65533"));
}
