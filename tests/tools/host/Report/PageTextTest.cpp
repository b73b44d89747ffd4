// How texts and numbers are written on a page.

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include "Report/Html.h"
#include "Report/Units.h"

using namespace vantelhost;

TEST(Html, WhatHasAMeaningIsEscaped) {
    EXPECT_EQ(escaped("<a b='c' d=\"e\">&amp;\n\xC3\xA4"),
              "&lt;a b=&#39;c&#39; d=&quot;e&quot;&gt;&amp;amp;\\x0A\xC3\xA4");
}

TEST(Html, CellsOfATableAreEscaped) {
    EXPECT_EQ(table({"<"}, {{">"}, {"&"}}),
              "<div class=\"table\"><table>\n<thead><tr><th>&lt;</th></tr>\n</thead>\n<tbody>\n"
              "<tr><td>&gt;</td></tr>\n<tr><td>&amp;</td></tr>\n</tbody>\n</table></div>\n");
}

TEST(Html, ALongWordMayBreakWhereItsPartsEnd) {
    EXPECT_EQ(table({}, {{"shorter_than_24_letters a/b, /usr/lib/aarch64-linux-gnu/libx_y.so"}}),
              "<div class=\"table\"><table>\n<tbody>\n<tr><td>shorter_than_24_letters a/b, "
              "/<wbr />usr/<wbr />lib/<wbr />aarch64-linux-gnu/<wbr />libx_<wbr />y.so</td></tr>\n"
              "</tbody>\n</table></div>\n");
}

TEST(Html, DefinitionsAreEscaped) {
    EXPECT_EQ(definitions({{"<", ">"}, {"a", "b"}}),
              "<dl>\n<div><dt>&lt;</dt><dd>&gt;</dd></div>\n<div><dt>a</dt><dd>b</dd></div>\n"
              "</dl>\n");
}

TEST(Units, TimesHaveTheUnitOfTheirSize) {
    EXPECT_EQ(shownTime(0), "0 ns");
    EXPECT_EQ(shownTime(-9999), "-9999 ns");
    EXPECT_EQ(shownTime(12345), "12.35 µs");
    EXPECT_EQ(shownTime(-125400000), "-125.4 ms");
    EXPECT_EQ(shownTime(37.00012e9), "37 s");
}

TEST(Units, DurationsToo) {
    EXPECT_EQ(shownDuration(0.506), "0.506 s");
    EXPECT_EQ(shownDuration(299), "299 s");
    EXPECT_EQ(shownDuration(300), "5 min");
    EXPECT_EQ(shownDuration(86400), "24 h");
}

TEST(Units, MomentsAreInUtc) {
    EXPECT_EQ(shownMoment(1795261620276518056), "2026-11-21 11:47:00 UTC");
    EXPECT_EQ(shownMoment(4102444799999999999), "2099-12-31 23:59:59 UTC");
}
