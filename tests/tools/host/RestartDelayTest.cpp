#include "RestartDelay.h"

#include <gtest/gtest.h>

using vantelhost::RestartDelay;

TEST(RestartDelay, DoublesUpToAMinuteAndBeginsAnewAfterAReset) {
    RestartDelay delay;
    for (const double seconds : {1, 2, 4, 8, 16, 32, 60, 60}) {
        EXPECT_EQ(delay.next(), seconds);
    }
    delay.reset();
    EXPECT_EQ(delay.next(), 1);
    EXPECT_EQ(delay.next(), 2);
}
