// Read before every file of the toolkit's code. That code uses what it allocates without looking whether it could be
// had: a request would be written through a null pointer, or an array or attribute of an answer be left out unseen.
// Here the calls that it makes throw std::bad_alloc instead, which ends the library's call.
#pragma once

#include <openssl/evp.h>
#include <stdsoap2.h>

#include <new>

template <class T>
T CheckedMemory(T result)
{
    if (!result) throw std::bad_alloc();
    return result;
}

inline char* CheckedCopy(soap* context, const char* text)
{
    return text ? CheckedMemory(soap_strdup(context, text)) : nullptr;
}

// The toolkit would go on with a context that knows no digest. It has no other owner than the call that is broken off.
inline int CheckedDigestInit(EVP_MD_CTX* context, const EVP_MD* type)
{
    if (EVP_DigestInit(context, type) == 1) return 1;
    EVP_MD_CTX_free(context);
    throw std::bad_alloc();
}

inline int CheckedAttribute(soap* context, const char* name, const char* value, int flag)
{
    const int result = soap_set_attr(context, name, value, flag);
    if (result == SOAP_EOM) throw std::bad_alloc();
    return result;
}

// A macro is not expanded inside of itself: these call the functions of their name.
#define soap_malloc(soap, size) CheckedMemory(soap_malloc(soap, size))
#define soap_strdup CheckedCopy
#define soap_set_attr CheckedAttribute
#define soap_s2base64(soap, bytes, text, size) CheckedMemory(soap_s2base64(soap, bytes, text, size))
#define soap_alloc_block(soap) CheckedMemory(soap_alloc_block(soap))
#define soap_save_block(soap, list, place, flag) CheckedMemory(soap_save_block(soap, list, place, flag))
#define EVP_MD_CTX_new() CheckedMemory(EVP_MD_CTX_new())
#define EVP_DigestInit CheckedDigestInit
