// The class as the runtime sees it.
#include "ZVWSLibAE.h"

#include <utility>

#include "ZVWSLibAECall.h"
#include "ZVWSLibAEPrefetch.h"

using namespace ae::stagecraft;

const char* ZVWSLibAE::GetClassName()
{
    return "com.orvex.ZVWSLib";
}

bool ZVWSLibAE::FiresEvents()
{
    return false;
}

void ZVWSLibAE::GetMethods(AEArray<ASExtensionClass::Method>& methodArrayToFill)
{
#define ZVWSLIBAE_ROW(name, kind) \
    methodArrayToFill.InsertAt(methodArrayToFill.size(), MakeMethod(#name, Method::kind, &ZVWSLibAE::name));
#define ZVWSLIBAE_MEMBER(name) ZVWSLIBAE_ROW(name, kMemberFunction)
#define ZVWSLIBAE_STATIC(name) ZVWSLIBAE_ROW(name, kStaticFunction)
    ZVWSLIBAE_METHODS(ZVWSLIBAE_MEMBER, ZVWSLIBAE_STATIC)
}

ASExtensionClass* ZVWSLibAE::ConstructInstance(StageWindow* window, ASObject& object, ASValueArray& arguments)
{
    return new ZVWSLibAE(window, object, arguments);
}

void ZVWSLibAE::DestructInstance(StageWindow* /*window*/, ASObject& object)
{
    delete object.GetExtensionInstance();
}

ZVWSLibAE::ZVWSLibAE(StageWindow* /*window*/, ASObject& /*object*/, ASValueArray& /*arguments*/)
    : m_Prefetcher(std::make_unique<Prefetcher>(*this)), m_Call(std::make_unique<ForegroundCall>())
{}

ZVWSLibAE::~ZVWSLibAE()
{
    m_Prefetcher->Stop();  // so that all workers break off at the same time
}

void ZVWSLibAE::OnUpdate(StageWindow* /*window*/, ASObject& object)
{
    if (!m_Call->HasResult()) {
        m_Prefetcher->FetchWhenIdle();
        return;
    }
    object.StopUpdates();
    const ASValue callback = m_Call->TakeCallback();
    ZVThread::Sleep(10);  // movies rest on a result never coming at once

    ASValueArray arguments;
    if (callback.IsObject()) {
        const Result& result = m_Call->GetResult();
        m_Prefetcher->ResultComes(result);
        ASValue value;
        ZVWSLib::SetResult(result, value, *callback.GetObject());
        arguments.Append(ASValue::Number(result.retCode));
        arguments.Append(std::move(value));
    }
    ZVThread* const thread = m_Call->Finish();
    // From here on a call is accepted; the callback may make one.
    if (callback.IsObject()) {
        ASValue ignored;
        callback.GetObject()->Call("onComplete", arguments, ignored);
    }
    ZVThread::SafeDestroyThread(thread);
}
