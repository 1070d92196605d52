// Methods that answer at once. None of them uses the network.
#include <openssl/evp.h>
#include <stdio.h>
#include <stdlib.h>
#include <string.h>

#include "ZVFile.h"
#include "ZVString.h"
#include "ZVWSLibAEDispatch.h"
#include "ZV_Log.h"

using namespace ae::stagecraft;

ZV_LOG_AREA(ZVWSAELOG_AREA_NAME)

namespace {

// The text form of an argument; empty when it is not there.
AEString TextOf(ASObject& object, const ASValueArray& arguments, size_t index)
{
    AEString text;
    if (index < arguments.size()) object.ToText(arguments[index], text);
    return text;
}

}  // namespace

void ZVWSLibAE::idle(StageWindow* /*window*/, ASObject& object, ASValueArray& /*arguments*/, ASValue& returnValue)
{
    const ZVWSAELog scope("ZVWSLibAE", "idle", GetZV_LogAreaID());
    m_Prefetcher->SetIdle();
    object.StartUpdates();
    returnValue = ASValue::Number(0);
}

void ZVWSLibAE::quitFlash(StageWindow* window, ASObject& object, ASValueArray& /*arguments*/, ASValue& returnValue)
{
    const ZVWSAELog scope("ZVWSLibAE", "quitFlash", GetZV_LogAreaID());
    object.StopUpdates();
    window->EndMovie();
    returnValue = ASValue::Number(0);
}

void ZVWSLibAE::trace(StageWindow* /*window*/, ASObject& object, ASValueArray& arguments, ASValue& /*returnValue*/)
{
    printf("FLASH TRACE == %s\n", TextOf(object, arguments, 0).c_str());
    fflush(stdout);
}

void ZVWSLibAE::getSysInfo(StageWindow* /*window*/, ASObject& object, ASValueArray& arguments, ASValue& returnValue)
{
    const ZVWSAELog scope("ZVWSLibAE", "getSysInfo", GetZV_LogAreaID());
    returnValue = ASValue::String(arguments.size() == 1 ? TextOf(object, arguments, 0) : AEString());
}

// ---- Files

void ZVWSLibAE::fileExist(StageWindow* /*window*/, ASObject& object, ASValueArray& arguments, ASValue& returnValue)
{
    const ZVWSAELog scope("ZVWSLibAE", "fileExist", GetZV_LogAreaID());
    bool exists = false;
    if (arguments.size() == 1) ZV_WS_fileExist(TextOf(object, arguments, 0).c_str(), &exists);
    returnValue = ASValue::Boolean(exists);
}

void ZVWSLibAE::clearLocalCache(StageWindow* /*window*/, ASObject& object, ASValueArray& arguments,
                                ASValue& returnValue)
{
    const ZVWSAELog scope("ZVWSLibAE", "clearLocalCache", GetZV_LogAreaID());
    returnValue = ASValue::Number(ZV_WS_clearLocalCache(TextOf(object, arguments, 0).c_str()));
}

namespace {

// The MD5 sum of a file in lower-case hexadecimal digits; empty when the file cannot be read whole.
ZVString Md5Of(const char* path)
{
    ZVFile file;
    const std::unique_ptr<EVP_MD_CTX, decltype(&EVP_MD_CTX_free)> digest(EVP_MD_CTX_new(), EVP_MD_CTX_free);
    if (!digest || !file.Open(path, "rb") || ZVFile::FolderExist(path)) return ZVString();
    EVP_DigestInit_ex(digest.get(), EVP_md5(), nullptr);
    char block[65536];
    zv_int64 got;
    while ((got = file.Read(block, sizeof block)) > 0)
        EVP_DigestUpdate(digest.get(), block, static_cast<size_t>(got));
    unsigned char sum[EVP_MAX_MD_SIZE];
    unsigned int size = 0;
    if (EVP_DigestFinal_ex(digest.get(), sum, &size) != 1) return ZVString();
    ZVString text;
    for (unsigned int i = 0; i < size; ++i) {
        char digits[3];
        snprintf(digits, sizeof digits, "%02x", sum[i]);
        text += digits;
    }
    return text;
}

}  // namespace

// Arguments: the movie's path, its MD5 sum as the movie's maker wrote it down. Guards against damage, not against
// forgery.
void ZVWSLibAE::checkZVSWFmd5sum(StageWindow* /*window*/, ASObject& object, ASValueArray& arguments,
                                 ASValue& returnValue)
{
    const ZVWSAELog scope("ZVWSLibAE", "checkZVSWFmd5sum", GetZV_LogAreaID());
    const ZVString sum = Md5Of(TextOf(object, arguments, 0).c_str());
    const bool isWhole = !sum.empty() && strcasecmp(sum.c_str(), TextOf(object, arguments, 1).c_str()) == 0;
    ZV_LogOutput(GetZV_LogAreaID(), ZV_LOG_TRACE, "ZVWSLibAE::checkZVSWFmd5sum result: (%s)\n",
                 isWhole ? "true" : "false");
    returnValue = ASValue::Boolean(isWhole);
}

// ---- Of the session: fixed at set-up, so that they can be read beside a worker.

void ZVWSLibAE::getUserAgent(StageWindow* /*window*/, ASObject& /*object*/, ASValueArray& /*arguments*/,
                             ASValue& returnValue)
{
    const ZVWSAELog scope("ZVWSLibAE", "getUserAgent", GetZV_LogAreaID());
    ZV_WS_String text;
    if (m_Call->IsInitialized()) ZV_WS_getUserAgent(&m_Call->Session(), &text);
    returnValue = ASValue::String(text.data ? text.data : "");
    ZV_WS_release(&text);
}

