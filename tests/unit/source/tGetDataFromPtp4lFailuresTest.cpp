#include "tGetDataFromPtp4l.h"

#include <atomic>
#include <chrono>
#include <filesystem>
#include <random>
#include <utility>

#include <fcntl.h>
#include <gtest/gtest.h>
#include <sys/syscall.h>
#include <unistd.h>

#include "support/Descriptors.h"
#include "support/FetcherTest.h"
#include "tFileDescriptor.h"

using zekelVantel::tFileDescriptor;
using zekelVantel::tGetDataFromPtp4l;
using zekelVantel::tPtp4lMetaData;

namespace {

class PtpFetchFailuresTest : public FetcherTest {
protected:
    /// One fetch that fails, and how long it took.
    std::chrono::milliseconds expectFailure(std::int32_t code) {
        const auto begin = std::chrono::steady_clock::now();
        EXPECT_EQ(fetch(), code);
        EXPECT_EQ(descriptorBoundTo(localPath), -1);
        EXPECT_FALSE(std::filesystem::exists(localPath));
        return std::chrono::duration_cast<std::chrono::milliseconds>(
            std::chrono::steady_clock::now() - begin);
    }

    /// One fetch without a fault, after those that failed.
    void expectRecovery() {
        daemon.setScript(nullptr);
        EXPECT_EQ(fetch(), 0);
        EXPECT_EQ(timeStatus.masterOffset, -42);
        EXPECT_NE(metaData, tPtp4lMetaData());
    }

