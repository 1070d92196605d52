#include "ZVWSLibAEPrefetchPause.h"

#include <unistd.h>

#include "ZVUtilities.h"
#include "ZVWSAELog.h"
#include "ZV_Log.h"

ZV_LOG_AREA(ZVWSAELOG_AREA_NAME)

namespace {

uint32_t SystemRandom()
{
    uint32_t number = 0;
    // What is left in `number` when the system has none makes a short pause.
    if (getentropy(&number, sizeof number) != 0) number = 0;
    return number;
}

// The families of HTTP, TLS and SOAP: a transport error that is subtracted from the family's number.
constexpr bool IsTransportFamily(ZV_WS_Status status)
{
    return status <= ZV_WS_Status_http_error && status > ZV_WS_Status_soap_error - 1000;
}

}  // namespace

PrefetchPause::PrefetchPause() : PrefetchPause(ZVUtilities::MillisecondTime, SystemRandom) {}

bool PrefetchPause::IsOver()
{
    const ZVMutexLock lock(m_Mutex);
    return m_Backoff.IsOver(m_Clock());
}

uint64_t PrefetchPause::Answers()
{
    const ZVMutexLock lock(m_Mutex);
    return m_Answers;
}

bool PrefetchPause::IsTrouble(ZV_WS_Status status, const RetryAfter::Heard& heard)
{
    // An image that is there can be used although its host did not answer: the status alone does not tell.
    if (heard.silent || heard.unavailable || IsTransportFamily(status)) return true;
    return status == ZV_WS_Status_connection_error || status == ZV_WS_Status_timeout_error ||
           status == ZV_WS_Status_net_error || status == ZV_WS_Status_clock_wrong;
}

bool PrefetchPause::Note(ZV_WS_Status status, const RetryAfter::Heard& heard)
{
    const bool isTrouble = IsTrouble(status, heard);
    const ZVMutexLock lock(m_Mutex);
    const uint64_t now = m_Clock();
    if (isTrouble) {
        m_Backoff.Failed(now, m_Random(), heard.seconds);
        ZV_LogOutput(GetZV_LogAreaID(), ZV_LOG_TRACE, "fetching ahead pauses for %u ms, status:%d,Retry-After:%u s\n",
                     static_cast<unsigned int>(m_Backoff.Remaining(now)), static_cast<int>(status), heard.seconds);
    } else if (status == ZV_WS_Status_ok && heard.answered) {
        ++m_Answers;
        m_Backoff.Answered(now, m_Random());
    }
    return isTrouble;
}
