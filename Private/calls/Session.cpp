#include <stdio.h>
#include <string.h>

#include "CacheMgr.h"
#include "CacheSweep.h"
#include "CallGuard.h"
#include "ClockQueries.h"
#include "Discovery.h"
#include "Records.h"
#include "SessionImpl.h"
#include "Url.h"
#include "ZVAssert.h"
#include "ZVFile.h"
#include "ZVUtilities.h"
#include "ZV_Log.h"

ZV_LOG_AREA(ZVWS_SoapProxyLOG_AREA_NAME)

namespace {

constexpr size_t kLongestUniqueID = 350;
constexpr unsigned int kSmallestCacheLimit = 350 * 1024;
constexpr mode_t kPrivateFolder = 0700;  // what is cached tells of the customer

const ZV_WS_Environment kEnvironments[] = {
    {ENVNUM_APISTG, "apistg"},
    {ENVNUM_INTERNALSTG, "stg"},
    {ENVNUM_PRODUCTION, "production"},
    {ENVNUM_DEFAULT, "default"},
};

bool IsGiven(const char* text)
{
    return text && *text;
}

bool AreValid(const ZV_WS_SetupParams& params)
{
    for (const char* required : {params.APIKey, params.DestinationUniqueID, params.UserName, params.Password}) {
        if (!IsGiven(required)) return false;
    }
    const ZV_WS_CacheParam& cache = params.CacheParam;
    if (cache.Type == CacheType_File && !cache.Path) return false;
    if (strlen(params.DestinationUniqueID) > kLongestUniqueID) return false;
    if (cache.Type != CacheType_None && cache.Limit != 0 && cache.Limit < kSmallestCacheLimit) return false;
    for (const char* sent : {params.APIKey, params.DestinationUniqueID, params.UserName, params.AuthToken}) {
        if (sent && !ZVUtilities::IsXmlText(sent)) return false;
    }
    for (const char* sent : {params.ApplicationRevision, params.FirmwareRevision, params.ModelCode}) {
        if (sent && !IsHeaderText(sent)) return false;
    }
    return true;
}

void CopyGiven(ZVString& to, const char* from)
{
    if (from) to = from;
}

void CopyIdentity(ZV_WS_SetupParams2& to, const ZV_WS_SetupParams& from)
{
    to.APIKey = from.APIKey;
    if (IsGiven(from.AuthToken)) to.Customer->ChangeToken(from.AuthToken);
    to.DestinationUniqueID = from.DestinationUniqueID;
    to.DestinationTypeID = from.DestinationTypeID;
    to.UserName = from.UserName;
    to.Password = from.Password;
}

void CopyProxy(ZV_WS_SetupParams2& to, const ZV_WS_ProxyParam& from)
{
    CopyGiven(to.ProxyHost, from.Host);
    if (to.ProxyHost.empty()) return;
    to.ProxyPort = from.Port;
    CopyGiven(to.ProxyUserName, from.UserName);
    CopyGiven(to.ProxyPassword, from.Password);
}

uint32_t HashOf(const ZVString& text)
{
    return ZVUtilities::Hash(text.c_str(), text.length(), 0);
}

// The folder with its separator; an empty one is the current folder.
ZVString CacheFolder(const char* path)
{
    ZVString folder = *path ? path : ".";
    if (folder[folder.length() - 1] != ZVFile::PATH_SEPERATOR) folder.append(&ZVFile::PATH_SEPERATOR, 1);
    return folder;
}

// One file for each account, device and kind of cache: with other credentials another one is used.
ZVString CacheFileName(const ZV_WS_SetupParams2& params)
{
    char text[100];
    // The base URL is not known yet when the name is made, so its hash is always that of the empty text.
    snprintf(text, sizeof text, "%u_%u_%d_%u_%u_%u_%u_%u_%u", HashOf(params.ServiceBaseURL),
             HashOf(params.DestinationUniqueID), params.DestinationTypeID, HashOf(params.APIKey),
             HashOf(params.UserName), HashOf(params.Password), params.CacheData, params.CacheLimit, 1u);
    return ZVString(text) + ".zv";
}

void CopyCache(ZV_WS_SetupParams2& to, const ZV_WS_CacheParam& from)
{
    to.CacheKind = from.Type;
    to.CacheData = from.Data;
    to.CacheLimit = from.Limit;
    if (from.Type == CacheType_File) to.CachePath = CacheFolder(from.Path) + CacheFileName(to);
}

ZVString MakeUserAgent(const ZV_WS_SetupParams2& params)
{
    ZVString agent;
    if (!params.ApplicationRevision.empty() || !params.FirmwareRevision.empty()) {
        agent = ZVString("ZVSDK: ") + params.FirmwareRevision + "|" + params.ApplicationRevision;
    }
    if (!params.ModelCode.empty()) agent += ZVString(" ZVMODEL:") + params.ModelCode;
    return agent;
}

Proxy ProxyOf(const ZV_WS_SetupParams2& params)
{
    Proxy proxy;
    proxy.host = params.ProxyHost;
    proxy.port = params.ProxyPort;
    proxy.userName = params.ProxyUserName;
    proxy.password = params.ProxyPassword;
    return proxy;
}

// Whom the session's connections trust, and which way they go. False when the authorities cannot be loaded.
bool PrepareConnections(SessionImpl& session, const Deployment& deployment)
{
    const Proxy proxy = ProxyOf(session.m_Params);
    proxy.MakeCurrent();
    for (Transport* transport :
         {&session.m_Browse.transport(), &session.m_Stream.transport(), &session.m_Download.transport()}) {
        if (!transport->LoadAuthorities(deployment)) return false;
        transport->SetProxy(proxy);
    }
    return true;
}

void SetParams(SessionImpl& session)
{
    session.m_Browse.SetParams(&session.m_Params);
    session.m_Stream.SetParams(&session.m_Params);
    session.m_Download.SetParams(&session.m_Params);
    session.m_IsSetUp = true;
}

void InitFacade(SessionImpl& session)
{
    session.m_Facade.Init(&session.m_Stream, &session.m_Download, session.m_Params.AccessType);
}

ZV_WS_CacheParam2 CacheParamOf(const ZV_WS_SetupParams2& own)
{
    ZV_WS_CacheParam2 param;
    param.type = own.CacheKind;
    param.flags = static_cast<int>(own.CacheData);
    param.size = own.CacheLimit;
    param.path = own.CachePath;
    return param;
}

// Opens the session's cache. A file that cannot be opened is made anew once when `mayReplace`; one that another process
// holds is not, and the session works without.
bool OpenCache(SessionImpl& session, bool mayReplace)
{
    const ZV_WS_CacheParam2 param = CacheParamOf(session.m_Params);
    const char* file = param.path.c_str();
    session.m_Cache = std::make_unique<CacheMgr>();
    int code = session.m_Cache->Open(param);
    if (CacheMgr::IsLocked(code)) {
        session.m_Cache.reset();
        ZV_LogOutput(GetZV_LogAreaID(), ZV_LOG_ERROR, "%s is locked by another process, working without a cache\n",
                     file);
        return true;
    }
    if (code != 0 && mayReplace && ZVFile::Exist(file) && ZVFile::Remove(file)) code = session.m_Cache->Open(param);
    if (code != 0) return false;
    if (param.type == CacheType_File) session.m_Writer = CacheWriter::Of(param);
    return true;
}

// The first opening of a cache by a session.
bool OpenAndSweepCache(SessionImpl& session)
{
    CacheSweep sweep(session.m_Params.CachePath);
    if (!OpenCache(session, true)) return false;
    if (session.m_Cache && session.m_Params.CacheKind == CacheType_File) sweep.AfterOpening();
    return true;
}

void PutSession(ZV_WS_Session& handle, std::unique_ptr<SessionImpl> session)
{
    ZVMutexLock lock(HandleMutex());
    handle._pSessionImpl = session.release();
}

// What was in the handle is overwritten unseen: it may be memory that nobody has set.
void MakeEmpty(ZV_WS_Session& handle)
{
    handle._pImpl = nullptr;
    PutSession(handle, nullptr);
}

void MakeSession(ZV_WS_Session& handle)
{
    MakeEmpty(handle);
    handle._pImpl = new unsigned int(SessionImpl::kTag);
    PutSession(handle, std::make_unique<SessionImpl>());
}

// The device's kind of access, asked from the service when the caller does not know it.
ZV_WS_AccessType AccessTypeOf(ZV_WS_Session* handle, ZV_WS_AccessType given)
{
    if (given == ACCESS_TYPE_DOWNLOAD || given == ACCESS_TYPE_STREAM) return given;
    ZV_WS_FileType fileType;
    ZV_WS_getFileType(handle, &fileType);
    const ZV_WS_AccessType asked = fileType.AccessType;
    ZV_WS_release(&fileType);
    return asked;
}

ZV_WS_Status Initialize(ZV_WS_Session* handle, const ZV_WS_SetupParams& params)
{
    if (!AreValid(params)) return ZV_WS_Status_invalid_param;
    const Deployment* deployment = Deployment::Load();
    if (!deployment) return ZV_WS_Status_file_operation_error;
    if (params.CacheParam.Type == CacheType_File) {
        const ZVString folder = CacheFolder(params.CacheParam.Path);
        if (!ZVFile::FolderExist(folder.c_str()) && !ZVFile::CreateFolder(folder.c_str(), kPrivateFolder)) {
            return ZV_WS_Status_failed_to_create_cache_folder;
        }
    }
    SessionImpl& session = *handle->_pSessionImpl;
    ZV_WS_SetupParams2& own = session.m_Params;
    CopyIdentity(own, params);
    CopyProxy(own, params.ProxyParam);
    CopyCache(own, params.CacheParam);

    if (!PrepareConnections(session, *deployment)) return ZV_WS_Status_ssl_error;
    own.ServiceBaseURL =
        ZVUtilities::QueryServiceBaseURL(params.Type, &session.m_Stream, own.DestinationUniqueID.c_str(),
                                         own.DestinationTypeID, params.EnvNum, own.EnvID);
    if (own.ServiceBaseURL.empty()) {
        const bool isClockWrong = session.m_Stream.transport().ClockVerdict() == Clock::Verdict::Wrong;
        return isClockWrong ? ZV_WS_Status_clock_wrong : ZV_WS_Status_connection_error;
    }

    CopyGiven(own.ApplicationRevision, params.ApplicationRevision);
    CopyGiven(own.FirmwareRevision, params.FirmwareRevision);
    CopyGiven(own.ModelCode, params.ModelCode);
    own.UserAgent = MakeUserAgent(own);
    // With a line end of its own: what another thread prints next would stand on the same line.
    if (!own.UserAgent.empty()) printf("\n***---> User-Agent = %s\n", own.UserAgent.c_str());
    SetParams(session);
    own.AccessType = AccessTypeOf(handle, params.AccessType);
    InitFacade(session);

    if (own.CacheKind == CacheType_None) return ZV_WS_Status_ok;
    if (!OpenAndSweepCache(session)) return ZV_WS_Status_local_cache_error;
    ZV_WS_updateLocalCache(handle, ZV_WS_CacheParam::CacheData_Metadata | ZV_WS_CacheParam::CacheData_Userdata);
    return ZV_WS_Status_ok;
}

// Empties and tags the output, then calls `use(session)` with the session behind the handle.
template <class Output, class Use>
ZV_WS_Status WithSession(const ZV_WS_Session* handle, Output* out, Use use)
{
    ZV_ASSERT(out != 0);
    return Records::Fill(*out, [&] {
        if (!SessionOf(handle)) return ZV_WS_Status_invalid_param;
        return use(*handle->_pSessionImpl);
    });
}

ZV_WS_Status SetText(ZV_WS_String& to, const ZVString& text)
{
    ZVUtilities::SetText(to, text);
    return ZV_WS_Status_ok;
}

}  // namespace

