#include "errors/Trace.h"

#include <string>

#include <gtest/gtest.h>

namespace {

std::string written;

constexpr zesdbg::Source source{"tSharedFifo", 42, "\n"};

class TraceTest : public testing::Test {
protected:
    TraceTest() {
        written.clear();
        zesdbg::settings.output = [](const char* line) { written += line; };
    }
    ~TraceTest() override { zesdbg::settings = defaults; }

    const zesdbg::Settings defaults = zesdbg::settings;
};

TEST_F(TraceTest, LineHasComponentFileAndLineRightAligned) {
    zesdbg::trace(0x2000, source, "Failed closing shared FIFO: %s, errno: %d (%s)", "/tmp/f", 9,
                  "Bad file descriptor");
    EXPECT_EQ(written, "[ vantel_bc|                     tSharedFifo|  42] "
                       "Failed closing shared FIFO: /tmp/f, errno: 9 (Bad file descriptor)\n");
}

TEST_F(TraceTest, LongFieldsKeepTheirTail) {
    const zesdbg::Source distant{"/a/very/long/path/of/folders/to/the/tSharedFifo.cpp", 123456,
                                 "\n"};
    zesdbg::trace(0x2000, distant, "x");
    EXPECT_EQ(written, "[ vantel_bc|f/folders/to/the/tSharedFifo.cpp|3456] x\n");
}

TEST_F(TraceTest, FieldsThatFitExactlyStayWhole) {
    const zesdbg::Source exact{"12345678901234567890123456789012", 1234, "\n"};
    zesdbg::trace(0x2000, exact, "x");
    EXPECT_EQ(written, "[ vantel_bc|12345678901234567890123456789012|1234] x\n");
}

TEST_F(TraceTest, LineIsCutAtItsBuffer) {
    const std::string message(600, 'x');
    zesdbg::trace(0x2000, source, "%s", message.c_str());
    // 51 octets of prefix, 460 of message, the terminating zero; no room for the line feed.
    EXPECT_EQ(written.size(), 511U);
    EXPECT_EQ(written.substr(0, 51), "[ vantel_bc|                     tSharedFifo|  42] ");
    EXPECT_EQ(written.substr(51), std::string(460, 'x'));
}

TEST_F(TraceTest, LastMessageThatFitsKeepsItsLineFeed) {
    const std::string message(459, 'x');
    zesdbg::trace(0x2000, source, "%s", message.c_str());
    EXPECT_EQ(written.size(), 511U);
    EXPECT_EQ(written.back(), '\n');
}

TEST_F(TraceTest, SuffixEndsTheLineAsItIs) {
    const zesdbg::Source open{"f", 1, ""};
    zesdbg::trace(0x2000, open, "x");
    EXPECT_EQ(written, "[ vantel_bc|                               f|   1] x");
}

TEST_F(TraceTest, LevelsBelow4096AreDropped) {
    zesdbg::trace(0, source, "no");
    zesdbg::trace(4095, source, "no");
    EXPECT_EQ(written, "");
    zesdbg::trace(4096, source, "yes");
    EXPECT_EQ(written, "[ vantel_bc|                     tSharedFifo|  42] yes\n");
}

TEST_F(TraceTest, ThresholdCanBeRaised) {
    zesdbg::settings.threshold = 0x4000;
    zesdbg::trace(0x2000, source, "no");
    EXPECT_EQ(written, "");
}

TEST_F(TraceTest, WidthsAndPrefixesAreSettings) {
    static constexpr zesdbg::PrefixWriter prefix[] = {
        [](zesdbg_VarLine& line, const zesdbg::Source& from) {
            line.appendField(from.file, zesdbg::settings.fileWidth);
        },
        [](zesdbg_VarLine& line, const zesdbg::Source&) { line.append(": "); }, nullptr};
    zesdbg::settings.prefixWriters = prefix;
    zesdbg::settings.fileWidth = 4;
    zesdbg::trace(0x2000, source, "x");
    EXPECT_EQ(written, "Fifo: x\n");
}

TEST_F(TraceTest, FormatterIsASetting) {
    zesdbg::settings.formatter = [](zesdbg_VarLine& line, const char* format, std::va_list) {
        line.append("formatted: ");
        line.append(format);
    };
    zesdbg::trace(0x2000, source, "errno: %d", 9);
    EXPECT_EQ(written, "[ vantel_bc|                     tSharedFifo|  42] formatted: errno: %d\n");
}

TEST_F(TraceTest, FailuresAreTracedAtLevel8192) {
    EXPECT_EQ(zesdbg::levelFailure, 8192U);
    EXPECT_EQ(defaults.threshold, 4096U);
}

TEST_F(TraceTest, GoesToStandardErrorByDefault) {
    zesdbg::settings = defaults;
    testing::internal::CaptureStderr();
    zesdbg::trace(0x2000, source, "message");
    EXPECT_EQ(testing::internal::GetCapturedStderr(),
              "[ vantel_bc|                     tSharedFifo|  42] message\n");
}

} // namespace
