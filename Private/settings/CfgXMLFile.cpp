#include "CfgXMLFile.h"

#include "CfgXMLDocument.h"
#include "EVPCipher.h"
#include "SafeFile.h"
#include "ZV_Log.h"

ZV_LOG_AREA(ZVWS_SoapProxyLOG_AREA_NAME)

namespace {

constexpr mode_t kMode = 0600;

// `isRuined`: whether there is a file that can never be a settings document.
unsigned int Load(const ZVString& path, unsigned int whenAbsent, CfgXMLDocument& document, bool& isRuined)
{
    ZVString text;
    isRuined = false;
    switch (SafeFile::Read(path.c_str(), CfgXMLFile::kMaxSize, text)) {
        case SafeFile::ReadResult::kRead:
            isRuined = !document.Parse(text);
            return isRuined ? CfgXMLFile::kNotFound : CfgXMLFile::kOk;
        case SafeFile::ReadResult::kAbsent:
            return whenAbsent;
        case SafeFile::ReadResult::kTooLarge:
            isRuined = true;
            break;
        case SafeFile::ReadResult::kUnopened:
            return CfgXMLFile::kUnopened;
        case SafeFile::ReadResult::kUnreadable:
            break;
    }
    return CfgXMLFile::kUnreadable;
}

void LogRuin(const ZVString& path)
{
    ZV_LogOutput(GetZV_LogAreaID(), ZV_LOG_ERROR,
                 "CfgXMLFile: no settings document, kept with \".bad\" behind its name: %s\n", path.c_str());
}

unsigned int Unprotect(const ZVString& key, const ZVString& packed, ZVString& value)
{
    ZVString seal, cipherText;
    if (!UnPackEncryptedValue(packed, seal, cipherText)) return CfgXMLFile::kInvalidValue;
    EVPCipher cipher;
    if (!cipher.UseDeviceKey(false)) return CfgXMLFile::kNoDeviceKey;
    return cipher.Decipher(key, seal, cipherText, value) ? CfgXMLFile::kOk : CfgXMLFile::kInvalidValue;
}

unsigned int Protect(const ZVString& key, const ZVString& value, ZVString& packed)
{
    EVPCipher cipher;
    if (!cipher.UseDeviceKey(true)) return CfgXMLFile::kNoDeviceKey;
    ZVString seal, cipherText;
    const bool enciphered =
        cipher.Encipher(key, value, seal, cipherText) && PackEncryptedValue(seal, cipherText, packed);
    return enciphered ? CfgXMLFile::kOk : CfgXMLFile::kUnwritable;
}

// The new document must read back as what was asked for; a key or value that XML cannot hold shows here.
bool Holds(const ZVString& text, const ZVString& key, const ZVString& value)
{
    CfgXMLDocument document;
    const ZVString* stored = document.Parse(text) ? document.Find(key) : nullptr;
    return stored && *stored == value;
}

}  // namespace

unsigned int CfgXMLFile::Read(const ZVString& key, ZVString& value, bool protectedValue)
{
    value = ZVString();
    if (key.empty()) return kEmptyKey;
    CfgXMLDocument document;
    bool isRuined = false;
    const unsigned int loaded = Load(m_Path, kUnopened, document, isRuined);
    if (loaded != kOk) return loaded;
    const ZVString* stored = document.Find(key);
    if (!stored) return kNotFound;
    if (protectedValue && !stored->empty()) return Unprotect(key, *stored, value);
    value = *stored;
    return kOk;
}

unsigned int CfgXMLFile::Write(const ZVString& key, const ZVString& value, bool protectedValue)
{
    if (key.empty()) return kEmptyKey;
    if (key.length() > kMaxSize || value.length() > kMaxSize) return kUnwritable;
    ZVString stored = value;
    if (protectedValue && !value.empty()) {
        const unsigned int result = Protect(key, value, stored);
        if (result != kOk) return result;
    }

    const SafeFile::FolderLock lock(m_Path);
    if (!lock.Held()) return kUnwritable;
    CfgXMLDocument document;
    bool isRuined = false;
    const unsigned int loaded = Load(m_Path, kOk, document, isRuined);
    if (loaded != kOk && !isRuined) return loaded;
    const ZVString text = (isRuined ? CfgXMLDocument() : document).With(key, stored);
    if (text.length() > kMaxSize) return kUnwritable;
    if (!Holds(text, key, stored)) return kInvalidValue;
    if (!SafeFile::Replace(m_Path, text, kMode, isRuined)) return kUnwritable;
    if (isRuined) LogRuin(m_Path);
    return kOk;
}
