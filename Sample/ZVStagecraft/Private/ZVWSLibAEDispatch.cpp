#include "ZVWSLibAEDispatch.h"

#include "ZV_Log.h"

using namespace ae::stagecraft;

ZV_LOG_AREA(ZVWSAELOG_AREA_NAME)

// Ends a worker that may hang in the network. A session that it has just made is told, too.
void ZVWSLibAE::State::EndWorker(ZVThread* thread)
{
    while (thread && !thread->HasFinished(20)) {
        for (const ZV_WS_Session* session :
             {&m_PrefetchUserDataSession, &m_PrefetchBoxArtsSession, &m_PrefetchTitlesSession, &m_Session}) {
            ZV_WS_abort(session);
        }
    }
    ZVThread::SafeDestroyThread(thread);
}

ZVWSLibAE::State::~State()
{
    m_StopPrefetch = true;
    ZVThread* threads[3] = {};
    {
        const KernelLock lock(m_ThreadMutex);
        std::swap(threads[0], m_Thread);
        std::swap(threads[1], m_PrefetchTitlesThread);
        std::swap(threads[2], m_PrefetchBoxArtsThread);
    }
    for (ZVThread* thread : threads)
        EndWorker(thread);
    m_Result.Release();
    for (ZV_WS_Session* session :
         {&m_PrefetchUserDataSession, &m_PrefetchBoxArtsSession, &m_PrefetchTitlesSession, &m_Session}) {
        ZV_WS_release(session);
    }
}

bool ZVWSLibAE::State::IsBusy()
{
    const KernelLock lock(m_ThreadMutex);
    return m_Thread != nullptr;
}

void ZVWSLibAE::State::RunThread(const char* name, void (*function)(void*), void* param, ASObject& object,
                                 const ASValue& callback)
{
    const KernelLock lock(m_ThreadMutex);
    m_CallbackObject = callback;
    m_FlashIdle = false;
    m_NeedPrefetchTitles = false;
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

namespace ZVWSLib {

int LogAreaID()
{
    return GetZV_LogAreaID();
}

void LogStatus(const char* name, ZV_WS_Status status)
{
    ZV_LogOutput(GetZV_LogAreaID(), ZV_LOG_TRACE, "ZVWSLib::%s, ret:%d\n", name, static_cast<int>(status));
}

bool ReadArguments(ASValueArray& arguments, ASValue& callback, ASValue& parameters)
{
    if (arguments.size() != 1 || !arguments[0].IsObject()) return false;
    ASObject& array = *arguments[0].GetObject();
    return array.IsInstanceOf("Array") && array.GetLength() == 2 && array.GetElement(0, callback) &&
           callback.IsObject() && array.GetElement(1, parameters) && parameters.IsObject();
}

}  // namespace ZVWSLib

// ---- Delivery

void ZVWSLibAE::OnUpdate(StageWindow* /*window*/, ASObject& object)
{
    State& state = *m_State;
    if (!state.m_NeedFireEvent) {
        ZVWSLib::FetchBoxArtWhenIdle(*this);
        return;
    }
    object.StopUpdates();
    state.m_NeedFireEvent = false;
    ZVThread::Sleep(10);  // movies rest on a result never coming at once

    ASValue callback;
    {
        const KernelLock lock(state.m_ThreadMutex);
        callback = std::move(state.m_CallbackObject);
        state.m_CallbackObject = ASValue();
    }
    ASValueArray arguments;
    if (callback.IsObject()) {
        ZVWSLib::SchedulePrefetch(*this);
        ASValue value;
        ZVWSLib::SetResult(state.m_Result, value, *callback.GetObject());
        arguments.Append(ASValue::Number(state.m_Result.retCode));
        arguments.Append(std::move(value));
    }
    state.m_Result.Release();

    ZVThread* thread = nullptr;
    {
        const KernelLock lock(state.m_ThreadMutex);
        std::swap(thread, state.m_Thread);
    }
    // From here on a call is accepted; the callback may make one.
    if (callback.IsObject()) {
        ASValue ignored;
        callback.GetObject()->Call("onComplete", arguments, ignored);
    }
    ZVThread::SafeDestroyThread(thread);
}
