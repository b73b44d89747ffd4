// What a terminal gets to see.

#include <csignal>
#include <sstream>

#include "Terminal.h"
#include "Tool.h"

using testing::HasSubstr;
using testing::Not;
using testing::StartsWith;

namespace {

const std::string opened = "\x1b[?1049h\x1b[?25l";
const std::string closed = "\x1b[?25h\x1b[?1049l";
const std::string home = "\x1b[H";
const std::string rest = "\x1b[J";
const std::string interrupt = "\x03";

class ToolTerminalTest : public ToolTest {
protected:
    Words live(const std::string& script, const Words& options = {}) const {
        Words words = command({"--interface", "eth0", "--set", "script=" + script});
        words.insert(words.end(), options.begin(), options.end());
        return words;
    }
};

/// What was drawn, picture by picture, each with its lines.
std::vector<std::vector<std::string>> pictures(const std::string& output) {
    std::vector<std::vector<std::string>> all;
    for (auto at = output.find(home); at != std::string::npos; at = output.find(home, at + 1)) {
        const auto end = output.find(rest, at);
        if (end == std::string::npos) {
            break; // not yet complete
        }
        std::istringstream text(output.substr(at + home.size(), end - at - home.size()));
        std::vector<std::string> lines;
        for (std::string line; std::getline(text, line);) {
            lines.push_back(line.substr(0, line.find("\x1b[K")));
        }
        all.push_back(lines);
    }
    return all;
}

/// The terminal is as it was, and what is left on it holds no control sequences.
void expectRestored(const std::string& output) {
    const auto at = output.find(closed);
    ASSERT_NE(at, std::string::npos);
    EXPECT_THAT(output.substr(at + closed.size()), Not(HasSubstr("\x1b")));
    EXPECT_EQ(output.find(opened), output.rfind(opened));
}

} // namespace

TEST_F(ToolTerminalTest, PicturesReplaceEachOtherInPlace) {
    Terminal terminal(live("quality metadata pairs"));
    ASSERT_TRUE(terminal.waitForOutput("ports         Port1"));
    const auto drawn = static_cast<int>(pictures(terminal.output()).size());
    ASSERT_TRUE(terminal.waitForOutput(rest, drawn + 2));
    const std::string output = terminal.output();
    const auto begin = output.find(opened);
    ASSERT_NE(begin, std::string::npos);
    EXPECT_THAT(output.substr(begin + opened.size()), StartsWith(home));
    for (const auto& picture : pictures(output)) {
        EXPECT_THAT(picture.front(), StartsWith("Fake time referen, "));
        EXPECT_LE(picture.size(), 24U);
    }
    const auto last = pictures(output).back();
    EXPECT_THAT(last, testing::Contains(testing::MatchesRegex("quality +other for 0:00:0.: odd")));
    EXPECT_THAT(last, testing::Contains("offset        2 ns"));
    EXPECT_THAT(last, testing::Contains("ports         Port1   PTP_SLAVE         eth0"));
}

TEST_F(ToolTerminalTest, TimeGoesByWithoutEvents) {
    Terminal terminal(live(""));
    EXPECT_TRUE(terminal.waitForOutput("starting, up 0:00:01"));
}

TEST_F(ToolTerminalTest, CtrlCRestoresTheScreenAndLeavesTheLastPicture) {
    Terminal terminal(live("quality pairs"));
    ASSERT_TRUE(terminal.waitForOutput("lost, up"));
    terminal.write(interrupt);
    EXPECT_EQ(terminal.wait(), 0);
    expectRestored(terminal.output());
    const auto left = terminal.output().substr(terminal.output().find(closed) + closed.size());
    EXPECT_THAT(left, StartsWith("Fake time referen, stopped, up 0:00:0"));
    EXPECT_THAT(left, HasSubstr("\nquality       other for 0:00:0"));
    EXPECT_THAT(left, HasSubstr(" summary      "));
    EXPECT_EQ(record().back(), "finalise");
}

TEST_F(ToolTerminalTest, EverySignalThatStopsRestoresTheScreen) {
    for (const int number : {SIGTERM, SIGHUP, SIGQUIT}) {
        Terminal terminal(live(""));
        ASSERT_TRUE(terminal.waitForOutput("starting, up"));
        terminal.signal(number);
        EXPECT_EQ(terminal.wait(), 0);
        expectRestored(terminal.output());
    }
}

TEST_F(ToolTerminalTest, AStartThatFailsRestoresTheScreenAndLeavesTheError) {
    Terminal terminal(live("start-fails"));
    EXPECT_EQ(terminal.wait(), 1);
    expectRestored(terminal.output());
    const auto left = terminal.output().substr(terminal.output().find(closed));
    EXPECT_THAT(left, HasSubstr("last errors   0:00:0"));
    EXPECT_THAT(left, HasSubstr("start: code -52010, not JSON"));
}

TEST_F(ToolTerminalTest, ANewSizeIsKeptAtOnce) {
    Terminal terminal(live("quality metadata pairs"));
    ASSERT_TRUE(terminal.waitForOutput("starting, up"));
    terminal.resize(5, 30);
    for (int tries = 0; tries < 20; ++tries) {
        terminal.forgetOutput();
        ASSERT_TRUE(terminal.waitForOutput(rest, 2));
        const auto last = pictures(terminal.output()).back();
        if (last.size() == 5) {
            break;
        }
    }
    const auto last = pictures(terminal.output()).back();
    EXPECT_THAT(last, testing::SizeIs(5));
    EXPECT_THAT(last, testing::Each(testing::SizeIs(testing::Le(30U))));
}

TEST_F(ToolTerminalTest, MistakesLeaveTheScreenAlone) {
    Terminal terminal(command({"--set", "count=1000"}));
    EXPECT_EQ(terminal.wait(), 2);
    EXPECT_THAT(terminal.output(), Not(HasSubstr("\x1b")));
}

TEST_F(ToolTerminalTest, LinesAreForPlainJsonAndDumbTerminals) {
    struct Row {
        Words options;
        std::string kind;
    };
    for (const auto& row : {Row{{"--plain"}, "xterm"}, Row{{"--json"}, "xterm"}, Row{{}, "dumb"}}) {
        Words words = live("quality pairs", row.options);
        words.insert(words.end(), {"--seconds", "0"});
        Terminal terminal(words, row.kind);
        EXPECT_EQ(terminal.wait(), 0);
        EXPECT_THAT(terminal.output(), Not(HasSubstr("\x1b")));
        EXPECT_THAT(terminal.output(), HasSubstr("summary"));
    }
}
