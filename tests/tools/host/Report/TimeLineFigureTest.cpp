#include "Report/TimeLineFigure.h"

#include <gtest/gtest.h>

using namespace vantelhost;

TEST(TimeLineFigure, APortThatFollowsIsAsGreenAsASlave) {
    const TimeLine timeLine{
        {"Port1 eth0"},
        {{0, 0, 1, "PTP_FAULTY"}, {0, 1, 2, "PTP_UNCALIBRATED"}, {0, 2, 3, "PTP_SLAVE"}}};
    EXPECT_EQ(timeLineLegend(timeLine),
              "<ul class=\"legend\">\n"
              "<li><span style=\"background:#c0392b\"></span>PTP_FAULTY</li>\n"
              "<li><span style=\"background:#2a9d4a\"></span>PTP_UNCALIBRATED</li>\n"
              "<li><span style=\"background:#2a9d4a\"></span>PTP_SLAVE</li>\n"
              "</ul>\n");
}
