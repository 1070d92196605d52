// The mutex of the library and the host: std::mutex with the annotations that let Clang check who may touch what.
#pragma once

#include <chrono>
#include <condition_variable>
#include <mutex>

#ifdef __clang__
#define ZV_THREAD_ATTRIBUTE(...) __attribute__((__VA_ARGS__))
#else
#define ZV_THREAD_ATTRIBUTE(...)
#endif

/// The member is read and written only with the mutex held.
#define ZV_GUARDED_BY(mutex) ZV_THREAD_ATTRIBUTE(guarded_by(mutex))
/// The caller holds the mutex.
#define ZV_REQUIRES(mutex) ZV_THREAD_ATTRIBUTE(requires_capability(mutex))
/// The caller holds none of the mutexes.
#define ZV_EXCLUDES(...) ZV_THREAD_ATTRIBUTE(locks_excluded(__VA_ARGS__))

class ZV_THREAD_ATTRIBUTE(capability("mutex")) ZVMutex {
public:
    void lock() ZV_THREAD_ATTRIBUTE(acquire_capability()) { m_Mutex.lock(); }
    bool try_lock() ZV_THREAD_ATTRIBUTE(try_acquire_capability(true)) { return m_Mutex.try_lock(); }
    void unlock() ZV_THREAD_ATTRIBUTE(release_capability()) { m_Mutex.unlock(); }

private:
    std::mutex m_Mutex;
};

/// Holds a mutex of any kind as long as it exists.
template <class Mutex>
class ZV_THREAD_ATTRIBUTE(scoped_lockable) ZVScopedLock {
public:
    explicit ZVScopedLock(Mutex& mutex) ZV_THREAD_ATTRIBUTE(acquire_capability(mutex)) : m_Mutex(mutex)
    {
        m_Mutex.lock();
    }
    ~ZVScopedLock() ZV_THREAD_ATTRIBUTE(release_capability()) { m_Mutex.unlock(); }
    ZVScopedLock(const ZVScopedLock&) = delete;
    ZVScopedLock& operator=(const ZVScopedLock&) = delete;

private:
    Mutex& m_Mutex;
};
using ZVMutexLock = ZVScopedLock<ZVMutex>;

/// Waits with a ZVMutex held, which is free while it waits. Wake-ups without a cause occur: wait in a loop.
class ZVCondition {
public:
    void Wait(ZVMutex& mutex) ZV_REQUIRES(mutex) { m_Condition.wait(mutex); }
    /// false when the time has come.
    bool WaitUntil(ZVMutex& mutex, std::chrono::steady_clock::time_point time) ZV_REQUIRES(mutex)
    {
        return m_Condition.wait_until(mutex, time) == std::cv_status::no_timeout;
    }
    void NotifyAll() { m_Condition.notify_all(); }

private:
    std::condition_variable_any m_Condition;
};