ZV_WS_Status ZV_WS_initialize(ZV_WS_Session* handle, const ZV_WS_SetupParams* params)
{
    ZV_ASSERT(handle != 0);
    ZV_ASSERT(params != 0);
    const ZV_WS_Status status = GuardCall([&] {
        MakeSession(*handle);
        return Initialize(handle, *params);
    });
    if (status != ZV_WS_Status_ok && status != ZV_WS_Status_ssl_error) ZV_WS_release(handle);
    return status;
}

ZV_WS_Status ZV_WS_duplicate(ZV_WS_Session* newHandle, const ZV_WS_Session* source)
{
    ZV_ASSERT(newHandle != 0);
    MakeEmpty(*newHandle);
    if (!SessionOf(source)) return ZV_WS_Status_invalid_param;
    return GuardCall([&] {
        MakeSession(*newHandle);
        SessionImpl& session = *newHandle->_pSessionImpl;
        const Deployment& deployment = source->_pSessionImpl->m_Browse.transport().deployment();
        session.m_Params = source->_pSessionImpl->m_Params;
        if (!PrepareConnections(session, deployment)) return ZV_WS_Status_ssl_error;
        SetParams(session);
        InitFacade(session);
        // A memory cache is one session's own.
        const bool opened = session.m_Params.CacheKind != CacheType_File || OpenCache(session, false);
        return opened ? ZV_WS_Status_ok : ZV_WS_Status_local_cache_error;
    });
}

