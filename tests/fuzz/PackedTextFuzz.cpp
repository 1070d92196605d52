// Protected settings as they stand in the document: packed texts, and what is enciphered into them.
#include "Deployment.h"
#include "EVPCipher.h"
#include "MemoryFile.h"
#include "Target.h"

namespace {

constexpr char kName[] = "Password";
constexpr char kKept[] = "secret";  // what the seeds hold

const EVPCipher& Cipher()
{
    static const EVPCipher* const cipher = [] {
        static const MemoryFile key("0123456789abcdef0123456789ABCDEF");
        static const MemoryFile deployment(std::string("device_key_file = ") + key.Path() + "\n");
        setenv("ZV_DEPLOYMENT", deployment.Path(), 1);
        Require(Deployment::Load() != nullptr, "the deployment is right");
        auto* made = new EVPCipher;
        Require(made->UseDeviceKey(false), "the device key is one");
        return made;
    }();
    return *cipher;
}

void Unpack(const ZVString& packed)
{
    ZVString seal, cipherText, repacked, plain;
    if (!UnPackEncryptedValue(packed, seal, cipherText)) return;
    Require(PackEncryptedValue(seal, cipherText, repacked) && repacked == packed, "a text has one form");
    Require(!Cipher().Decipher(kName, seal, cipherText, plain) || plain == kKept, "nothing can be forged");
}

void RoundTrip(const ZVString& plain)
{
    ZVString seal, cipherText, packed, again;
    Require(Cipher().Encipher(kName, plain, seal, cipherText) && PackEncryptedValue(seal, cipherText, packed),
            "any text can be enciphered");
    Require(UnPackEncryptedValue(packed, seal, cipherText) && Cipher().Decipher(kName, seal, cipherText, again) &&
                again == plain,
            "and deciphered");
    Require(!Cipher().Decipher("Other", seal, cipherText, again), "under its own name only");
    if (cipherText.empty()) return;
    cipherText[cipherText.length() / 2] ^= 1;
    Require(!Cipher().Decipher(kName, seal, cipherText, again) && again.empty(), "and untouched only");
}

}  // namespace

void TestInput(std::string_view input)
{
    const ZVString text(input.data(), input.size());
    Unpack(text);
    RoundTrip(text);
}
