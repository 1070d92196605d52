#include "ZVWSLibAECall.h"

#include <utility>

#include "ZVAssert.h"
#include "ZVWSAELog.h"
#include "ZV_Log.h"

using namespace ae::stagecraft;

ZV_LOG_AREA(ZVWSAELOG_AREA_NAME)

void ZVWSLib::EndWorker(ZVThread* thread, std::initializer_list<const ZV_WS_Session*> sessions)
{
    while (thread && !thread->HasFinished(20)) {
        for (const ZV_WS_Session* session : sessions)
            ZV_WS_abort(session);
    }
    ZVThread::SafeDestroyThread(thread);
}

ZVWSLibAE::ForegroundCall::~ForegroundCall()
{
    ZVThread* thread = nullptr;
    {
        const KernelLock lock(m_ThreadMutex);
        std::swap(thread, m_Thread);
    }
    ZVWSLib::EndWorker(thread, {&m_Session});
    m_Result.Release();
    ZV_WS_release(&m_Session);
}

bool ZVWSLibAE::ForegroundCall::IsBusy()
{
    const KernelLock lock(m_ThreadMutex);
    return m_Thread != nullptr;
}

void ZVWSLibAE::ForegroundCall::RunThread(const char* name, void (*function)(void*), void* param, ASObject& object,
                                          const ASValue& callback)
{
    const KernelLock lock(m_ThreadMutex);
    m_CallbackObject = callback;
    m_Thread = ZVThread::CreateThread();
    ZV_ASSERT(m_Thread != 0);
    if (m_Thread->Run(name, function, param)) {
        object.StartUpdates();
        return;
    }
    ZV_LogOutput(GetZV_LogAreaID(), ZV_LOG_ERROR, "Failed to launch worker thread: %s!\n", name);
    ZVThread::DestroyThread(m_Thread);
    m_Thread = nullptr;
}

ASValue ZVWSLibAE::ForegroundCall::TakeCallback()
{
    m_NeedFireEvent = false;
    const KernelLock lock(m_ThreadMutex);
    return std::exchange(m_CallbackObject, ASValue());
}

ZVThread* ZVWSLibAE::ForegroundCall::Finish()
{
    m_Result.Release();
    const KernelLock lock(m_ThreadMutex);
    return std::exchange(m_Thread, nullptr);
}
