#include "PlainPrinter.h"

#include <array>

#include <fcntl.h>
#include <gmock/gmock.h>
#include <gtest/gtest.h>
#include <unistd.h>

#include "Tool.h"

using namespace vantelhost;

namespace {

constexpr std::array usable{2.5e-08, 1e-06, -1.0};
constexpr std::array unusable{-2.0, -2.0, -1.0};

class PlainPrinterTest : public testing::Test {
protected:
    ~PlainPrinterTest() override { ::close(file); }

    void print(const Event& event) { EXPECT_TRUE(printer(event, {1.5, 0})); }

    Folder folder;
    std::string path = folder.path("out");
    int file = ::open(path.c_str(), O_WRONLY | O_CREAT | O_CLOEXEC, 0600);
    PlainPrinter printer{file};
};

} // namespace

TEST_F(PlainPrinterTest, WhatIsToldAgainIsCountedUntilItChanges) {
    for (int i = 0; i < 41; ++i) {
        print(qualityEvent(usable.data(), "a"));
    }
    print(qualityEvent(usable.data(), "b"));
    EXPECT_EQ(contentOf(path), "     1.500 quality      usable [2.5e-08, 1e-06, -1] a\n"
                               "     1.500 quality      ... (repeated 40 times)\n"
                               "     1.500 quality      usable [2.5e-08, 1e-06, -1] b\n");
}

TEST_F(PlainPrinterTest, OtherEventsInBetweenDoNotMatter) {
    for (int i = 0; i < 3; ++i) {
        print(qualityEvent(unusable.data(), "a"));
        print(metadataEvent(Json::object()));
    }
    print(stoppingEvent("SIGINT"));
    EXPECT_EQ(contentOf(path), "     1.500 quality      unusable [-2, -2, -1] a\n"
                               "     1.500 metadata     grandmaster ? class ? ?; no ports\n"
                               "     1.500 metadata     ... (repeated 2 times)\n"
                               "     1.500 quality      ... (repeated 2 times)\n"
                               "     1.500 stopping     SIGINT\n");
}

TEST_F(PlainPrinterTest, AnEventToldTwiceIsPrintedTwice) {
    print(qualityEvent(usable.data(), "a"));
    print(qualityEvent(usable.data(), "a"));
    print(stoppingEvent("SIGINT"));
    EXPECT_EQ(contentOf(path), "     1.500 quality      usable [2.5e-08, 1e-06, -1] a\n"
                               "     1.500 quality      usable [2.5e-08, 1e-06, -1] a\n"
                               "     1.500 stopping     SIGINT\n");
}

TEST_F(PlainPrinterTest, WhatIsExpectedIsLeftOut) {
    print(expectedEvent(qualityEvent(unusable.data(), "a")));
    EXPECT_EQ(contentOf(path), "");
}

TEST_F(PlainPrinterTest, QuietlyNeitherPairsNorMetadataAreTold) {
    PlainPrinter quiet(file, PlainPrinter::Detail::quiet);
    EXPECT_TRUE(quiet(pairEvent(5, 7, 2), {1.5, 0}));
    EXPECT_TRUE(quiet(metadataEvent(Json::object()), {1.5, 0}));
    EXPECT_TRUE(quiet(qualityEvent(usable.data(), "a"), {1.5, 0}));
    EXPECT_EQ(contentOf(path), "     1.500 quality      usable [2.5e-08, 1e-06, -1] a\n");
}

TEST_F(PlainPrinterTest, AFullDiskIsTold) {
    const int full = ::open("/dev/full", O_WRONLY | O_CLOEXEC);
    PlainPrinter lossy(full);
    EXPECT_FALSE(lossy(startedEvent(), {1, 0}));
    ::close(full);
}
