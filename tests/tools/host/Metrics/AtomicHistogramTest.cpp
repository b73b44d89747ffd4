#include "Metrics/AtomicHistogram.h"

#include <atomic>
#include <cmath>
#include <thread>

#include <gtest/gtest.h>

using namespace vantelhost;

TEST(AtomicHistogram, ABoundBelongsToItsBucketAndCountsAddUp) {
    AtomicHistogram histogram({1, 10});
    for (const double value : {0.5, 1.0, 1.5, 10.0, 10.5}) {
        histogram.count(value);
    }
    const auto read = histogram.read();
    ASSERT_EQ(read.bucket.size(), 3U);
    EXPECT_EQ(read.bucket[0].upper_bound, 1);
    EXPECT_EQ(read.bucket[0].cumulative_count, 2U);
    EXPECT_EQ(read.bucket[1].upper_bound, 10);
    EXPECT_EQ(read.bucket[1].cumulative_count, 4U);
    EXPECT_TRUE(std::isinf(read.bucket[2].upper_bound));
    EXPECT_EQ(read.bucket[2].cumulative_count, 5U);
    EXPECT_EQ(read.sample_count, 5U);
    EXPECT_EQ(read.sample_sum, 23.5);
}

TEST(AtomicHistogram, TheCountIsThatOfTheBucketsAlsoWhileItCounts) {
    AtomicHistogram histogram({1});
    std::atomic<bool> isOver{false};
    std::thread counter([&] {
        for (int i = 0; i < 100000; ++i) {
            histogram.count(i % 2);
        }
        isOver = true;
    });
    while (!isOver) {
        const auto read = histogram.read();
        EXPECT_EQ(read.sample_count, read.bucket.back().cumulative_count);
    }
    counter.join();
    EXPECT_EQ(histogram.read().sample_count, 100000U);
    EXPECT_EQ(histogram.read().sample_sum, 50000);
}
