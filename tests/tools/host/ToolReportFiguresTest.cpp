// The figures that the command "report" gives as JSON, and its limits.

#include <algorithm>
#include <cmath>
#include <cstdint>
#include <cstdlib>
#include <functional>

#include <fmt/format.h>

#include "Tool.h"
#include "support/Child.h"

using testing::AllOf;
using testing::HasSubstr;
using testing::Not;
using vantelhost::Json;

namespace {

/// The same names in the same order; numbers may differ in their last digits.
void expectLike(const Json& found, const Json& expected, const std::string& where) {
    ASSERT_EQ(found.is_number(), expected.is_number()) << where;
    if (expected.is_number()) {
        const auto value = expected.get<double>();
        EXPECT_NEAR(found.get<double>(), value, std::abs(value) * 1e-8) << where;
    } else if (expected.is_object() && found.is_object()) {
        std::vector<std::string> names;
        std::vector<std::string> wanted;
        for (const auto& [name, value] : found.items()) {
            names.push_back(name);
        }
        for (const auto& [name, value] : expected.items()) {
            wanted.push_back(name);
            expectLike(found.value(name, Json()), value, fmt::format("{}.{}", where, name));
        }
        EXPECT_EQ(names, wanted) << where;
    } else if (expected.is_array() && found.is_array()) {
        ASSERT_EQ(found.size(), expected.size()) << where;
        for (std::size_t i = 0; i < found.size(); ++i) {
            expectLike(found[i], expected[i], fmt::format("{}[{}]", where, i));
        }
    } else {
        EXPECT_EQ(found, expected) << where;
    }
}

class ToolReportFiguresTest : public ToolTest {
protected:
    Result figures(const Words& options) const {
        Words command{HOST_TOOL, "report", recording};
        command.insert(command.end(), options.begin(), options.end());
        Child child(command);
        const int status = child.wait();
        return {status, child.output(), child.errors()};
    }

    Json json(const Words& options) const {
        Words all{"--json"};
        all.insert(all.end(), options.begin(), options.end());
        const auto result = figures(all);
        EXPECT_EQ(result.status, 0);
        EXPECT_EQ(result.errors, "");
        return Json::parse(result.output, nullptr, false);
    }

    /// A pair each 125 ms, the first one 2 s behind the start of the host at 1000 s.
    void record(std::uint64_t count, const std::function<std::int64_t(std::uint64_t)>& offsetOf) {
        std::string text;
        for (std::uint64_t i = 0; i < count; ++i) {
            const std::uint64_t local = 1002000000000 + i * 125000000;
            const auto offset = offsetOf(i);
            text += fmt::format("{{\"event\":\"pair\",\"t\":{:.3f},\"time\":{},\"reference\":{},"
                                "\"local\":{},\"offset\":{}}}\n",
                                2.003 + 0.125 * static_cast<double>(i), local + 3000000,
                                local - static_cast<std::uint64_t>(offset), local, offset);
        }
        writeFile(recording, text);
    }

    std::string recording = folder.path("run.jsonl");
};

} // namespace

TEST_F(ToolReportFiguresTest, JsonHasStableNames) {
    record(17, [](std::uint64_t i) { return static_cast<std::int64_t>(i * i) - 20; });
    // Of i^2: over w steps up to the last one 16^2 - (16-w)^2; the second difference of m steps is
    // 2 m^2, everywhere.
    const auto expected = Json::parse(R"({
        "record": "run.jsonl",
        "begin_ns": 1000000000000,
        "duration_s": 4.003,
        "pairs": {"measured": 17, "leftOut": 0, "rate_Hz": 8},
        "timeError": {
            "interval_s": 0.125, "missing": 0, "observed_s": 2.125,
            "min_ns": -20, "max_ns": 236, "maxAbs_ns": 236,
            "mean_ns": 68, "rms_ns": 105.943381105,
            "mtie": [
                {"tau_s": 0.125, "mtie_ns": 31, "windows": 16},
                {"tau_s": 0.25, "mtie_ns": 60, "windows": 15},
                {"tau_s": 0.5, "mtie_ns": 112, "windows": 13},
                {"tau_s": 1, "mtie_ns": 192, "windows": 9},
                {"tau_s": 2, "mtie_ns": 256, "windows": 1}
            ],
            "tdev": [
                {"tau_s": 0.125, "tdev_ns": 0.816496581, "sums": 15},
                {"tau_s": 0.25, "tdev_ns": 3.265986324, "sums": 12},
                {"tau_s": 0.5, "tdev_ns": 13.063945295, "sums": 6}
            ],
            "adev": [
                {"tau_s": 0.125, "adev": 1.131370850e-8, "sums": 15},
                {"tau_s": 0.25, "adev": 2.262741700e-8, "sums": 13},
                {"tau_s": 0.5, "adev": 4.525483400e-8, "sums": 9}
            ],
            "constant": {
                "average_s": 1000, "averages": 0, "min_ns": null, "max_ns": null, "cTE_ns": 68
            },
            "dynamic": {
                "cutoff_Hz": 0.1, "lowPassPeakToPeak_ns": null, "highPassPeakToPeak_ns": null,
                "mtie": [], "tdev": []
            }
        },
        "limits": {
            "recommendation": "ITU-T G.8273.2/Y.1368.2 (10/2020), clause 7.1",
            "class": "B",
            "verdicts": [
                {"quantity": "max|TE|", "value_ns": 236, "limit_ns": 70, "tau_s": null,
                 "verdict": "fail"},
                {"quantity": "cTE", "value_ns": 68, "limit_ns": 20, "tau_s": null,
                 "verdict": "open"},
                {"quantity": "dTE_L MTIE", "value_ns": null, "limit_ns": 40, "tau_s": null,
                 "verdict": "open"},
                {"quantity": "dTE_L TDEV", "value_ns": null, "limit_ns": 4, "tau_s": null,
                 "verdict": "open"},
                {"quantity": "dTE_H peak to peak", "value_ns": null, "limit_ns": 70, "tau_s": null,
                 "verdict": "open"}
            ]
        }
    })");
    expectLike(json({"--limits", "class-B"}), expected, "");
}