ZVMutex& HandleMutex()
{
    static auto* mutex = new ZVMutex;  // outlives threads that still end a session at exit
    return *mutex;
}

void ReleaseSession(ZV_WS_Object* object)
{
    auto* handle = static_cast<ZV_WS_Session*>(object);
    std::unique_ptr<SessionImpl> session;  // ends after the lock
    ZVMutexLock lock(HandleMutex());
    session.reset(handle->_pSessionImpl);
    handle->_pSessionImpl = nullptr;
}

void ZV_WS_abort(const ZV_WS_Session* handle)
{
    if (!handle) return AbortClockQueries();
    ZVMutexLock lock(HandleMutex());
    SessionImpl* session = handle->_pSessionImpl;
    if (!session) return;
    session->m_Browse.transport().Abort();
    session->m_Stream.transport().Abort();
    session->m_Download.transport().Abort();
}

ZV_WS_Status ZV_WS_getVersion(ZV_WS_VersionInfo* version)
{
    ZV_ASSERT(version != 0);
    return Records::Fill(*version, [&] {
        version->Major = 1;
        version->Minor = 3;
        version->Revision = 1;
        return ZV_WS_Status_ok;
    });
}

ZV_WS_Status ZV_WS_getAvailableEnvLists(ZV_WS_EnvironmentLists* list)
{
    ZV_ASSERT(list != 0);
    list->size = std::size(kEnvironments);
    list->env = kEnvironments;
    return ZV_WS_Status_ok;
}

