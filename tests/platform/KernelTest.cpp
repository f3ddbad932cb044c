#include "platform/Kernel.h"
#include "platform/Semaphore.h"

#include <gtest/gtest.h>

#include <chrono>
#include <future>
#include <thread>

using namespace std::chrono_literals;

TEST(Kernel, ClocksAndSnooze)
{
    const bigtime_t start = system_time();
    snooze(2000);
    EXPECT_GE(system_time() - start, 2000);
    EXPECT_GT(real_time_clock(), 1700000000u);
}

TEST(Kernel, AtomicAddReturnsThePreviousValue)
{
    std::atomic<int32_t> counter { 5 };
    EXPECT_EQ(atomic_add(&counter, 3), 5);
    EXPECT_EQ(atomic_add(&counter, -10), 8);
    EXPECT_EQ(counter.load(), -2);
}

TEST(Kernel, CountedAcquireAndRelease)
{
    sem_id sem = create_sem(3, "counted");
    ASSERT_NE(sem, nullptr);
    EXPECT_EQ(sem->Name(), "counted");
    EXPECT_EQ(acquire_sem_etc(sem, 2, 0, 0), B_OK);
    int32_t count = -1;
    EXPECT_EQ(get_sem_count(sem, &count), B_OK);
    EXPECT_EQ(count, 1);
    // Two units are not there: a zero time-out polls, a short one times out.
    EXPECT_EQ(acquire_sem_etc(sem, 2, B_RELATIVE_TIMEOUT, 0), B_WOULD_BLOCK);
    EXPECT_EQ(acquire_sem_etc(sem, 2, B_RELATIVE_TIMEOUT, 10000), B_TIMED_OUT);
    EXPECT_EQ(acquire_sem_etc(sem, 2, B_ABSOLUTE_TIMEOUT, system_time() + 1000), B_TIMED_OUT);
    EXPECT_EQ(release_sem_etc(sem, 2, B_DO_NOT_RESCHEDULE), B_OK);
    EXPECT_EQ(acquire_sem_etc(sem, 3, B_RELATIVE_TIMEOUT, 0), B_OK);
    EXPECT_EQ(acquire_sem_etc(sem, 0, 0, 0), B_BAD_VALUE);
    EXPECT_EQ(delete_sem(sem), B_OK);
    EXPECT_EQ(acquire_sem(nullptr), B_BAD_SEM_ID);
}

TEST(Kernel, AWaiterWakesOnlyWhenAllItsUnitsAreThere)
{
    sem_id sem = create_sem(0, "waiter");
    auto waiter = std::async(std::launch::async, [&] { return acquire_sem_etc(sem, 2, 0, 0); });
    const auto deadline = std::chrono::steady_clock::now() + 5s;
    while (sem->Waiting() == 0 && std::chrono::steady_clock::now() < deadline)
        std::this_thread::yield();
    ASSERT_EQ(sem->Waiting(), 1);
    int32_t count = 0;
    get_sem_count(sem, &count);
    EXPECT_EQ(count, -2);
    release_sem(sem);
    EXPECT_EQ(waiter.wait_for(10ms), std::future_status::timeout);
    release_sem(sem);
    ASSERT_EQ(waiter.wait_for(5s), std::future_status::ready);
    EXPECT_EQ(waiter.get(), B_OK);
    get_sem_count(sem, &count);
    EXPECT_EQ(count, 0);
    delete_sem(sem);
}
