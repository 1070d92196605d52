#include "ZVThread.h"

#include <errno.h>
#include <openssl/crypto.h>
#include <pthread.h>
#include <time.h>

#include <atomic>
#include <memory>

#include "SignalStack.h"
#include "ZVAssert.h"
#include "ZVMutex.h"

namespace {

constexpr unsigned long kPollingPeriod = 200;  // milliseconds

// What the object and its thread both own: either may end first.
struct Shared {
    std::atomic<bool> running{false};
    void (*function)(void*) = nullptr;
    void* argument = nullptr;

    ZVMutex mutex;
    ZVCondition changed;
    bool finished ZV_GUARDED_BY(mutex) = false;
};

}  // namespace

struct ZVThread::Impl {
    std::shared_ptr<Shared> m_Shared = std::make_shared<Shared>();
    pthread_t m_Thread = 0;

    static void* EntryPoint(void* argument)
    {
        const SignalStack signalStack;
        const std::unique_ptr<std::shared_ptr<Shared>> owned(static_cast<std::shared_ptr<Shared>*>(argument));
        Shared& shared = **owned;
        shared.running = true;
        shared.function(shared.argument);
        // By itself this comes after "finished", and so could meet the process's own clean-up at exit.
        OPENSSL_thread_stop();
        shared.running = false;
        ZVMutexLock lock(shared.mutex);
        shared.finished = true;
        shared.changed.NotifyAll();
        return nullptr;
    }
};

ZVThread::ZVThread() : m_Impl(new Impl) {}

ZVThread::~ZVThread()
{
    delete m_Impl;
}

ZVThread* ZVThread::CreateThread()
{
    return new ZVThread;
}

void ZVThread::DestroyThread(ZVThread* thread)
{
    if (!thread) return;
    thread->m_Impl->m_Thread = 0;
    delete thread;
}

void ZVThread::SafeDestroyThread(ZVThread* thread)
{
    if (!thread) return;
    if (thread->m_Impl->m_Thread != 0) {
        Shared& shared = *thread->m_Impl->m_Shared;
        ZVMutexLock lock(shared.mutex);
        while (!shared.finished)
            shared.changed.Wait(shared.mutex);
    }
    DestroyThread(thread);
}

bool ZVThread::HasFinished(unsigned long milliseconds) const
{
    if (m_Impl->m_Thread == 0) return true;
    Shared& shared = *m_Impl->m_Shared;
    const auto end = std::chrono::steady_clock::now() + std::chrono::milliseconds(milliseconds);
    ZVMutexLock lock(shared.mutex);
    while (!shared.finished) {
        if (!shared.changed.WaitUntil(shared.mutex, end)) break;
    }
    return shared.finished;
}

void ZVThread::Sleep(unsigned long milliseconds)
{
    timespec rest = {static_cast<time_t>(milliseconds / 1000), static_cast<long>(milliseconds % 1000) * 1000000};
    while (nanosleep(&rest, &rest) == -1 && errno == EINTR) {
    }
}

bool ZVThread::Run(const char* /*name*/, void (*function)(void*), void* argument)
{
    ZV_ASSERT(m_Impl->m_Thread == 0);
    Shared& shared = *m_Impl->m_Shared;
    shared.function = function;
    shared.argument = argument;
    auto owned = std::make_unique<std::shared_ptr<Shared>>(m_Impl->m_Shared);
    pthread_attr_t attributes;
    pthread_attr_init(&attributes);
    pthread_attr_setdetachstate(&attributes, PTHREAD_CREATE_DETACHED);
    pthread_t started = 0;
    const bool running = pthread_create(&started, &attributes, Impl::EntryPoint, owned.get()) == 0;
    pthread_attr_destroy(&attributes);
    if (!running) return false;
    static_cast<void>(owned.release());  // the thread's now
    m_Impl->m_Thread = started;
    return true;
}

bool ZVThread::IsRunning() const
{
    return m_Impl->m_Thread != 0 && m_Impl->m_Shared->running;
}

void ZVThread::WaitUntilCompletion() const
{
    while (IsRunning())
        Sleep(kPollingPeriod);
}
