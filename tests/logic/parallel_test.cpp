// Work shared by threads: each part is done once; and how work ends early.
#include <algorithm>
#include <chrono>
#include <new>
#include <thread>
#include <vector>

#include <gtest/gtest.h>

#include "parallel.h"
#include "watch.h"

namespace {

using namespace booleq;

TEST(Parallel, EveryElementIsDoneOnce)
{
    for (const unsigned int numThreads : {0u, 1u, 2u, 5u}) {
        for (const size_t count : {size_t(0), size_t(1), size_t(99), size_t(100), size_t(1001)}) {
            std::vector<int> times(count);
            RunInParts(count, 100, LutWork{numThreads}, [&](size_t begin, size_t end) {
                ASSERT_LE(end - begin, 100u);
                for (size_t place = begin; place < end; ++place)
                    ++times[place];
            });
            ASSERT_EQ(std::count(times.begin(), times.end(), 1),
                      static_cast<std::ptrdiff_t>(count));
        }
    }
}

TEST(Parallel, WhatOneThrowsEndsAll)
{
    EXPECT_THROW(RunInParts(100000, 1, LutWork{3},
                            [&](size_t begin, size_t) {
                                if (begin == 5000)
                                    throw std::bad_alloc();
                            }),
                 std::bad_alloc);
}

TEST(Parallel, TheWatcherEndsItAndIsCalledByTheCallerAlone)
{
    static std::thread::id caller;
    static int numCalls;
    caller = std::this_thread::get_id();
    numCalls = 0;
    SetWatch([] {
        EXPECT_EQ(std::this_thread::get_id(), caller);
        if (++numCalls == 10)
            throw 10;
    });
    const auto run = [](size_t, size_t) {
        Watch(); // in any thread
        std::this_thread::sleep_for(std::chrono::microseconds(100));
    };
    EXPECT_THROW(RunInParts(1000000000, 1, LutWork{3}, run), int);
    SetWatch(nullptr);
}

TEST(Parallel, TheFirstPlaceIsFoundWhoeverFindsOne)
{
    const auto findEnd = [](size_t, size_t end) { return end; };
    EXPECT_EQ(FindFirstInParts(1000, 10, LutWork{3}, findEnd), kNoLut);
    EXPECT_EQ(FindFirstInParts(0, 10, LutWork{3}, findEnd), kNoLut);
    for (const size_t first : {size_t(0), size_t(499), size_t(999)})
        EXPECT_EQ(FindFirstInParts(1000, 10, LutWork{3},
                                   [first](size_t begin, size_t end) {
                                       return first >= begin && first < end ? first : end;
                                   }),
                  first);
}

} // namespace
