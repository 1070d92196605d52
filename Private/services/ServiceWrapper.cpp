#include "ServiceWrapper.h"

#include <wsaapi.h>
#include <wsseapi.h>

namespace {

// Actions are the schema's namespace and the operation, whatever host serves it.
const char kActionNamespace[] = "http://api.zorvane.example/api/";
const char kAnonymous[] = "http://schemas.xmlsoap.org/ws/2004/08/addressing/role/anonymous";

}  // namespace

namespace ServiceHeaders {

void Configure(Transport& transport, const ZV_WS_SetupParams2& params)
{
    soap& context = transport.context();
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
    return soap_wsse_add_UsernameTokenDigest_at(&context, "User", params.UserName.c_str(), params.Password.c_str(),
                                                Clock::Now());
}

}  // namespace ServiceHeaders