TEST_F(ToolReportFiguresTest, JsonNeedsNoGnuplotAndMayGoToAFile) {
    record(3, [](std::uint64_t) { return 4; });
    Child child({HOST_TOOL, "report", recording, "--json", "-o", folder.path("figures")},
                {"PATH=" + folder.path("nowhere")});
    EXPECT_EQ(child.wait(), 0);
    EXPECT_EQ(child.output() + child.errors(), "");
    EXPECT_EQ(contentOf(folder.path("figures")), figures({"--json"}).output);
    EXPECT_EQ(Json::parse(contentOf(folder.path("figures"))).at("limits"), Json());
}

TEST_F(ToolReportFiguresTest, WithoutMeasurementsThereIsNoTimeError) {
    record(30, [](std::uint64_t) { return 0; });
    writeFile(recording, R"({"event":"quality","t":1,"time":1001000000000,"quality":"usable",)"
                         R"("reason":"PTP role has changed."})"
                         "\n" +
                             contentOf(recording));
    const auto object = json({"--limits", "class-A"});
    EXPECT_EQ(object.at("pairs").at("leftOut"), 30);
    EXPECT_TRUE(object.at("timeError").is_null());
    EXPECT_TRUE(object.at("limits").is_null());
}

TEST_F(ToolReportFiguresTest, APageNeedsItsName) {
    record(3, [](std::uint64_t) { return 4; });
    const auto result = figures({});
    EXPECT_EQ(result.status, 2);
    EXPECT_THAT(result.errors, HasSubstr("--output is required"));
}

TEST_F(ToolReportFiguresTest, AClassWithoutLimitsIsAMistake) {
    record(3, [](std::uint64_t) { return 4; });
    const auto result = figures({"--json", "--limits", "class-E"});
    EXPECT_EQ(result.status, 2);
    EXPECT_THAT(result.errors, AllOf(HasSubstr("class-E"), HasSubstr("class-A,class-B,class-C")));
}

TEST_F(ToolReportFiguresTest, ThePageShowsVerdictsAndMasks) {
    if (Child({"/bin/sh", "-c", "command -v gnuplot"}).wait() != 0) {
        GTEST_SKIP() << "SKIPPED: there is no gnuplot (package gnuplot-nox)";
    }
    record(17000, [](std::uint64_t i) { return static_cast<std::int64_t>(i % 3) + 40; });
    const auto result = figures({"-o", "-", "--limits", "class-B"});
    ASSERT_EQ(result.status, 0) << result.errors;
    const auto& html = result.output;
    EXPECT_THAT(html, HasSubstr("<h2>Limits of class B</h2>"));
    EXPECT_THAT(html, HasSubstr("<tr><td>max|TE|</td><td>42.00 ns</td><td>70 ns</td><td>-</td>"
                                "<td>pass</td></tr>"));
    EXPECT_THAT(html, HasSubstr("<tr><td>cTE</td><td>41.00 ns</td><td>20 ns</td><td>-</td>"
                                "<td>fail</td></tr>"));
    EXPECT_THAT(html, HasSubstr("<li><span style=\"background:#d9480f\"></span>limit for what is "
                                "below 0.1 Hz</li>"));
    EXPECT_THAT(html, HasSubstr("stroke='rgb(217,  72,  15)'"));
    const auto without = figures({"-o", "-"}).output;
    EXPECT_THAT(without, AllOf(HasSubstr("<h2>MTIE</h2>"), HasSubstr("<h2>TDEV</h2>"),
                               Not(HasSubstr("Limits of")), Not(HasSubstr("d9480f")),
                               Not(HasSubstr("stroke='rgb(217,  72,  15)'"))));
}
