// A parked thread goes on when resumed, whether the resume comes before it parks, while it
// watches for it, or after it has gone to sleep; and it ends when released, in each of those.
#include "platform/ThreadPark.h"

#include <gtest/gtest.h>

#include <atomic>
#include <chrono>
#include <thread>

using namespace std::chrono_literals;

namespace {

// A thread that parks again after every resume and counts its rounds, until released.
struct Parker {
    explicit Parker(int64_t spinMicros)
    {
        park.SetSpin(spinMicros);
        thread = std::thread([this] {
            while (park.Park())
                rounds++;
            ended = true;
        });
    }
    ~Parker()
    {
        if (thread.joinable()) {
            park.Release();
            thread.join();
        }
    }
    bool WaitForRounds(int n)
    {
        const auto until = std::chrono::steady_clock::now() + 10s;
        while (rounds.load() < n && std::chrono::steady_clock::now() < until)
            std::this_thread::sleep_for(100us);
        return rounds.load() >= n;
    }
    ThreadPark park;
    std::atomic<int> rounds { 0 };
    std::atomic<bool> ended { false };
    std::thread thread;
};

} // namespace

TEST(ThreadPark, EveryResumeIsAnsweredWithOrWithoutWatching)
{
    for (const int64_t spin : { int64_t(0), int64_t(250), int64_t(20000) }) {
        Parker parker(spin);
        for (int n = 1; n <= 50; n++) {
            parker.park.Resume();
            ASSERT_TRUE(parker.WaitForRounds(n)) << "spin " << spin << ", round " << n;
            // Some resumes come while the thread still watches, some after it sleeps.
            if (n % 10 == 0)
                std::this_thread::sleep_for(2ms);
        }
        EXPECT_EQ(parker.rounds.load(), 50);
    }
}

TEST(ThreadPark, AResumeBeforeTheParkIsKeptOnce)
{
    ThreadPark park;
    park.SetSpin(1000);
    park.Resume();
    park.Resume(); // remembered once, not twice
    EXPECT_TRUE(park.Park());
    std::atomic<bool> back { false };
    std::thread second([&] {
        park.Park();
        back = true;
    });
    std::this_thread::sleep_for(20ms); // well past the watching, asleep
    EXPECT_FALSE(back.load());
    park.Resume();
    second.join();
    EXPECT_TRUE(back.load());
}

TEST(ThreadPark, AReleaseEndsTheThreadWhileItWatchesAndWhileItSleeps)
{
    {
        Parker watching(1000000); // a second of watching: the release comes within it
        std::this_thread::sleep_for(1ms);
        const auto start = std::chrono::steady_clock::now();
        watching.park.Release();
        watching.thread.join();
        EXPECT_TRUE(watching.ended.load());
        EXPECT_LT(std::chrono::steady_clock::now() - start, 500ms);
    }
    {
        Parker sleeping(100);
        std::this_thread::sleep_for(20ms);
        sleeping.park.Release();
        sleeping.thread.join();
        EXPECT_TRUE(sleeping.ended.load());
        EXPECT_EQ(sleeping.rounds.load(), 0);
    }
}

TEST(ThreadPark, WatchingGivesUpWhenItsTimeIsUp)
{
    std::atomic<bool> flag { false };
    const auto start = std::chrono::steady_clock::now();
    EXPECT_FALSE(SpinUntil(2000, [&] { return flag.load(); }));
    EXPECT_GE(std::chrono::steady_clock::now() - start, 2ms);
    flag = true;
    EXPECT_TRUE(SpinUntil(0, [&] { return flag.load(); }));
    EXPECT_TRUE(SpinUntil(1000000, [&] { return flag.load(); }));
}
