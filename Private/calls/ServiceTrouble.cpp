#include "ServiceTrouble.h"

#include <algorithm>

#include "SessionImpl.h"

RetryAfter::Heard TakeHeard(const ZV_WS_Session& session)
{
    RetryAfter::Heard heard;
    SessionImpl* const impl = SessionOf(&session);
    if (!impl) return heard;
    for (Transport* transport :
         {&impl->m_Browse.transport(), &impl->m_Stream.transport(), &impl->m_Download.transport()}) {
        const RetryAfter::Heard one = transport->retryAfter().Take();
        heard.answered |= one.answered;
        heard.silent |= one.silent;
        heard.unavailable |= one.unavailable;
        heard.seconds = std::max(heard.seconds, one.seconds);
    }
    return heard;
}
