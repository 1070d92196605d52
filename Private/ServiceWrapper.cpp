#include "ServiceWrapper.h"

#include <wsaapi.h>
#include <wsseapi.h>

namespace {

// Actions are the schema's namespace and the operation, whatever host serves it.
const char kActionNamespace[] = "http://api.zorvane.example/api/";
const char kAnonymous[] = "http://schemas.xmlsoap.org/ws/2004/08/addressing/role/anonymous";

const char* OrNull(const ZVString& text)
{
    return text.empty() ? nullptr : text.c_str();
}

}  // namespace

namespace ServiceHeaders {

void Configure(Transport& transport, const ZV_WS_SetupParams2& params)
{
    soap& context = transport.context();
    if (!params.ProxyHost.empty()) {
        context.proxy_host = params.ProxyHost.c_str();
        context.proxy_port = params.ProxyPort;
        context.proxy_userid = OrNull(params.ProxyUserName);
        context.proxy_passwd = OrNull(params.ProxyPassword);
        context.proxy_http_version = "1.1";
    }
    transport.SetUserAgent(params.UserAgent);
    transport.SetTimeouts(params.SendTimeout, params.ReceiveTimeout);
    soap_register_plugin(&context, soap_wsa);
    soap_register_plugin(&context, soap_wsse);
}

int Start(soap& context, const ZVString& endpoint, const ZVString& operation, const ZV_WS_SetupParams2& params)
{
    context.header = nullptr;
    const ZVString messageID = ZVString("uuid:") + operation;
    const ZVString action = ZVString(kActionNamespace) + operation;
    if (soap_wsa_request(&context, messageID.c_str(), endpoint.c_str(), action.c_str())) return context.error;
    if (soap_wsa_add_ReplyTo(&context, kAnonymous)) return context.error;
    return soap_wsse_add_UsernameTokenDigest(&context, "User", params.UserName.c_str(), params.Password.c_str());
}

}  // namespace ServiceHeaders