void ZVWSLibAE::getDeviceEnv(StageWindow* /*window*/, ASObject& /*object*/, ASValueArray& /*arguments*/,
                             ASValue& returnValue)
{
    const ZVWSAELog scope("ZVWSLibAE", "getDeviceEnv", GetZV_LogAreaID());
    ZV_WS_EnvID env = ENVID_APISTG;
    const bool known = m_Call->IsInitialized() && ZV_WS_getDeviceEnv(&m_Call->Session(), &env) == ZV_WS_Status_ok;
    returnValue = ASValue::Number(known ? static_cast<int>(env) : static_cast<int>(kNotInitialized));
}

// ---- Environments

namespace {

// The environment that the service assigns to the device; -1 when the session was not set up with that one. To ask the
// service (ZV_WS_getDefaultEnvID) would hold up the movie.
int DefaultEnvironment(ZVWSLibAE::ForegroundCall& call)
{
    ZV_WS_EnvID env = ENVID_APISTG;
    const bool known = call.HasAssignedEnv() && ZV_WS_getDeviceEnv(&call.Session(), &env) == ZV_WS_Status_ok;
    return known ? env : -1;
}

ASValue EnvironmentObject(ASObject& maker, const ZV_WS_Environment& environment)
{
    ASValue made;
    if (!maker.Construct("Object", ASValueArray(), made) || !made.IsObject()) return made;
    made.GetObject()->SetProperty("endpoint", ASValue::String(environment.endpoint));
    made.GetObject()->SetProperty("envNum", ASValue::Number(environment.envNum));
    return made;
}

}  // namespace

void ZVWSLibAE::getAvailableEnvLists(StageWindow* /*window*/, ASObject& object, ASValueArray& /*arguments*/,
                                     ASValue& returnValue)
{
    const ZVWSAELog scope("ZVWSLibAE", "getAvailableEnvLists", GetZV_LogAreaID());
    ZV_WS_EnvironmentLists list;
    ZV_WS_getAvailableEnvLists(&list);
    const int defaultEnvironment = DefaultEnvironment(*m_Call);

    if (!object.Construct("Array", ASValueArray(), returnValue) || !returnValue.IsObject()) return;
    ZV_LogOutput(GetZV_LogAreaID(), ZV_LOG_TRACE, "<<==========Available EnvLists (%d)===========\n",
                 static_cast<int>(list.size));
    for (unsigned int i = 0; i < list.size; ++i) {
        ZV_LogOutput(GetZV_LogAreaID(), ZV_LOG_TRACE, "envNum: %d, endpoint:%s\n", list.env[i].envNum,
                     list.env[i].endpoint);
        ASValueArray element;
        element.Append(EnvironmentObject(object, list.env[i]));
        if (list.env[i].envNum == defaultEnvironment && element[0].IsObject())
            element[0].GetObject()->SetProperty("isDefault", ASValue::Boolean(true));
        ASValue length;
        returnValue.GetObject()->Call("push", element, length);
    }
    ZV_LogOutput(GetZV_LogAreaID(), ZV_LOG_TRACE, "============Available EnvLists end============>\n");
}

// ---- Logging

namespace {

// A number in any base that C knows ("0x300"); 0 when it is none.
unsigned int NumberOf(const ZVString& text)
{
    return static_cast<unsigned int>(strtoul(text.c_str(), nullptr, 0));
}

// From the text up to the next comma, which is taken off with it.
ZVString NextField(ZVString& text)
{
    const size_t comma = text.find(',');
    ZVString field = text.substr(0, comma);
    text = comma == ZVString::npos ? ZVString() : text.substr(comma + 1);
    return field;
}

// "areas,target,folder" of the environment, which has the last word.
int InitLogsAs(ZVString given)
{
    const unsigned int areas = NumberOf(NextField(given));
    const auto target = static_cast<unsigned char>(NumberOf(NextField(given)));
    return given.empty() ? ZVWSAELog::InitWSLogs(areas, target) : ZVWSAELog::InitWSLogs(areas, target, given.c_str());
}

// What the movie asks for. The log file stands beside the settings.
struct LogSettings {
    AEString LogAreaIDs;
    AEString LogTarget;
    AEString SettingsFile;
    AEString PreferenceFile;
    ZVWS_PROPERTIES(LogAreaIDs, LogTarget, SettingsFile, PreferenceFile)
};

int InitLogs(ASObject& object)
{
    LogSettings settings;
    PropertyReader reader(object);
    settings.ReadWith(reader);
    if (!reader.Succeeded()) return ZVWSLibAE::kWrongArguments;
    const unsigned int areas = NumberOf(settings.LogAreaIDs.c_str());
    const auto target = static_cast<unsigned char>(NumberOf(settings.LogTarget.c_str()));
    for (const AEString& path : {settings.SettingsFile, settings.PreferenceFile}) {
        if (!strchr(path.c_str(), ZVFile::PATH_SEPERATOR)) continue;
        return ZVWSAELog::InitWSLogs(areas, target, ZVFile::GetFolderName(path.c_str()).c_str());
    }
    return ZVWSAELog::InitWSLogs(areas, target);
}

}  // namespace

void ZVWSLibAE::setLogAreaIDsAndTargetConfig(StageWindow* /*window*/, ASObject& /*object*/, ASValueArray& arguments,
                                             ASValue& returnValue)
{
    // The other methods' [callback, parameters] is an object, too, but has none of the properties.
    const bool given =
        arguments.size() == 1 && arguments[0].IsObject() && !arguments[0].GetObject()->IsInstanceOf("Array");
    const char* override = getenv("ZV_LOG");
    const auto init = [&] {
        return override && *override ? InitLogsAs(override) : InitLogs(*arguments[0].GetObject());
    };
    returnValue = ASValue::Number(given ? init() : static_cast<int>(kWrongArguments));
}
