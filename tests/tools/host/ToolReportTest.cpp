// The command "report".

#include <algorithm>
#include <csignal>
#include <cstdint>
#include <cstdlib>
#include <filesystem>
#include <regex>
#include <sstream>

#include "Tool.h"
#include "support/Child.h"

using testing::AllOf;
using testing::ContainsRegex;
using testing::EndsWith;
using testing::HasSubstr;
using testing::Not;
using vantelhost::Json;

namespace {

/// The program's file; empty when it is not installed.
std::string installed(const std::string& program) {
    const char* path = std::getenv("PATH");
    std::istringstream folders(path == nullptr ? "" : path);
    for (std::string folder; std::getline(folders, folder, ':');) {
        if (std::filesystem::exists(folder + "/" + program)) {
            return folder + "/" + program;
        }
    }
    return "";
}

std::size_t count(const std::string& text, const std::string& word) {
    std::size_t number = 0;
    for (auto at = text.find(word); at != std::string::npos; at = text.find(word, at + 1)) {
        ++number;
    }
    return number;
}

/// A host that was started at 1000 s, and had a pair each 125 ms but for a gap.
class Record {
public:
    Record& add(const std::string& event, double seconds, const std::string& members = "") {
        Json object{{"event", event},
                    {"t", seconds},
                    {"time", static_cast<std::uint64_t>((1000 + seconds) * 1e9)}};
        object.update(Json::parse("{" + members + "}"));
        text += object.dump() + "\n";
        return *this;
    }

    /// With 3 ms from the ingress to the call.
    Record& pair(double ingress, std::int64_t offset) {
        const auto local = static_cast<std::uint64_t>((1000 + ingress) * 1e9);
        const auto members = Json{
            {"local", local},
            {"reference", local - static_cast<std::uint64_t>(offset)},
            {"offset", offset}}.dump();
        return add("pair", ingress + 0.003, members.substr(1, members.size() - 2));
    }

    Record& pairs(int number, double first) {
        for (int i = 0; i < number; ++i) {
            pair(first + i * 0.125, i * i - 20);
        }
        return *this;
    }

    std::string text;
};

std::string roleChange(const std::string& quality) {
    return R"("quality":")" + quality + R"(","reason":"PTP role has changed.")";
}

/// A recording with everything, and with texts that are no harm as long as they are escaped.
std::string wholeRecord() {
    Record record;
    record.add("loaded", 0.1, R"("name":"<b>IEEE</b>","library":"x.so")")
        .add("initialised", 0.2, R"("configuration":{"priority1":128,"interface":["<i>"]})")
        .add("quality", 0.3, R"("quality":"unusable","reason":"<script>alert(1)</script>")")
        .add("metadata", 0.4, R"("valid":true,"metadata":{"gmClockId":"a&b"})")
        .add("metadata", 0.5,
             R"("valid":true,"metadata":{"gmClockId":"a&b",
                "Port1":{"portState":"PTP_LISTENING","interface":"\"; system('x')\nq"},
                "Port2":{"portState":"PTP_MASTER","interface":"eth1"}})")
        .add("metadata", 1,
             R"("valid":true,"metadata":{"gmClockId":"a&b",
                "Port1":{"portState":"PTP_SLAVE","interface":"\"; system('x')\nq"},
                "Port2":{"portState":"PTP_MASTER","interface":"eth1"}})")
        .add("quality", 1, roleChange("usable"))
        .pairs(6, 2)
        .pairs(12, 10)
        .add("error", 12, R"("operation":"<u>","problem":"it's broken")")
        .add("summary", 13);
    return record.text;
}

class ToolReportTest : public ToolTest {
protected:
    Result report(const Words& words, const std::vector<std::string>& environment = {}) const {
        Words command{HOST_TOOL, "report"};
        command.insert(command.end(), words.begin(), words.end());
        Child child(command, environment);
        const int status = child.wait(std::chrono::minutes(1));
        return {status, child.output(), child.errors()};
    }

    /// The page of this record. A report that fails, fails the test.
    std::string pageOf(const std::string& record) const {
        writeFile(recording, record);
        const auto result = report({recording, "-o", page});
        EXPECT_EQ(result.status, 0) << result.errors;
        EXPECT_EQ(result.output + result.errors, "");
        return contentOf(page);
    }

    std::string recording = folder.path("run.jsonl");
    std::string page = folder.path("run.html");
};