    /// Changes the length of the answers for one data set.
    void resizeAnswers(std::uint16_t managementId, int by) {
        daemon.setScript([=](const FakePtp4l::Request& request, FakePtp4l::Answers& answers) {
            if (request.managementId() == managementId) {
                for (auto& answer : answers) {
                    answer.resize(answer.size() + static_cast<std::size_t>(by));
                }
            }
        });
    }
};

constexpr std::chrono::milliseconds atOnce{1000};
constexpr std::chrono::milliseconds timeLimit{2000};
constexpr std::chrono::milliseconds nearlyTwoTimeLimits{3900};

TEST_F(PtpFetchFailuresTest, WithoutADaemonTheCallFailsAtOnceAndTheNextOneIsNotHindered) {
    tGetDataFromPtp4l lonely("./missing", 0);
    writeFile(localPath, "left behind");
    for (int call = 0; call < 3; ++call) {
        const auto begin = std::chrono::steady_clock::now();
        EXPECT_EQ(lonely.fetch(timeStatus, metaData), -52024);
        EXPECT_LT(std::chrono::steady_clock::now() - begin, atOnce);
        EXPECT_FALSE(std::filesystem::exists(localPath));
        writeFile(localPath, "left behind");
    }
    expectRecovery();
}

TEST_F(PtpFetchFailuresTest, SocketThatADaemonLeftBehindIsACommunicationsFault) {
    { const DatagramSocket dead("./dead"); }
    tGetDataFromPtp4l fetcherOfTheDead("./dead", 0);
    EXPECT_EQ(fetcherOfTheDead.fetch(timeStatus, metaData), -52024);
}

TEST_F(PtpFetchFailuresTest, DaemonThatComesLaterIsFound) {
    tGetDataFromPtp4l early("./late_daemon", 0);
    EXPECT_EQ(early.fetch(timeStatus, metaData), -52024);
    const FakePtp4l late("./late_daemon");
    EXPECT_EQ(early.fetch(timeStatus, metaData), 0);
    EXPECT_EQ(late.requests().at(0).sequenceId(), 1) << "a failed exchange takes a number";
}

TEST_F(PtpFetchFailuresTest, SilentDaemonTimesOutAndItsLateAnswersGoNowhere) {
    daemon.setScript(answerNothing);
    timeStatus.masterOffset = 1;
    timeStatus.ingressTime = 2;
    timeStatus.gmPresent = 3;
    const auto begin = std::chrono::steady_clock::now();
    EXPECT_EQ(fetcher.fetch(timeStatus, metaData), -52007);
    const auto duration = std::chrono::steady_clock::now() - begin;
    EXPECT_GE(duration, timeLimit);
    EXPECT_LT(duration, nearlyTwoTimeLimits);
    EXPECT_EQ(timeStatus.masterOffset, 0);
    EXPECT_EQ(timeStatus.ingressTime, 0);
    EXPECT_EQ(timeStatus.gmPresent, 0);
    EXPECT_EQ(metaData, tPtp4lMetaData());
    EXPECT_EQ(descriptorBoundTo(localPath), -1);
    EXPECT_FALSE(std::filesystem::exists(localPath));

    const auto requests = daemon.requests();
    ASSERT_EQ(requests.size(), 1U) << "the first time-out ends the call";
    EXPECT_FALSE(daemon.send(localPath, FakePtp4l::answersTo(requests[0], 1).at(0)));
    expectRecovery();
}

TEST_F(PtpFetchFailuresTest, LostAnswerOfOnePortTimesOutAfterTheTimeStatusWasFilled) {
    daemon.setPorts(2);
    daemon.setScript([](const FakePtp4l::Request& request, FakePtp4l::Answers& answers) {
        if (request.managementId() == FakePtp4l::portDataSet) {
            answers.pop_back();
        }
    });
    const auto duration = expectFailure(-52007);
    EXPECT_GE(duration, timeLimit);
    EXPECT_LT(duration, nearlyTwoTimeLimits);
    EXPECT_EQ(timeStatus.masterOffset, -42);
    EXPECT_EQ(timeStatus.gmPresent, 1);
    EXPECT_EQ(metaData, tPtp4lMetaData());
    EXPECT_EQ(daemon.requests().size(), 4U);
    expectRecovery();
    EXPECT_EQ(requestsFor(FakePtp4l::portPropertiesNp).at(0).messageLength(), 67)
        << "only a time-out of that exchange makes the pad octet count";
}

TEST_F(PtpFetchFailuresTest, TimeStatusOfAnotherLengthIsEndOfDataAndGivesZeros) {
    for (const int by : {1, -1, -56, -104, 200}) {
        resizeAnswers(FakePtp4l::timeStatusNp, by);
        EXPECT_LT(expectFailure(-52012), timeLimit);
        EXPECT_EQ(timeStatus.masterOffset, 0) << by;
        EXPECT_EQ(timeStatus.ingressTime, 0) << by;
        EXPECT_EQ(timeStatus.gmPresent, 0) << by;
        EXPECT_EQ(metaData, tPtp4lMetaData()) << by;
        EXPECT_EQ(daemon.requests().back().managementId(), FakePtp4l::timeStatusNp);
    }
    expectRecovery();
}

TEST_F(PtpFetchFailuresTest, ClockDataSetOfAnotherLengthIsEndOfData) {
    for (const std::uint16_t managementId : {FakePtp4l::parentDataSet, FakePtp4l::defaultDataSet}) {
        for (const int by : {1, -1}) {
            resizeAnswers(managementId, by);
            EXPECT_LT(expectFailure(-52012), timeLimit);
            EXPECT_EQ(timeStatus.masterOffset, -42);
            EXPECT_EQ(metaData, tPtp4lMetaData());
            EXPECT_EQ(daemon.requests().back().managementId(), managementId);
        }
    }
    expectRecovery();
}

TEST_F(PtpFetchFailuresTest, AnswerOfAPortThatIsTooShortIsEndOfData) {
    // The name of 4 octets and its pad would have to go first.
    const std::pair<std::uint16_t, int> tooShort[] = {{FakePtp4l::portDataSet, -1},
                                                      {FakePtp4l::portDataSetNp, -1},
                                                      {FakePtp4l::portPropertiesNp, -2},
                                                      {FakePtp4l::portPropertiesNp, -6}};
    for (const auto& [managementId, by] : tooShort) {
        resizeAnswers(managementId, by);
        EXPECT_LT(expectFailure(-52012), timeLimit);
        EXPECT_EQ(timeStatus.masterOffset, -42);
        EXPECT_EQ(metaData, tPtp4lMetaData());
        EXPECT_EQ(daemon.requests().back().managementId(), managementId);
    }
    expectRecovery();
}

TEST_F(PtpFetchFailuresTest, ShortAnswerOfTheFirstPortEndsTheExchange) {
    daemon.setPorts(3);
    daemon.setScript([](const FakePtp4l::Request& request, FakePtp4l::Answers& answers) {
        if (request.managementId() == FakePtp4l::portDataSet) {
            answers.erase(answers.begin() + 1, answers.end());
            answers.front().pop_back();
        }
    });
    EXPECT_LT(expectFailure(-52012), timeLimit);
    expectRecovery();
}

TEST_F(PtpFetchFailuresTest, OneAnswerTooManySpoilsTheCallButNotTheNextOne) {
    daemon.setScript([](const FakePtp4l::Request& request, FakePtp4l::Answers& answers) {
        if (request.managementId() == FakePtp4l::timeStatusNp) {
            answers.push_back(answers.front());
        }
    });
    EXPECT_LT(expectFailure(-52012), timeLimit);
    EXPECT_EQ(timeStatus.masterOffset, -42);
    daemon.settle();
    expectRecovery();
}

TEST_F(PtpFetchFailuresTest, LateAnswerOnTheNextSocketSpoilsOneCallAtMost) {
    ASSERT_EQ(fetch(), 0);
    for (const auto& request : daemon.requests()) {
        ASSERT_TRUE(daemon.send(localPath, FakePtp4l::answersTo(request, 1).at(0)));
        EXPECT_LT(expectFailure(-52012), timeLimit) << request.managementId();
        daemon.settle();
        expectRecovery();
        daemon.settle();
    }
}

TEST_F(PtpFetchFailuresTest, FailureOfTheSystemsReceiveIsACommunicationsFault) {
    for (const std::uint16_t managementId :
         {FakePtp4l::timeStatusNp, FakePtp4l::defaultDataSet, FakePtp4l::portDataSet}) {
        tFileDescriptor socket;
        daemon.setScript([&, managementId](const FakePtp4l::Request& request, FakePtp4l::Answers&) {
            if (request.managementId() == managementId) {
                const int descriptor = descriptorBoundTo(localPath);
                const tFileDescriptor noSocket(open("/dev/null", O_RDONLY));
                // Its copy takes the answer, which ends a wait that has begun. By system calls:
                // ThreadSanitizer would take the functions for a race with the fetch.
                socket = tFileDescriptor(static_cast<int>(syscall(SYS_dup, descriptor)));
                EXPECT_EQ(syscall(SYS_dup3, noSocket.get(), descriptor, 0), descriptor);
            }
        });
        EXPECT_EQ(fetch(), -52024) << managementId;
        daemon.settle();
        EXPECT_EQ(daemon.requests().back().managementId(), managementId);
        EXPECT_EQ(metaData, tPtp4lMetaData());
        socket.close();
        EXPECT_EQ(descriptorBoundTo(localPath), -1);
        EXPECT_FALSE(std::filesystem::exists(localPath));
        expectRecovery();
    }
}

TEST_F(PtpFetchFailuresTest, FolderInThePlaceOfTheSocketIsResourceNotFound) {
    std::filesystem::create_directory(localPath);
    timeStatus.masterOffset = 7;
    EXPECT_EQ(fetcher.fetch(timeStatus, metaData), -52006);
    EXPECT_EQ(timeStatus.masterOffset, 7) << "nothing was asked";
    EXPECT_TRUE(daemon.requests().empty());
    EXPECT_TRUE(std::filesystem::is_directory(localPath));
    std::filesystem::remove(localPath);
    expectRecovery();
    EXPECT_EQ(daemon.requests().at(0).sequenceId(), 0);
}

TEST_F(PtpFetchFailuresTest, NoDescriptorForTheSocketIsMemoryFull) {
    // UndefinedBehaviorSanitizer needs descriptors of its own the first time that it sees a class:
    // so the first call fails otherwise.
    std::filesystem::create_directory(localPath);
    tGetDataFromPtp4l& asked = fetcher;
    tPtp4lMetaData untouched;
    zekelVantel::tTimeStatus filled;
    filled.masterOffset = 7;
    std::vector<std::int32_t> codes;
    for (const rlim_t limit : {rlim_t{1024}, rlim_t{0}}) {
        const DescriptorLimit lowered(limit);
        codes.push_back(asked.fetch(filled, untouched));
    }
    EXPECT_EQ(codes, (std::vector<std::int32_t>{-52006, -52000}));
    EXPECT_EQ(filled.masterOffset, 7);
    EXPECT_TRUE(daemon.requests().empty());
    std::filesystem::remove(localPath);
    expectRecovery();
}

TEST_F(PtpFetchFailuresTest, GarbageOfAnyLengthIsAnError) {
    std::mt19937 random(1588);
    std::vector<std::size_t> lengths = {1499, 1500, 1501, 4096, 60000};
    for (std::size_t length = 1; length <= 160; ++length) {
        lengths.push_back(length);
    }
    std::atomic<std::size_t> wanted{0};
    daemon.setScript([&](const FakePtp4l::Request&, FakePtp4l::Answers& answers) {
        answers.assign(1, std::vector<std::uint8_t>(wanted));
        for (auto& octet : answers.front()) {
            octet = static_cast<std::uint8_t>(random());
        }
    });
    for (const std::size_t length : lengths) {
        daemon.settle();
        wanted = length;
        EXPECT_LT(expectFailure(-52012), timeLimit) << length;
        EXPECT_EQ(metaData, tPtp4lMetaData()) << length;
    }
    expectRecovery();
}

TEST_F(PtpFetchFailuresTest, EmptyDatagramIsAnError) {
    daemon.setScript(
        [](const FakePtp4l::Request&, FakePtp4l::Answers& answers) { answers.assign(1, {}); });
    EXPECT_LT(expectFailure(-52012), timeLimit);
    expectRecovery();
}

TEST_F(PtpFetchFailuresTest, GarbageFromPortsIsShownOrRefusedButNeverHarms) {
    std::mt19937 random(802);
    std::atomic<std::size_t> wanted{0};
    daemon.setScript([&](const FakePtp4l::Request& request, FakePtp4l::Answers& answers) {
        if (request.managementId() == FakePtp4l::portPropertiesNp) {
            answers.front().resize(wanted);
            for (std::size_t index = 66; index < answers.front().size(); ++index) {
                answers.front()[index] = static_cast<std::uint8_t>(random());
            }
        }
    });
    int shown = 0;
    for (std::size_t length = 60; length < 400; length += 3) {
        daemon.settle();
        wanted = length;
        const std::int32_t code = fetch();
        EXPECT_TRUE(code == 0 || code == -52012) << code;
        EXPECT_EQ(metaData == tPtp4lMetaData(), code != 0);
        shown += code == 0 ? 1 : 0;
    }
    EXPECT_GT(shown, 0);
    expectRecovery();
}

} // namespace
