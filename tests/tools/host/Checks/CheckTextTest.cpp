#include "Checks/CheckText.h"

#include <gtest/gtest.h>

using namespace vantelhost;

TEST(CheckText, HasALineForEachCheck) {
    EXPECT_EQ(checkLines({{"one", good("fine")},
                          {"another", bad("a\nb", "do \x1b c")},
                          {"third", doubtful("hm", "")},
                          {"x", skipped("why")}}),
              "ok    one      fine\n"
              "FAIL  another  a\\x0Ab -- mend: do \\x1B c\n"
              "warn  third    hm\n"
              "skip  x        why\n");
}

TEST(CheckText, IsOneObjectForPrograms) {
    EXPECT_EQ(checkJson({{"one", good("fine")}, {"another", bad("a\nb", "do c")}}).dump(),
              R"({"passed":false,"checks":[)"
              R"({"check":"one","result":"ok","found":"fine","mend":""},)"
              R"({"check":"another","result":"fail","found":"a\nb","mend":"do c"}]})");
    EXPECT_EQ(checkJson({{"a", doubtful("b", "c")}, {"d", skipped("e")}}).dump(),
              R"({"passed":true,"checks":[)"
              R"({"check":"a","result":"warn","found":"b","mend":"c"},)"
              R"({"check":"d","result":"skip","found":"e","mend":""}]})");
}

TEST(CheckText, OnlyFailuresCount) {
    EXPECT_TRUE(allHold({{"a", good("")}, {"b", doubtful("", "")}, {"c", skipped("")}}));
    EXPECT_FALSE(allHold({{"a", good("")}, {"b", bad("", "")}}));
}
