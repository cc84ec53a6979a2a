// Ordered parallel work: results reach the caller in task order, whatever the threads do.

#include <gtest/gtest.h>

#include <chrono>
#include <stdexcept>
#include <thread>

#include "search/OrderedWork.h"

namespace {

// Tasks of uneven length, so that later tasks often finish before earlier ones.
int SlowSquare(std::size_t i) {
    if (i % 7 == 0)
        std::this_thread::sleep_for(std::chrono::microseconds(200));
    return static_cast<int>(i * i);
}

TEST(OrderedWork, EveryResultArrivesOnceAndInOrder) {
    for (int threads : {1, 2, 3, 8}) {
        for (std::size_t count : {0u, 1u, 2u, 5u, 33u, 1000u}) {
            std::vector<std::size_t> seen;
            bool workerInRange = true;
            const std::function<int(std::size_t, int)> task = [&](std::size_t i, int worker) {
                if (worker < 0 || worker >= threads)
                    workerInRange = false;
                return SlowSquare(i);
            };
            const std::function<bool(std::size_t, int&)> consume = [&](std::size_t i, int& value) {
                EXPECT_EQ(value, static_cast<int>(i * i));
                seen.push_back(i);
                return true;
            };
            EXPECT_TRUE(RunInOrder(threads, count, task, consume));
            std::vector<std::size_t> expected(count);
            for (std::size_t i = 0; i < count; ++i)
                expected[i] = i;
            EXPECT_EQ(seen, expected) << threads << " threads, " << count << " tasks";
            EXPECT_TRUE(workerInRange);
        }
    }
}

TEST(OrderedWork, ARefusedResultEndsTheWork) {
    for (int threads : {1, 2, 4}) {
        std::vector<std::size_t> seen;
        const std::function<int(std::size_t, int)> task = [](std::size_t i, int) {
            return SlowSquare(i);
        };
        const std::function<bool(std::size_t, int&)> consume = [&](std::size_t i, int&) {
            seen.push_back(i);
            return i < 40;
        };
        EXPECT_FALSE(RunInOrder(threads, 500, task, consume));
        ASSERT_EQ(seen.size(), 41u) << threads;
        EXPECT_EQ(seen.back(), 40u);
    }
}

TEST(OrderedWork, AFailedTaskIsRethrownAfterTheResultsBeforeIt) {
    for (int threads : {1, 2, 4}) {
        std::vector<std::size_t> seen;
        const std::function<int(std::size_t, int)> task = [](std::size_t i, int) {
            if (i == 123)
                throw std::runtime_error("task 123");
            return SlowSquare(i);
        };
        const std::function<bool(std::size_t, int&)> consume = [&](std::size_t i, int&) {
            seen.push_back(i);
            return true;
        };
        EXPECT_THROW(RunInOrder(threads, 400, task, consume), std::runtime_error);
        ASSERT_EQ(seen.size(), 123u) << threads;
        EXPECT_EQ(seen.back(), 122u);
    }
}

}  // namespace
