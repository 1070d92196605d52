#include "ClockQueries.h"

#include <set>

#include "ZVMutex.h"

namespace {

struct UnderWay {
    ZVMutex mutex;
    std::set<Transport*> transports ZV_GUARDED_BY(mutex);

    static UnderWay& Get()
    {
        static auto* underWay = new UnderWay;  // outlives threads that still ask at exit
        return *underWay;
    }
};

}  // namespace

void AbortClockQueries()
{
    UnderWay& underWay = UnderWay::Get();
    ZVMutexLock lock(underWay.mutex);
    for (Transport* transport : underWay.transports)
        transport->Abort();
}

ClockQuery::ClockQuery(soap& context, int timeout) : m_Transport(context)
{
    m_Transport.SetTimeouts(timeout, timeout);
    m_Transport.SetProxy(Proxy::Current());
    UnderWay& underWay = UnderWay::Get();
    ZVMutexLock lock(underWay.mutex);
    underWay.transports.insert(&m_Transport);
}

ClockQuery::~ClockQuery()
{
    UnderWay& underWay = UnderWay::Get();
    ZVMutexLock lock(underWay.mutex);
    underWay.transports.erase(&m_Transport);
}
