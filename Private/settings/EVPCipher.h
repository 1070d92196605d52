// The cipher of protected settings: AES-256-GCM with a key derived (HKDF-SHA-256) from the device's own key. Each
// value has a fresh random nonce. A value is bound to its setting's name: moved to another name it does not decipher.
// A plain object without locking.
#pragma once

#include "ZVString.h"

class EVPCipher {
public:
    static constexpr size_t kDeviceKeySize = 32;

    EVPCipher() = default;
    ~EVPCipher();
    EVPCipher(const EVPCipher&) = delete;
    EVPCipher& operator=(const EVPCipher&) = delete;

    /// Takes the key from the deployment's device key file; with `make` a file that is absent is made first (32 random
    /// bytes, mode 0600). False without such a file, or when it does not hold exactly a key: it is left as it is.
    bool UseDeviceKey(bool make);

    /// `seal` gets nonce and tag, `cipherText` as many bytes as the plain text has. False when the library of ciphers
    /// fails.
    bool Encipher(const ZVString& name, const ZVString& plain, ZVString& seal, ZVString& cipherText) const;

    /// False, and an empty text, for what was not enciphered with this key and name, or was changed since.
    bool Decipher(const ZVString& name, const ZVString& seal, const ZVString& cipherText, ZVString& plain) const;

private:
    bool Derive(const ZVString& deviceKey);

    unsigned char m_Key[32] = {};
};

/// One text of both parts of an enciphered value: four decimal digits, the length of the first part in base64; the
/// first part; the second, both in base64. False when the first part is too long for that.
bool PackEncryptedValue(const ZVString& seal, const ZVString& cipherText, ZVString& packed);

/// The parts of a packed text. False, and empty parts, for a text that PackEncryptedValue cannot have made.
bool UnPackEncryptedValue(const ZVString& packed, ZVString& seal, ZVString& cipherText);
