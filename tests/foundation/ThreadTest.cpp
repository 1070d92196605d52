#include "ZVThread.h"

#include <gtest/gtest.h>
#include <signal.h>
#include <sys/time.h>

#include <atomic>
#include <chrono>
#include <future>

namespace {

// A thread function's other side: it says that it runs, and returns when it may.
struct Gate {
    std::promise<void> entered, mayLeave;
    std::atomic<bool> left{false};

    static void Pass(void* argument)
    {
        Gate& gate = *static_cast<Gate*>(argument);
        gate.entered.set_value();
        gate.mayLeave.get_future().wait();
        gate.left = true;
    }
};

void Count(void* counter)
{
    ++*static_cast<std::atomic<int>*>(counter);
}

TEST(ThreadTest, WaitingAndSafeDestroyLastAsLongAsTheFunction)
{
    for (const bool destroys : {false, true}) {
        Gate gate;
        ZVThread::SafeDestroyThread(nullptr);
        ZVThread::SafeDestroyThread(ZVThread::CreateThread());  // has never run
        ZVThread* thread = ZVThread::CreateThread();
        thread->WaitUntilCompletion();  // returns at once
        EXPECT_FALSE(thread->IsRunning());
        ASSERT_TRUE(thread->Run("gate", Gate::Pass, &gate));
        gate.entered.get_future().wait();
        EXPECT_TRUE(thread->IsRunning());
        auto waiter = std::async(std::launch::async, [&] {
            destroys ? ZVThread::SafeDestroyThread(thread) : thread->WaitUntilCompletion();
            return gate.left.load();
        });
        gate.mayLeave.set_value();
        EXPECT_TRUE(waiter.get());
        if (destroys) continue;
        EXPECT_FALSE(thread->IsRunning());
        ZVThread::SafeDestroyThread(thread);
    }
}

TEST(ThreadTest, SafeDestroyWaitsForAFunctionThatHasNotBegun)
{
    for (int i = 0; i < 500; ++i) {
        std::atomic<int> count{0};
        ZVThread* thread = ZVThread::CreateThread();
        ASSERT_TRUE(thread->Run("count", Count, &count));
        ZVThread::SafeDestroyThread(thread);
        ASSERT_EQ(1, count);
    }
}

TEST(ThreadTest, AThreadOutlivesItsObject)
{
    for (int i = 0; i < 200; ++i) {
        Gate gate;
        ZVThread* thread = ZVThread::CreateThread();
        ASSERT_TRUE(thread->Run("gate", Gate::Pass, &gate));
        if (i % 2) gate.entered.get_future().wait();
        ZVThread::DestroyThread(thread);
        gate.mayLeave.set_value();
        while (!gate.left)
            sched_yield();
    }
}

TEST(ThreadTest, SleepsThroughSignals)
{
    struct sigaction action = {}, before;
    static std::atomic<int> s_Signals;
    action.sa_handler = [](int) { ++s_Signals; };
    sigaction(SIGALRM, &action, &before);
    const itimerval every10ms = {{0, 10000}, {0, 10000}}, never = {};
    setitimer(ITIMER_REAL, &every10ms, nullptr);
    const auto start = std::chrono::steady_clock::now();
    ZVThread::Sleep(1100);
    const auto slept = std::chrono::steady_clock::now() - start;
    setitimer(ITIMER_REAL, &never, nullptr);
    sigaction(SIGALRM, &before, nullptr);
    EXPECT_GT(s_Signals, 0);
    EXPECT_GE(slept, std::chrono::milliseconds(1100));
}

TEST(ThreadDeathTest, StartsOnce)
{
    testing::FLAGS_gtest_death_test_style = "threadsafe";
    std::atomic<int> count{0};
    ZVThread* thread = ZVThread::CreateThread();
    ASSERT_TRUE(thread->Run("count", Count, &count));
    EXPECT_DEATH(thread->Run("count", Count, &count), "\\./Private/ZVThread.cpp.*\"m_Impl->m_Thread == 0\"");
    ZVThread::SafeDestroyThread(thread);
}

}  // namespace