/// Those that draw.
class ToolReportDrawingTest : public ToolReportTest {
protected:
    void SetUp() override {
        if (installed("gnuplot").empty()) {
            GTEST_SKIP() << "SKIPPED: there is no gnuplot (package gnuplot-nox)";
        }
    }

    /// The drawing of this name in a page, as wide screens show it.
    static std::string drawing(const std::string& html, const std::string& name) {
        const auto begin = html.find("<g id=\"" + name + "_wide\"");
        return begin == std::string::npos ? ""
                                          : html.substr(begin, html.find("</svg>", begin) - begin);
    }

    /// The data of a line: what follows d= in the path of the line's colour.
    static std::string pathOf(const std::string& drawing) {
        const std::string start = "stroke='rgb( 43, 108, 176)'  d='";
        const auto begin = drawing.find(start);
        if (begin == std::string::npos) {
            return "";
        }
        return drawing.substr(begin + start.size(),
                              drawing.find('\'', begin + start.size()) - begin - start.size());
    }
};

} // namespace

TEST_F(ToolReportDrawingTest, HasEverySection) {
    const auto html = pageOf(wholeRecord());
    for (const char* title : {"Summary", "Offset", "Distribution of the offset", "Time error",
                              "MTIE", "TDEV", "Allan deviation", "Pair intervals", "Poll delay",
                              "Quality", "Port states", "Errors", "Last metadata", "Settings"}) {
        EXPECT_THAT(html, HasSubstr("<h2>" + std::string(title) + "</h2>"));
    }
    EXPECT_EQ(count(html, "<svg role=\"img\" class=\"wide\""), 9U);
    EXPECT_EQ(count(html, "<svg role=\"img\" class=\"narrow\""), 9U);
    EXPECT_EQ(count(html, "<title>"), 19U);
    EXPECT_THAT(html, HasSubstr("<tr><td>Time pairs</td><td>18</td></tr>"));
    EXPECT_THAT(html, HasSubstr("<tr><td>Quality usable</td><td>12 s (92.3 %)</td></tr>"));
    EXPECT_THAT(html, Not(HasSubstr("class=\"note\"")));
}

TEST_F(ToolReportDrawingTest, OffsetIsALineThroughEveryPairThatIsBrokenInTheGap) {
    const auto path = pathOf(drawing(pageOf(wholeRecord()), "offset"));
    EXPECT_EQ(count(path, "M"), 2U) << path;
    EXPECT_EQ(count(path, "L"), 16U) << path;
}

TEST_F(ToolReportDrawingTest, AllanDeviationHasAPointForEachOctave) {
    // 82 places of 125 ms: 1, 2 and 4 of them fit into the pairs between gaps.
    const auto html = pageOf(wholeRecord());
    EXPECT_EQ(count(pathOf(drawing(html, "deviation")), "L"), 2U);
    EXPECT_THAT(html, HasSubstr("<tr><td>0.125 s</td><td>1.131e-08</td><td>14</td></tr>"));
    EXPECT_THAT(html, HasSubstr("missed Syncs and gaps: 58."));
}

TEST_F(ToolReportDrawingTest, TimeLinesHaveABarForEachState) {
    const auto html = pageOf(wholeRecord());
    // One more shades the outage.
    EXPECT_EQ(count(drawing(html, "quality"), "<polygon"), 3U);
    EXPECT_EQ(count(drawing(html, "ports"), "<polygon"), 4U);
    EXPECT_THAT(drawing(html, "ports"), HasSubstr("Port2 eth1"));
}

TEST_F(ToolReportDrawingTest, NothingOfTheRecordingIsTakenForHtmlOrForACommand) {
    const auto html = pageOf(wholeRecord());
    for (const char* harm : {"<script", "<b>", "<i>", "<u>", "a&b"}) {
        EXPECT_THAT(html, Not(HasSubstr(harm)));
    }
    EXPECT_THAT(html, HasSubstr("&lt;script&gt;alert(1)&lt;/script&gt;"));
    EXPECT_THAT(drawing(html, "ports"), HasSubstr("Port1 ?? system??x"));
}

TEST_F(ToolReportDrawingTest, NeedsNothingFromElsewhere) {
    const auto html = pageOf(wholeRecord());
    EXPECT_EQ(count(html, "http"), count(html, "xmlns=\"http") + count(html, "xmlns:xlink=\"http"));
    EXPECT_THAT(html, AllOf(Not(HasSubstr("src=")), Not(HasSubstr("url(")),
                            Not(HasSubstr("@import")), Not(HasSubstr("<link"))));
    EXPECT_EQ(count(html, "href="), count(html, "href='#"));
}

