#include "Serializer.h"

#include <string.h>

#include <algorithm>
#include <new>

#include "CallGuard.h"
#include "Namespaces.h"
#include "ReadLimits.h"

Serializer::Serializer(bool compress, bool indent)
{
    fsend = Serializer_fsend;
    frecv = Serializer_frecv;
    // Strings are UTF-8. Without references between elements a damaged text cannot point into another part of itself.
    const soap_mode common = SOAP_ENC_PLAIN | SOAP_XML_TREE | SOAP_C_UTFSTRING;
    soap_mode output = common | (compress ? SOAP_ENC_ZLIB : SOAP_IO_BUFFER);
    if (indent) output |= SOAP_XML_INDENT;
    soap_set_imode(this, common);
    soap_set_omode(this, output);
    mode = common;
    soap_set_namespaces(this, ::namespaces);  // not the member
    LimitReading(*this);
}

Serializer::~Serializer()
{
    soap_destroy(this);
    soap_end(this);
}

int Serializer::BeginPut()
{
    soap_begin(this);
    const int result = soap_begin_send(this);
    version = 1;
    return result;
}

int Serializer::EndPut()
{
    return soap_end_send(this);
}

int Serializer::BeginGet()
{
    soap_destroy(this);
    soap_end(this);
    soap_begin(this);
    // soap_begin_recv fills this buffer for a compressed text without looking whether it could be had.
    if (!z_buf) z_buf = static_cast<char*>(SOAP_MALLOC(this, sizeof buf));
    if (!z_buf) return error = SOAP_EOM;
    return soap_begin_recv(this);
}

int Serializer::EndGet()
{
    return soap_end_recv(this);
}

int Serializer::Serializer_fsend(soap* context, const char* data, size_t length)
{
    auto* pSerializer = static_cast<Serializer*>(context);
    ZV_ASSERT(pSerializer != 0);
    return WithinMemory([&] { pSerializer->xml.append(data, length); }) ? SOAP_OK : SOAP_EOM;
}

size_t Serializer::Serializer_frecv(soap* context, char* buffer, size_t size)
{
    auto* pSerializer = static_cast<Serializer*>(context);
    ZV_ASSERT(pSerializer != 0);
    ZVString& xml = pSerializer->xml;
    const size_t count = std::min(xml.length(), size);
    if (count == 0) return 0;
    memcpy(buffer, xml.c_str(), count);
    // 0 is an early end, which the reader reports.
    return WithinMemory([&] { xml = xml.substr(count); }) ? count : 0;
}
