#include "Base64.h"

#include <openssl/evp.h>

#include <algorithm>

namespace simulator {

std::string Base64(const std::string& bytes)
{
    std::string text(4 * ((bytes.size() + 2) / 3) + 1, '\0');
    text.resize(static_cast<size_t>(EVP_EncodeBlock(reinterpret_cast<unsigned char*>(&text[0]),
                                                    reinterpret_cast<const unsigned char*>(bytes.data()),
                                                    static_cast<int>(bytes.size()))));
    return text;
}

std::string Unbase64(const std::string& text)
{
    std::string bytes(text.size() + 1, '\0');
    const int length =
        EVP_DecodeBlock(reinterpret_cast<unsigned char*>(&bytes[0]),
                        reinterpret_cast<const unsigned char*>(text.data()), static_cast<int>(text.size()));
    const auto padding = std::count(text.begin(), text.end(), '=');
    if (length < padding || padding > 2) return "";
    bytes.resize(static_cast<size_t>(length - padding));
    return bytes;
}

}  // namespace simulator
