// The call that an instance makes for the script: one at a time, on a worker thread and a library session of its own.
#pragma once

#include <atomic>
#include <initializer_list>

#include "KernelMutex.h"
#include "ZVThread.h"
#include "ZVWSLibAE.h"
#include "ZVWSLibAEResult.h"

/// Main thread, unless a member says otherwise.
class ZVWSLibAE::ForegroundCall {
public:
    ForegroundCall() = default;
    /// Breaks off the call that is under way and waits for its worker. Nothing is delivered.
    ~ForegroundCall();
    ForegroundCall(const ForegroundCall&) = delete;
    ForegroundCall& operator=(const ForegroundCall&) = delete;

    /// Whether a call has been started and not been delivered.
    bool IsBusy();

    /// Starts the worker, which owns `param` from then on, and the update calls for `object`. A thread that cannot be
    /// made is one line in the log: no "onComplete" follows, the callback stays set and `param` is not freed.
    void RunThread(const char* name, void (*function)(void*), void* param, ae::stagecraft::ASObject& object,
                   const ae::stagecraft::ASValue& callback);

    /// Whether a result waits for delivery.
    bool HasResult() const { return m_NeedFireEvent; }
    /// The result that waits, which then waits no longer, is for this callback.
    ae::stagecraft::ASValue TakeCallback();
    /// The result that was taken up with its callback; valid until Finish.
    const Result& GetResult() const { return m_Result; }
    /// Frees the result; from here on a call is accepted. Returns the worker, which has published its result: the
    /// caller ends it.
    ZVThread* Finish();

    /// The worker's last act on the instance: hands the result over. Worker thread.
    template <class Output>
    void Publish(const Output& output, ZV_WS_Status status)
    {
        m_Result.Set(output, status);
        m_NeedFireEvent = true;
    }

    /// Whether the instance has a session. Any thread; set by the worker of "init", or by "clone".
    bool IsInitialized() const { return m_Init; }
    /// Whether it has, and its environment is the one that the service assigned to the device.
    bool HasAssignedEnv() const { return m_Init && m_EnvIsAssigned; }
    void SetInitialized(bool initialized, bool envIsAssigned)
    {
        m_EnvIsAssigned = envIsAssigned;
        m_Init = initialized;
    }

    /// The worker's while one runs. What set-up has fixed may be read beside it, and the session be duplicated.
    ZV_WS_Session& Session() { return m_Session; }

private:
    ZV_WS_Session m_Session;
    Result m_Result;  // the worker's until m_NeedFireEvent is set, then the main thread's
    std::atomic<bool> m_Init{false};
    std::atomic<bool> m_EnvIsAssigned{false};  // set before m_Init
    std::atomic<bool> m_NeedFireEvent{false};
    KernelMutex m_ThreadMutex;
    ZVThread* m_Thread ZV_GUARDED_BY(m_ThreadMutex) = nullptr;
    ae::stagecraft::ASValue m_CallbackObject ZV_GUARDED_BY(m_ThreadMutex);
};

namespace ZVWSLib {

/// Waits for a worker and ends it, breaking off whatever it asks with these sessions, also one that it has just made.
/// Null is ignored.
void EndWorker(ZVThread* thread, std::initializer_list<const ZV_WS_Session*> sessions);

}  // namespace ZVWSLib
