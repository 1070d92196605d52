// How an instance gets its session: by set-up, or from another instance.
#include "ZVWSLibAEDispatch.h"
#include "ZV_Log.h"

using namespace ae::stagecraft;

ZV_LOG_AREA(ZVWSAELOG_AREA_NAME)

namespace ZVWSLib {

namespace {

ZV_WS_SetupParams SetupOf(const Param_init& param)
{
    ZV_WS_SetupParams setup;
    setup.APIKey = param.APIKey.c_str();
    setup.AuthToken = param.AuthToken.c_str();
    setup.DestinationUniqueID = param.DestinationUniqueID.c_str();
    setup.DestinationTypeID = param.DestinationTypeID;
    setup.UserName = param.UserName.c_str();
    setup.Password = param.Password.c_str();
    setup.ServiceBaseURL = param.ServiceBaseURL.c_str();
    setup.Type = param.Type;
    setup.EnvNum = param.EnvNum;
    setup.CacheParam.Type = param.CacheType;
    setup.CacheParam.Data = param.CacheData;
    setup.CacheParam.Limit = param.CacheLimit;
    setup.CacheParam.Path = param.CachePath.c_str();
    setup.ProxyParam.Host = param.ProxyHost.c_str();
    setup.ProxyParam.Port = param.ProxyPort;
    setup.ProxyParam.UserName = param.ProxyUserName.c_str();
    setup.ProxyParam.Password = param.ProxyPassword.c_str();
    setup.AccessType = param.AccessType;
    setup.ApplicationRevision = param.ApplicationRevision.c_str();
    setup.FirmwareRevision = param.FirmwareRevision.c_str();
    setup.ModelCode = param.ModelCode.c_str();
    return setup;
}

// Whether set-up asks the service for the environment.
bool IsAssigned(ZV_WS_EnvNum envNum)
{
    return envNum < ENVNUM_APISTG || envNum > ENVNUM_PRODUCTION;
}

}  // namespace

void init(void* argument)
{
    const std::unique_ptr<Param_init> param(static_cast<Param_init*>(argument));
    ZV_ASSERT(param != nullptr);
    ZV_ASSERT(param->pZVWSLibAE != nullptr);
    ZVWSLibAE::ForegroundCall& call = param->pZVWSLibAE->GetCall();
    const ZV_WS_SetupParams setup = SetupOf(*param);
    const ZV_WS_Status status = ZV_WS_initialize(&call.Session(), &setup);
    LogStatus("init", status);
    const bool succeeded = status == ZV_WS_Status_ok;
    if (succeeded) {
        param->pZVWSLibAE->GetPrefetcher().OpenSessions(call.Session());
    } else {
        ZV_WS_release(&call.Session());  // one failure leaves something behind
    }
    call.SetInitialized(succeeded, IsAssigned(param->EnvNum));
    call.Publish(succeeded, status);
}

}  // namespace ZVWSLib

void ZVWSLibAE::init(StageWindow* /*window*/, ASObject& object, ASValueArray& arguments, ASValue& returnValue)
{
    const ZVWSAELog scope("ZVWSLibAE", "init", GetZV_LogAreaID());
    if (m_Call->IsInitialized()) {
        ZV_LogOutput(GetZV_LogAreaID(), ZV_LOG_TRACE, "ZVWSLibAE::init left since Already initialized!\n");
        returnValue = ASValue::Number(kStarted);
        return;
    }
    const ReturnCode code = ZVWSLib::StartCall(*this, "init", ZVWSLib::init, Param_init(), object, arguments);
    returnValue = ASValue::Number(code);
    if (code != kStarted) return;
    ZV_LogOutput(GetZV_LogAreaID(), ZV_LOG_TRACE, "ZVWSLibAE::init left\n");
}

namespace {

// The other instance behind the only argument, when it can be cloned.
ZVWSLibAE* SourceOfClone(ZVWSLibAE& self, ASValueArray& arguments)
{
    if (arguments.size() != 1 || !arguments[0].IsObject()) return nullptr;
    auto* source = dynamic_cast<ZVWSLibAE*>(arguments[0].GetObject()->GetExtensionInstance());
    return source && source != &self && source->GetCall().IsInitialized() ? source : nullptr;
}

ZVWSLibAE::ReturnCode Clone(ZVWSLibAE& self, ASValueArray& arguments)
{
    ZVWSLibAE::ForegroundCall& call = self.GetCall();
    if (call.IsInitialized()) return ZVWSLibAE::kAlreadyInitialized;
    if (call.IsBusy()) return ZVWSLibAE::kBusy;  // its "init" uses the session
    ZVWSLibAE* source = SourceOfClone(self, arguments);
    if (!source) return ZVWSLibAE::kWrongArguments;

    // The source's worker may be using its session. All else that is read of the source is the main thread's.
    if (ZV_WS_duplicate(&call.Session(), &source->GetCall().Session()) != ZV_WS_Status_ok) {
        ZV_WS_release(&call.Session());
        return ZVWSLibAE::kDuplicateFailed;
    }
    ZVWSLibAE::Prefetcher& prefetcher = self.GetPrefetcher();
    prefetcher.CopySettings(source->GetPrefetcher());
    prefetcher.OpenSessions(call.Session());
    call.SetInitialized(true, source->GetCall().HasAssignedEnv());
    return ZVWSLibAE::kStarted;
}

}  // namespace

void ZVWSLibAE::clone(StageWindow* /*window*/, ASObject& /*object*/, ASValueArray& arguments, ASValue& returnValue)
{
    const ZVWSAELog scope("ZVWSLibAE", "clone", GetZV_LogAreaID());
    returnValue = ASValue::Number(Clone(*this, arguments));
}
