#include "core/Benaphore.h"
#include "platform/Semaphore.h"

#include <gtest/gtest.h>

#include <chrono>
#include <future>
#include <thread>

namespace {

using namespace std::chrono_literals;

// Waits, for at most a few seconds, until pred holds.
template <typename Pred> bool Eventually(Pred pred)
{
    const auto deadline = std::chrono::steady_clock::now() + 5s;
    while (!pred()) {
        if (std::chrono::steady_clock::now() > deadline)
            return false;
        std::this_thread::yield();
    }
    return true;
}

int32_t SemCount(sem_id sem)
{
    int32_t count = -999;
    get_sem_count(sem, &count);
    return count;
}

} // namespace

TEST(Benaphore, UncontendedAcquireAndReleaseTouchNoSemaphore)
{
    Benaphore lock(1, "test benaphore");
    EXPECT_EQ(lock.atom.load(), 0);
    EXPECT_EQ(SemCount(lock.sem), 0);
    EXPECT_EQ(lock.Acquire(), B_OK);
    EXPECT_EQ(lock.lastCount.load(), 0);
    EXPECT_EQ(lock.atom.load(), 1);
    EXPECT_EQ(lock.Release(), B_OK);
    EXPECT_EQ(lock.lastCount.load(), 1);
    // A release that reached the semaphore would have left a unit in it.
    EXPECT_EQ(SemCount(lock.sem), 0);
    EXPECT_EQ(lock.atom.load(), 0);
}

TEST(Benaphore, SecondAcquirerBlocksUntilRelease)
{
    Benaphore lock(1, "test benaphore");
    ASSERT_EQ(lock.Acquire(), B_OK); // first: at once

    std::atomic<bool> through { false };
    auto second = std::async(std::launch::async, [&] {
        const status_t result = lock.Acquire();
        through = true;
        return result;
    });

    // The second thread is parked on the semaphore, not past it.
    ASSERT_TRUE(Eventually([&] { return lock.sem->Waiting() == 1; }));
    EXPECT_FALSE(through.load());
    EXPECT_EQ(lock.atom.load(), 2);

    EXPECT_EQ(lock.Release(), B_OK);
    ASSERT_EQ(second.wait_for(5s), std::future_status::ready);
    EXPECT_EQ(second.get(), B_OK);
    EXPECT_TRUE(through.load());
    EXPECT_EQ(lock.Release(), B_OK);
    EXPECT_EQ(lock.atom.load(), 0);
    EXPECT_EQ(SemCount(lock.sem), 0);
}

TEST(Benaphore, TimedAcquireGivesUpAndKeepsItsCount)
{
    Benaphore lock(1, "test benaphore");
    ASSERT_EQ(lock.Acquire(), B_OK);
    auto waiter = std::async(
        std::launch::async, [&] { return lock.Acquire(1, B_RELATIVE_TIMEOUT, 20000); });
    ASSERT_EQ(waiter.wait_for(5s), std::future_status::ready);
    EXPECT_EQ(waiter.get(), B_TIMED_OUT);
    EXPECT_EQ(lock.atom.load(), 2); // not taken back
}

TEST(Benaphore, ExcludesAcrossThreads)
{
    Benaphore lock(1, "test benaphore");
    int64_t shared = 0; // guarded by lock only
    auto work = [&] {
        for (int i = 0; i < 20000; i++) {
            lock.Acquire();
            shared++;
            lock.Release();
        }
    };
    std::thread a(work), b(work), c(work);
    a.join();
    b.join();
    c.join();
    EXPECT_EQ(shared, 60000);
    EXPECT_EQ(lock.atom.load(), 0);
}
