// What the three service wrappers share: taking their settings and preparing the headers of a request.
//
// A wrapper is a generated proxy and so one complete SOAP context: it serves one request at a time, on one thread at a
// time.
#pragma once

#include "SetupParams2.h"
#include "Transport.h"
#include "ZVAssert.h"
#include "soapStub.h"

namespace ServiceHeaders {

/// Connection settings, user agent and plug-ins of a wrapper's context.
void Configure(Transport& transport, const ZV_WS_SetupParams2& params);

/// Clears the header and starts the one of the next request: addressing and the user's token with a fresh digest.
/// Returns the SOAP runtime's error number.
int Start(soap& context, const ZVString& endpoint, const ZVString& operation, const ZV_WS_SetupParams2& params);

/// The device's settings block: one shape under the name each service gives it. Its texts are borrowed from `params`,
/// but for the token, which another session may change at any time.
template <class Settings>
int Fill(soap& context, Settings*& block, const ZV_WS_SetupParams2& params)
{
    block = static_cast<Settings*>(soap_malloc(&context, sizeof(Settings)));
    if (!block) return context.error = SOAP_EOM;
    new (block) Settings;
    block->APIKey = const_cast<char*>(params.APIKey.c_str());
    block->AuthToken = soap_strdup(&context, params.Customer->Token().c_str());
    if (!block->AuthToken) return context.error = SOAP_EOM;
    block->DestinationUniqueID = const_cast<char*>(params.DestinationUniqueID.c_str());
    block->DestinationTypeID = params.DestinationTypeID;
    return SOAP_OK;
}

}  // namespace ServiceHeaders

/// `Settings` is the type of the service's device-settings block, `block` its place in the header.
template <class Proxy, class Settings, Settings* SOAP_ENV__Header::*block>
class ServiceWrapper : public Proxy {
public:
    /// Both texts must live as long as the wrapper.
    ServiceWrapper(const char* name, const char* fileName)
        : Proxy(kMode), m_Name(name), m_FileName(fileName), m_Transport(*this)
    {}

    /// Once, before the first request. `params` is borrowed and must outlive the wrapper.
    void SetParams(const ZV_WS_SetupParams2* params)
    {
        ZV_ASSERT(params != 0);
        ZV_ASSERT(m_Params == 0);
        m_Params = params;
        m_Endpoint = params->ServiceBaseURL + m_FileName;
        ServiceHeaders::Configure(m_Transport, *params);
        this->soap_endpoint = m_Endpoint.c_str();
    }

    /// Before every request, with the name of the operation to be sent. Returns the SOAP runtime's error number.
    int Setup(const ZVString& operation)
    {
        ZV_ASSERT(m_Params != 0);
        if (!m_Transport.UseHost(m_Endpoint.c_str())) return this->error = SOAP_SSL_ERROR;
        if (ServiceHeaders::Start(*this, m_Endpoint, operation, *m_Params)) return this->error;
        return ServiceHeaders::Fill(*this, this->header->*block, *m_Params);
    }

    Transport& transport() { return m_Transport; }
    const char* ProxyName() const { return m_Name; }
    const ZVString& Endpoint() const { return m_Endpoint; }

private:
    // The services use no references between elements. Looking for them would cost a third of a call: for every array
    // that it reads, the runtime walks the table of all references.
    static constexpr soap_mode kMode = SOAP_IO_KEEPALIVE | SOAP_C_UTFSTRING | SOAP_XML_TREE;

    const char* m_Name;
    const char* m_FileName;
    Transport m_Transport;
    const ZV_WS_SetupParams2* m_Params = nullptr;
    ZVString m_Endpoint;
};
