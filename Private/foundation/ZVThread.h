// One detached POSIX thread that runs a plain function once.
#pragma once

class ZVThread {
public:
    /// A thread object that has not been started. The caller ends it with DestroyThread or SafeDestroyThread.
    static ZVThread* CreateThread();

    /// Ends the object, not the thread: one that still runs goes on by itself. Null is ignored.
    static void DestroyThread(ZVThread* thread);

    /// Waits until the function has returned, whether or not it has begun yet, and ends the object. Null is ignored.
    /// Must not be called by the thread itself.
    static void SafeDestroyThread(ZVThread* thread);

    /// Whether the function has returned (or never will be called), after at most that time.
    bool HasFinished(unsigned long milliseconds) const;

    /// Sleeps the whole time, signals or not.
    static void Sleep(unsigned long milliseconds);

    /// Starts function(argument) on a thread of its own; false when no thread could be made. At most once for an
    /// object. The name serves the caller's log only.
    virtual bool Run(const char* name, void (*function)(void*), void* argument);

    /// Whether the function runs. The new thread sets this itself, so that it can still be false right after Run.
    bool IsRunning() const;

    /// Returns at once when the function does not run, else looks every 200 ms until it has returned.
    void WaitUntilCompletion() const;

    ZVThread(const ZVThread&) = delete;
    ZVThread& operator=(const ZVThread&) = delete;

protected:
    ZVThread();
    virtual ~ZVThread();

private:
    struct Impl;
    Impl* m_Impl;
};