ZV_WS_Status ZV_WS_getDefaultEnvID(ZV_WS_Session* handle, ZV_WS_EnvID* env)
{
    return WithSession(handle, env, [&](SessionImpl& session) {
        const ZV_WS_SetupParams2& own = session.m_Params;
        const char* url =
            ZVUtilities::QueryServiceBaseURL(ContentType_ZV, &session.m_Stream, own.DestinationUniqueID.c_str(),
                                             own.DestinationTypeID, ENVNUM_DEFAULT, *env);
        return *url ? ZV_WS_Status_ok : ZV_WS_Status_net_error;
    });
}

ZV_WS_Status ZV_WS_getDeviceEnv(ZV_WS_Session* handle, ZV_WS_EnvID* env)
{
    return WithSession(handle, env, [&](SessionImpl& session) {
        *env = session.m_Params.EnvID;
        return ZV_WS_Status_ok;
    });
}

ZV_WS_Status ZV_WS_getUserAgent(ZV_WS_Session* handle, ZV_WS_String* userAgent)
{
    return WithSession(handle, userAgent, [&](SessionImpl& session) {
        const ZVString& text = session.m_Params.UserAgent;
        ZV_LogOutput(GetZV_LogAreaID(), ZV_LOG_TRACE, "%s,User Agent:%s\n", "ZV_WS_getUserAgent", text.c_str());
        return SetText(*userAgent, text);
    });
}

ZV_WS_Status ZV_WS_getDestinationUniqueID(ZV_WS_Session* handle, ZV_WS_String* id)
{
    return WithSession(handle, id,
                       [&](SessionImpl& session) { return SetText(*id, session.m_Params.DestinationUniqueID); });
}
