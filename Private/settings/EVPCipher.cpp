#include "EVPCipher.h"

#include <openssl/crypto.h>
#include <openssl/evp.h>
#include <openssl/kdf.h>
#include <openssl/rand.h>
#include <stdio.h>
#include <string.h>

#include <memory>
#include <string>

#include "Deployment.h"
#include "SafeFile.h"

namespace {

constexpr size_t kNonceSize = 12;
constexpr size_t kTagSize = 16;
constexpr size_t kLengthDigits = 4;
constexpr char kPurpose[] = "ZVWSLib settings";  // other keys can be derived from the device's for other purposes

const unsigned char* Bytes(const ZVString& text)
{
    return reinterpret_cast<const unsigned char*>(text.c_str());
}

ZVString Text(const std::string& bytes)
{
    return ZVString(bytes.data(), bytes.size());
}

unsigned char* Buffer(std::string& bytes)
{
    return reinterpret_cast<unsigned char*>(&bytes[0]);
}

ZVString EncodeBase64(const ZVString& bytes)
{
    std::string text((bytes.length() + 2) / 3 * 4 + 1, '\0');
    const int length = EVP_EncodeBlock(Buffer(text), Bytes(bytes), static_cast<int>(bytes.length()));
    return ZVString(text.data(), static_cast<size_t>(length));
}

bool DecodeBase64(const ZVString& text, ZVString& bytes)
{
    bytes = ZVString();
    if (text.empty()) return true;
    std::string decoded(text.length() / 4 * 3, '\0');
    if (text.length() % 4 != 0 || EVP_DecodeBlock(Buffer(decoded), Bytes(text), static_cast<int>(text.length())) !=
                                      static_cast<int>(decoded.size()))
        return false;
    const size_t padding = (text[text.length() - 1] == '=') + (text[text.length() - 2] == '=');
    bytes = ZVString(decoded.data(), decoded.size() - padding);
    return EncodeBase64(bytes) == text;
}

bool ReadKeyFile(const ZVString& path, ZVString& key)
{
    return SafeFile::Read(path.c_str(), EVPCipher::kDeviceKeySize, key) == SafeFile::ReadResult::kRead &&
           key.length() == EVPCipher::kDeviceKeySize;
}

// Under the lock, so that of two first users one makes the key and both use it.
bool MakeKeyFile(const ZVString& path)
{
    const SafeFile::FolderLock lock(path);
    ZVString present;
    if (!lock.Held()) return false;
    if (SafeFile::Read(path.c_str(), EVPCipher::kDeviceKeySize, present) != SafeFile::ReadResult::kAbsent) return true;
    unsigned char key[EVPCipher::kDeviceKeySize];
    return RAND_priv_bytes(key, sizeof key) == 1 &&
           SafeFile::Replace(path, ZVString(reinterpret_cast<const char*>(key), sizeof key), 0600);
}

using Context = std::unique_ptr<EVP_CIPHER_CTX, decltype(&EVP_CIPHER_CTX_free)>;

// Everything up to the tag, in either direction.
Context Transform(bool encipher, const unsigned char* key, const unsigned char* nonce, const ZVString& name,
                  const ZVString& from, std::string& to)
{
    Context context(EVP_CIPHER_CTX_new(), EVP_CIPHER_CTX_free);
    int count = 0;
    to.assign(from.length(), '\0');
    if (context && EVP_CipherInit_ex(context.get(), EVP_aes_256_gcm(), nullptr, key, nonce, encipher) == 1 &&
        EVP_CipherUpdate(context.get(), nullptr, &count, Bytes(name), static_cast<int>(name.length())) == 1 &&
        EVP_CipherUpdate(context.get(), Buffer(to), &count, Bytes(from), static_cast<int>(from.length())) == 1)
        return context;
    return Context(nullptr, EVP_CIPHER_CTX_free);
}

}  // namespace

EVPCipher::~EVPCipher()
{
    OPENSSL_cleanse(m_Key, sizeof m_Key);
}

