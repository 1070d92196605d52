#include "ServiceCall.h"

#include <stdio.h>
#include <string.h>

#include <algorithm>

#include "Status.h"
#include "ZV_Log.h"

ZV_LOG_AREA(ZVWS_SoapProxyLOG_AREA_NAME)

ServiceCallBase::ServiceCallBase(const char* function, const ZV_WS_Session* handle)
    : m_Function(function), m_Session(SessionOf(handle))
{}

void ServiceCallBase::LogProxy(const char* verb, const char* proxy, const char* operation)
{
    ZV_LogOutput(GetZV_LogAreaID(), ZV_LOG_TRACE, "%s %s::%s\n", verb, proxy, operation);
}

// The toolkit stops behind the element, whose name and text it still has.
void ServiceCallBase::LogUnreadable(const soap& context, const char* operation, int result)
{
    if (result != SOAP_TYPE && result != SOAP_EMPTY) return;
    char text[100];
    snprintf(text, sizeof text, "%.99s", context.tmpbuf);
    std::replace_if(
        text, text + strlen(text), [](unsigned char c) { return c < 0x20 || c == 0x7f; }, '?');
    ZV_LogOutput(GetZV_LogAreaID(), ZV_LOG_ERROR, "%s, cannot read \"%s\" in %s\n", operation, text, context.tag);
}

ZV_WS_Status ServiceCallBase::Finish(soap& context, const Outcome& outcome)
{
    soap_destroy(&context);
    soap_end(&context);
    context.header = nullptr;
    LogCall(m_Function, outcome.result, outcome.responseCode);
    if (m_ClockIsWrong) return ZV_WS_Status_clock_wrong;
    if (outcome.result == SOAP_OK && !outcome.answered) return ZV_WS_Status_general_error;
    return ZVUtilities::To_ZV_WS_Status(outcome.result, m_UsesResponseCode ? outcome.responseCode : 0, m_Function);
}

void LogCall(const char* function, int result, int responseCode)
{
    ZV_LogOutput(GetZV_LogAreaID(), ZV_LOG_TRACE, "%s, ret:%d,responseCode:%d\n", function, result, responseCode);
}

ZV_WS_Status LogStatus(const char* function, ZV_WS_Status status)
{
    LogCall(function, status, 0);
    return status;
}

void DropStale(ServiceCallBase& call, const char* table, const std::function<bool(CacheInterface&)>& more)
{
    if (call.change() == ServiceCallBase::Change::None) return;
    WithinMemory([&] { SessionCache(call.session()).UserDataChanged(table, more); });
}

ZV_WS_Status LogAnswer(const char* function, ZV_WS_Status status, const bool& answer)
{
    ZV_LogOutput(GetZV_LogAreaID(), ZV_LOG_TRACE, "%s, result:%d\n", function, answer);
    return status;
}
