// The class as the runtime sees it.
#include "ZVWSLibAE.h"

#include "ZVWSLibAEDispatch.h"

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
    : m_State(std::make_unique<State>())
{}

ZVWSLibAE::~ZVWSLibAE() = default;