bool EVPCipher::UseDeviceKey(bool make)
{
    const ZVString& path = Deployment::Current().device_key_file;
    ZVString key;
    if (path.empty()) return false;
    return (ReadKeyFile(path, key) || (make && MakeKeyFile(path) && ReadKeyFile(path, key))) && Derive(key);
}

bool EVPCipher::Derive(const ZVString& deviceKey)
{
    const std::unique_ptr<EVP_PKEY_CTX, decltype(&EVP_PKEY_CTX_free)> context(
        EVP_PKEY_CTX_new_id(EVP_PKEY_HKDF, nullptr), EVP_PKEY_CTX_free);
    size_t size = sizeof m_Key;
    return context && EVP_PKEY_derive_init(context.get()) == 1 &&
           EVP_PKEY_CTX_set_hkdf_md(context.get(), EVP_sha256()) == 1 &&
           EVP_PKEY_CTX_set1_hkdf_key(context.get(), Bytes(deviceKey), static_cast<int>(deviceKey.length())) == 1 &&
           EVP_PKEY_CTX_add1_hkdf_info(context.get(), reinterpret_cast<const unsigned char*>(kPurpose),
                                       sizeof kPurpose - 1) == 1 &&
           EVP_PKEY_derive(context.get(), m_Key, &size) == 1 && size == sizeof m_Key;
}

bool EVPCipher::Encipher(const ZVString& name, const ZVString& plain, ZVString& seal, ZVString& cipherText) const
{
    std::string sealing(kNonceSize + kTagSize, '\0'), enciphered;
    if (RAND_bytes(Buffer(sealing), kNonceSize) != 1) return false;
    const Context context = Transform(true, m_Key, Buffer(sealing), name, plain, enciphered);
    int count = 0;
    if (!context || EVP_CipherFinal_ex(context.get(), nullptr, &count) != 1 ||
        EVP_CIPHER_CTX_ctrl(context.get(), EVP_CTRL_AEAD_GET_TAG, kTagSize, &sealing[kNonceSize]) != 1)
        return false;
    seal = Text(sealing);
    cipherText = Text(enciphered);
    return true;
}

bool EVPCipher::Decipher(const ZVString& name, const ZVString& seal, const ZVString& cipherText, ZVString& plain) const
{
    plain = ZVString();
    if (seal.length() != kNonceSize + kTagSize) return false;
    std::string deciphered;
    const Context context = Transform(false, m_Key, Bytes(seal), name, cipherText, deciphered);
    std::string tag(seal.c_str() + kNonceSize, kTagSize);
    int count = 0;
    if (!context || EVP_CIPHER_CTX_ctrl(context.get(), EVP_CTRL_AEAD_SET_TAG, kTagSize, &tag[0]) != 1 ||
        EVP_CipherFinal_ex(context.get(), nullptr, &count) != 1)
        return false;
    plain = Text(deciphered);
    return true;
}

bool PackEncryptedValue(const ZVString& seal, const ZVString& cipherText, ZVString& packed)
{
    const ZVString first = EncodeBase64(seal);
    char length[16];
    snprintf(length, sizeof length, "%04u", static_cast<unsigned int>(first.length()));
    packed = ZVString(length) + first + EncodeBase64(cipherText);
    return strlen(length) == kLengthDigits;
}

bool UnPackEncryptedValue(const ZVString& packed, ZVString& seal, ZVString& cipherText)
{
    seal = cipherText = ZVString();
    if (packed.length() < kLengthDigits) return false;
    size_t length = 0;
    for (size_t i = 0; i < kLengthDigits; ++i) {
        if (packed[i] < '0' || packed[i] > '9') return false;
        length = length * 10 + static_cast<size_t>(packed[i] - '0');
    }
    if (length > packed.length() - kLengthDigits) return false;
    if (DecodeBase64(packed.substr(kLengthDigits, length), seal) &&
        DecodeBase64(packed.substr(kLengthDigits + length), cipherText))
        return true;
    seal = cipherText = ZVString();
    return false;
}