TEST_F(ToolReportDrawingTest, IsWellFormedAndEveryIdIsUnique) {
    const auto checker = installed("xmllint");
    if (checker.empty()) {
        GTEST_SKIP() << "SKIPPED: there is no xmllint (package libxml2-utils)";
    }
    const auto html = pageOf(wholeRecord());
    Child child({checker, "--nonet", "--noout", page});
    EXPECT_EQ(child.wait(), 0) << child.errors();
    std::vector<std::string> ids;
    const std::regex id(R"(\bid=['"]([^'"]*)['"])");
    for (std::sregex_iterator each(html.begin(), html.end(), id), end; each != end; ++each) {
        ids.push_back((*each)[1]);
    }
    std::sort(ids.begin(), ids.end());
    EXPECT_GT(ids.size(), 9U);
    EXPECT_EQ(std::adjacent_find(ids.begin(), ids.end()), ids.end());
}

TEST_F(ToolReportDrawingTest, ABrowserShowsAllOfIt) {
    const auto browser = installed("chromium");
    if (browser.empty()) {
        GTEST_SKIP() << "SKIPPED: there is no chromium";
    }
    pageOf(wholeRecord());
    Child child({browser, "--headless", "--no-sandbox", "--disable-gpu",
                 "--user-data-dir=" + folder.path("browser"), "--dump-dom", "file://" + page});
    ASSERT_EQ(child.wait(std::chrono::minutes(1)), 0) << child.errors();
    EXPECT_EQ(count(child.output(), "<section>"), 14U);
    EXPECT_EQ(count(child.output(), "<svg role=\"img\""), 18U);
    EXPECT_EQ(count(child.output(), "</svg>"), 18U);
}

TEST_F(ToolReportDrawingTest, OnePairAloneIsEnough) {
    const auto html = pageOf(Record().pairs(1, 1).text);
    EXPECT_THAT(html, HasSubstr("There is one pair only."));
    EXPECT_EQ(count(pathOf(drawing(html, "offset")), "L"), 1U);
}

TEST_F(ToolReportDrawingTest, ExtremeOffsetsAreDrawn) {
    const std::string members = R"("reference":0,"local":5,"offset":)";
    const auto html = pageOf(Record()
                                 .add("pair", 1, members + "9223372036854775807")
                                 .add("pair", 2, members + "-9223372036854775808")
                                 .text);
    EXPECT_THAT(html, HasSubstr("9.223e+09 s"));
    EXPECT_NE(drawing(html, "histogram"), "");
}

TEST_F(ToolReportDrawingTest, ManyPairsAreBandsWithTheirMedian) {
    const auto html = pageOf(Record().pairs(20000, 1).text);
    EXPECT_THAT(html, HasSubstr("For each 8 s of time: the median (line)"));
    const auto bands = drawing(html, "offset");
    EXPECT_EQ(count(bands, "fill-opacity = '0.300000'"), 1U);
    EXPECT_EQ(count(bands, "fill-opacity = '0.500000'"), 1U);
    EXPECT_LE(count(pathOf(bands), "L"), 625U);
    EXPECT_GE(count(pathOf(bands), "L"), 500U);
}

TEST_F(ToolReportDrawingTest, PairsThatAreNoMeasurementsAreNamedAndLeftOut) {
    const auto html =
        pageOf(Record()
                   .add("quality", 1, roleChange("usable"))
                   .pair(1, 0)
                   .pair(2, 0)
                   .pair(3, -4999940)
                   .pair(4, -4999950)
                   .add("quality", 5, roleChange("unusable"))
                   .add("pair", 5, R"("reference":4999950,"local":0,"offset":-4999950)")
                   .add("quality", 7, roleChange("usable"))
                   .pair(7, -4999950)
                   .pair(8, -4999960)
                   .text);
    EXPECT_THAT(html,
                HasSubstr("<tr><td>Time pairs</td><td>7, 1 of 1970, 3 with a false offset</td>"));
    EXPECT_THAT(html, HasSubstr("Left out: 1 pair of 1970. A grandmaster went,"));
    EXPECT_THAT(html, HasSubstr("Left out: 3 pairs with a false offset. A grandmaster came,"));
    EXPECT_THAT(html, HasSubstr("<dt>max</dt><dd>-4999940 ns</dd>"));
    EXPECT_THAT(html, HasSubstr("<dt>max</dt><dd>4 s</dd>"));
    EXPECT_THAT(html, HasSubstr("<dt>max</dt><dd>3000000 ns</dd>"));
    EXPECT_THAT(html, Not(HasSubstr("delayMechanism")));
}

TEST_F(ToolReportDrawingTest, OnlyOffsetsOfZeroAreAskedFor) {
    Record record;
    record.add("quality", 1, roleChange("usable"));
    for (int i = 1; i <= 54; ++i) {
        record.pair(i, 0);
    }
    const auto html = pageOf(record.text);
    EXPECT_THAT(html, HasSubstr("<p class=\"note\">offset exactly 0 in 54 of 54 pairs: no delay is "
                                "measured: delayMechanism?</p>"));
    EXPECT_THAT(html, HasSubstr("No offset is a measurement."));
    EXPECT_THAT(html, HasSubstr("<h2>Pair intervals</h2>"));
    EXPECT_THAT(html, Not(HasSubstr("<h2>Allan deviation</h2>")));
}

TEST_F(ToolReportDrawingTest, OnlyZerosThatAreTheCauseAreToldOnce) {
    ASSERT_EQ(play("zeros", {"--record", recording}).status, 1);
    const auto html = pageOf(contentOf(recording));
    EXPECT_EQ(count(html, "class=\"note\""), 1U);
    EXPECT_THAT(html, HasSubstr("<p class=\"note\">offset exactly 0 in 20 of 20 pairs: no delay is "
                                "measured: delayMechanism? -- mend: --set delayMechanism=..., as "
                                "the network has it</p>"));
    EXPECT_THAT(html, HasSubstr("No offset is a measurement."));
}

TEST_F(ToolReportDrawingTest, ASpikeIsMarkedAtTheEdgeAndDoesNotFlattenTheOthers) {
    Record record;
    for (int i = 0; i < 400; ++i) {
        record.pair(1 + i * 0.125, i == 200 ? 5000000 : 100 + i % 7);
    }
    const auto html = pageOf(record.text);
    EXPECT_THAT(html, HasSubstr("Above the edge: 1, up to 5 ms."));
    EXPECT_THAT(drawing(html, "offset"), HasSubstr("offset in ns"));
    EXPECT_EQ(count(drawing(html, "offset"), "color='rgb(217,  72,  15)'"), 1U);
}

TEST_F(ToolReportDrawingTest, NanosecondsAreSeenBehindAnEpochOffset) {
    Record record;
    record.add("epoch-offset", 0.5, R"("offset":-37000000000)");
    for (int i = 0; i < 100; ++i) {
        record.pair(1 + i * 0.125, -36999999750 + i % 7);
    }
    const auto html = pageOf(record.text);
    EXPECT_THAT(html, HasSubstr("0 on the axis stands for -36999999750 ns."));
    EXPECT_THAT(html, HasSubstr("<dt>max</dt><dd>-36999999744 ns</dd>"));
    EXPECT_THAT(drawing(html, "offset"), HasSubstr("<text>offset in ns</text>"));
    EXPECT_THAT(drawing(html, "histogram"), HasSubstr("<text>offset in ns</text>"));
}

TEST_F(ToolReportDrawingTest, AxesHaveTheTimeOfDayAndOutagesAreShaded) {
    const auto offset = drawing(pageOf(wholeRecord()), "offset");
    EXPECT_THAT(offset, AllOf(HasSubstr(">UTC, from 1970-01-01<"), HasSubstr(">00:16:44<"),
                              HasSubstr(">time since the host's start in s<")));
    EXPECT_EQ(count(offset, "fill = 'rgb(224, 142,  11)'"), 1U);
}

TEST_F(ToolReportDrawingTest, NarrowScreensHaveDrawingsWhoseTextTheyCanRead) {
    // A phone of 390 pixels leaves 358 to a drawing: no text gets less than 13 * 358 / 350.
    const auto html = pageOf(wholeRecord());
    const std::regex drawings(R"(class="narrow"[^>]*viewBox="0 0 350 )");
    EXPECT_EQ(std::distance(std::sregex_iterator(html.begin(), html.end(), drawings), {}), 9);
    EXPECT_EQ(count(html, "font-size=\""), count(html, "font-size=\"13.00\""));
}

TEST_F(ToolReportDrawingTest, TheSameRecordGivesTheSamePage) {
    const auto first = pageOf(wholeRecord());
    EXPECT_EQ(pageOf(wholeRecord()), first);
}

TEST_F(ToolReportDrawingTest, ADashIsTheStandardOutput) {
    const auto html = pageOf(wholeRecord());
    const auto result = report({recording, "-o", "-"});
    EXPECT_EQ(result.status, 0);
    EXPECT_EQ(result.errors, "");
    EXPECT_EQ(result.output, html);
}

TEST_F(ToolReportTest, AnEmptyRecordingGivesAPageThatSaysSo) {
    EXPECT_THAT(pageOf(""), HasSubstr("The recording is empty."));
}

TEST_F(ToolReportTest, ARecordingOfNothingButTheStartNeedsNoDrawing) {
    const auto html = pageOf(Record().add("started", 1).text);
    EXPECT_THAT(html,
                AllOf(HasSubstr("There are no time pairs."), HasSubstr("No quality was reported."),
                      HasSubstr("No port"), HasSubstr("No errors, warnings or refused calls.")));
}

TEST_F(ToolReportTest, ADeadDaemonIsTheFirstThingTold) {
    Child child(command({"--interface", "eth0", "--set", "child=echo bad option >&2; exit 3",
                         "--json", "--record", recording}));
    ASSERT_TRUE(child.waitForOutput("\"event\":\"daemon-ended\""));
    child.signal(SIGTERM);
    ASSERT_EQ(child.wait(), 1);
    const auto html = pageOf(contentOf(recording));
    EXPECT_THAT(html, ContainsRegex("<p>Recording of vantel-host</p>\n<p class=\"note\">ptp4l, "
                                    "process [0-9]+, ended with status 3; its last words: bad "
                                    "option -- mend: &quot;vantel-host check&quot; with the "));
    EXPECT_THAT(html, HasSubstr("<tr><td>Errors</td><td>1</td></tr>"));
    EXPECT_THAT(html, AllOf(HasSubstr("<td>daemon-ended</td><td>ptp4l, process "),
                            HasSubstr("<td>cause</td><td>ptp4l, process "),
                            HasSubstr("<td>mend</td><td>&quot;vantel-host check")));
}

TEST_F(ToolReportTest, AKilledHostAndACutLineAreTold) {
    const auto html = pageOf(Record().add("started", 1).text + R"({"event":"pa)");
    EXPECT_THAT(html, AllOf(HasSubstr("The last line of the recording is cut"),
                            HasSubstr("the host still ran, or was killed")));
}

TEST_F(ToolReportTest, WithoutGnuplotThereIsAnErrorAndNoPage) {
    writeFile(recording, wholeRecord());
    const auto result = report({recording, "-o", page}, {"PATH=" + folder.path("nowhere")});
    EXPECT_EQ(result.status, 1);
    EXPECT_EQ(result.errors, "vantel-host: there is no gnuplot; Debian's package is gnuplot-nox\n");
    EXPECT_FALSE(std::filesystem::exists(page));
}

TEST_F(ToolReportTest, AFileThatIsNoRecordingIsAMistake) {
    writeFile(recording, "hello\n" + Record().add("started", 1).text.substr(1));
    const auto result = report({recording, "-o", page});
    EXPECT_EQ(result.status, 2);
    EXPECT_THAT(result.errors, HasSubstr(recording + ":1: this is no record of vantel-host: "));
    EXPECT_FALSE(std::filesystem::exists(page));
}

TEST_F(ToolReportTest, WhatCannotBeReadOrWrittenIsNamed) {
    EXPECT_EQ(report({"/nowhere/a", "-o", page}).errors,
              "vantel-host: cannot read /nowhere/a: No such file or directory\n");
    EXPECT_EQ(report({folder.path(""), "-o", page}).errors,
              "vantel-host: there is no record in " + folder.path("") + "\n");
    writeFile(recording, "");
    EXPECT_EQ(report({recording, "-o", "/nowhere/a"}).errors,
              "vantel-host: cannot write /nowhere/a: No such file or directory\n");
    const auto full = report({recording, "-o", "/dev/full"});
    EXPECT_EQ(full.status, 1);
    EXPECT_EQ(full.errors, "vantel-host: cannot write /dev/full: No space left on device\n");
    Child child(
        {"/bin/sh", "-c", R"(exec "$0" report "$1" -o - >/dev/full)", HOST_TOOL, recording});
    EXPECT_EQ(child.wait(), 1);
    EXPECT_EQ(child.errors(),
              "vantel-host: cannot write the standard output: No space left on device\n");
}

TEST_F(ToolReportTest, ALongerPageIsReplacedToItsEnd) {
    writeFile(page, std::string(1000000, 'x'));
    EXPECT_THAT(pageOf(""), EndsWith("</html>\n"));
}

TEST_F(ToolReportTest, TheSameRecordTwiceIsAMistake) {
    writeFile(recording, wholeRecord());
    const auto result = report({recording, recording, "-o", page});
    EXPECT_EQ(result.status, 2);
    EXPECT_EQ(result.errors,
              "vantel-host: " + recording + " and " + recording + " hold the same record\n");
}

TEST_F(ToolReportDrawingTest, ThePageOfSeveralFilesTellsItsGaps) {
    Record first;
    first.add("loaded", 0, R"("name":"n","library":"l")")
        .add("quality", 1, roleChange("usable"))
        .pairs(8, 2)
        .add("summary", 10);
    Record second;
    second.add("loaded", 60, R"("name":"n","library":"l")")
        .add("quality", 61, roleChange("unusable"))
        .pairs(4, 62)
        .add("lost", 70, R"("events":40,"seconds":5,"problem":"No space left on device")");
    const auto records = folder.path("records");
    std::filesystem::create_directory(records);
    writeFile(records + "/a", second.text + "hello\n");
    writeFile(records + "/b", first.text);
    const auto result = report({records, "-o", page});
    ASSERT_EQ(result.status, 0) << result.errors;
    const auto html = contentOf(page);
    EXPECT_THAT(html, HasSubstr("<h1>records</h1>"));
    EXPECT_THAT(html, HasSubstr("<p class=\"note\">Not all is here, or in its order: 3 gaps, see "
                                "below.</p>"));
    EXPECT_THAT(html, HasSubstr("<tr><td>Files</td><td>2</td></tr>\n"
                                "<tr><td>Runs</td><td>2</td></tr>"));
    EXPECT_THAT(html, HasSubstr("<td>1970-01-01 00:16:50 UTC</td><td>50 s</td>"
                                "<td>another run begins</td>"));
    EXPECT_THAT(html, HasSubstr("<td>5 s</td><td>40 events could not be written: No space left on "
                                "device</td>"));
    EXPECT_THAT(html, HasSubstr("this line is no event: "));
    EXPECT_THAT(html, HasSubstr("<tr><td>Time pairs</td><td>12</td></tr>"));
    EXPECT_THAT(drawing(html, "offset"), HasSubstr(">time since the record's begin in s<"));
    // Two outages could be: that between the runs is none, as nothing is known of it.
    EXPECT_EQ(count(drawing(html, "offset"), "fill = 'rgb(224, 142,  11)'"), 1U);
}

TEST_F(ToolReportDrawingTest, HealthHasATimeLineWhereItWasTold) {
    Record record;
    record.add("loaded", 0, R"("name":"n","library":"l")")
        .add("health", 4, R"("state":"locked","reason":"<r>","before":"starting","spent":4)")
        .add("health", 9, R"("state":"lost","reason":"s","before":"locked","spent":5)")
        .add("restart", 10, R"("cause":"it was lost","delay":1,"restarts":1)")
        .add("summary", 12);
    const auto html = pageOf(record.text);
    EXPECT_THAT(html, HasSubstr("<h2>Health</h2>"));
    EXPECT_EQ(count(drawing(html, "health"), "<polygon"), 3U);
    EXPECT_THAT(html, HasSubstr("<td>4.000 s</td><td>5 s</td><td>locked</td><td>&lt;r&gt;</td>"));
    EXPECT_THAT(html, HasSubstr("<tr><td>Restarted sessions</td><td>1</td></tr>"));
    EXPECT_THAT(html, HasSubstr("<td>restart</td><td>it was lost</td>"));
    EXPECT_THAT(pageOf(wholeRecord()), Not(HasSubstr("<h2>Health</h2>")));
}

TEST_F(ToolReportTest, TheRecordingIsNotReplacedByItsPage) {
    writeFile(recording, wholeRecord());
    EXPECT_EQ(report({recording, "-o", recording}).status, 2);
    EXPECT_EQ(contentOf(recording), wholeRecord());
}

TEST_F(ToolReportDrawingTest, MakesAPageOfARealRecord) {
    EXPECT_EQ(play("quality pairs metadata bad-metadata", {"--record", recording}).status, 1);
    const auto result = report({recording, "-o", page});
    EXPECT_EQ(result.status, 0) << result.errors;
    EXPECT_THAT(contentOf(page),
                AllOf(HasSubstr("<td>Time pairs</td><td>3</td>"),
                      HasSubstr("<td>Errors</td><td>1</td>"), Not(HasSubstr("class=\"note\""))));
}
