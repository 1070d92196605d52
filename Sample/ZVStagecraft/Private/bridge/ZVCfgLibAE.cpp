#include "ZVCfgLibAE.h"

#include <string.h>

#include <string>

#include "ZVWSAELog.h"
#include "ZVWSLib.h"
#include "ZV_Log.h"

using namespace ae::stagecraft;

ZV_LOG_AREA(ZVWSAE_CFGLOG_AREA_NAME)

namespace {

bool Take(const ASValue& value, AEString& text)
{
    text = value.GetString();
    return value.GetType() == ASValue::kString && strlen(text.c_str()) == text.length();
}

bool Take(const ASValue& value, bool& flag)
{
    flag = value.GetBoolean();
    return value.GetType() == ASValue::kBoolean;
}

bool Take(const ASValue& value, ZV_WS_EnvNum& number)
{
    number = static_cast<ZV_WS_EnvNum>(ASToInt32(value.GetNumber()));
    return value.GetType() == ASValue::kNumber && value.GetNumber() == number;
}

// Whether the arguments begin with values of these kinds.
template <class... Values>
bool TakeAll(const ASValueArray& arguments, Values&... values)
{
    size_t index = 0;
    return arguments.size() >= sizeof...(values) && (... && Take(arguments[index++], values));
}

// What a method on the settings file returns.
template <class Call>
ASValue CodeOf(bool argumentsFit, const AEString& file, Call call)
{
    if (!argumentsFit) return ASValue::Number(ZVCfgLibAE::kWrongArguments);
    if (file.empty()) return ASValue::Number(ZVCfgLibAE::kNoFile);
    return ASValue::Number(call());
}

std::string EnvironmentFile(const AEString& settingsFile)
{
    const std::string path = settingsFile.c_str();
    return path.substr(0, path.rfind('/') + 1) + "env.xml";
}

}  // namespace

const char* ZVCfgLibAE::GetClassName()
{
    return "com.orvex.ZVCfgLib";
}

bool ZVCfgLibAE::FiresEvents()
{
    return false;
}

void ZVCfgLibAE::GetMethods(AEArray<ASExtensionClass::Method>& methodArrayToFill)
{
#define ZVCFGLIBAE_ROW(name) \
    methodArrayToFill.InsertAt(methodArrayToFill.size(), MakeMethod(#name, Method::kMemberFunction, &ZVCfgLibAE::name));
    ZVCFGLIBAE_METHODS(ZVCFGLIBAE_ROW)
}

ASExtensionClass* ZVCfgLibAE::ConstructInstance(StageWindow* /*window*/, ASObject& /*object*/,
                                                ASValueArray& /*arguments*/)
{
    return new ZVCfgLibAE;
}

void ZVCfgLibAE::DestructInstance(StageWindow* /*window*/, ASObject& object)
{
    delete object.GetExtensionInstance();
}

ZVCfgLibAE::~ZVCfgLibAE() = default;

void ZVCfgLibAE::OnUpdate(StageWindow* /*window*/, ASObject& /*object*/) {}

void ZVCfgLibAE::init(StageWindow* /*window*/, ASObject& /*object*/, ASValueArray& /*arguments*/, ASValue& returnValue)
{
    const ZVWSAELog scope("ZVCfgLibAE", "init", GetZV_LogAreaID());
    returnValue = ASValue::Number(kDone);
}

void ZVCfgLibAE::setFile(StageWindow* /*window*/, ASObject& /*object*/, ASValueArray& arguments, ASValue& returnValue)
{
    const ZVWSAELog scope("ZVCfgLibAE", "setFile", GetZV_LogAreaID());
    AEString path;
    const bool given = TakeAll(arguments, path) && !path.empty();
    if (given) m_File = path;
    returnValue = ASValue::Number(given ? kDone : kWrongArguments);
}

void ZVCfgLibAE::read(StageWindow* /*window*/, ASObject& /*object*/, ASValueArray& arguments, ASValue& returnValue)
{
    const ZVWSAELog scope("ZVCfgLibAE", "read", GetZV_LogAreaID());
    AEString key;
    bool isProtected = false;
    if (!TakeAll(arguments, key, isProtected)) {
        returnValue = ASValue::Number(kWrongArguments);
        return;
    }
    ZV_WS_String value;
    ZV_WS_readSetting(m_File.c_str(), key.c_str(), isProtected, &value);
    returnValue = value.data ? ASValue::String(value.data) : ASValue::Null();
    ZV_WS_release(&value);
}

void ZVCfgLibAE::write(StageWindow* /*window*/, ASObject& /*object*/, ASValueArray& arguments, ASValue& returnValue)
{
    const ZVWSAELog scope("ZVCfgLibAE", "write", GetZV_LogAreaID());
    AEString key, value;
    bool isProtected = false;
    const bool fit = TakeAll(arguments, key, value, isProtected);
    returnValue = CodeOf(fit, m_File,
                         [&] { return ZV_WS_writeSetting(m_File.c_str(), key.c_str(), value.c_str(), isProtected); });
}

void ZVCfgLibAE::selectEnv(StageWindow* /*window*/, ASObject& /*object*/, ASValueArray& arguments, ASValue& returnValue)
{
    const ZVWSAELog scope("ZVCfgLibAE", "selectEnv", GetZV_LogAreaID());
    ZV_WS_EnvNum number = ENVNUM_DEFAULT;
    const bool fit = TakeAll(arguments, number);
    returnValue = CodeOf(fit, m_File, [&] { return ZV_WS_createEnvXML(EnvironmentFile(m_File).c_str(), number); });
}

void ZVCfgLibAE::clearEnv(StageWindow* /*window*/, ASObject& /*object*/, ASValueArray& /*arguments*/,
                          ASValue& returnValue)
{
    const ZVWSAELog scope("ZVCfgLibAE", "clearEnv", GetZV_LogAreaID());
    returnValue = CodeOf(true, m_File, [&] { return ZV_WS_deleteEnvXML(EnvironmentFile(m_File).c_str()); });
}
