// Calls that do not speak SOAP: the service's clock, the bandwidth test, the device's own address.
#include <stdio.h>
#include <string.h>
#include <strings.h>

#include <algorithm>
#include <memory>

#include "CallGuard.h"
#include "ClockQueries.h"
#include "LocalAddress.h"
#include "RawHttp.h"
#include "Records.h"
#include "ServiceCall.h"
#include "Url.h"
#include "ZVAssert.h"
#include "ZVUtilities.h"

namespace {

constexpr int kClockTimeout = 30;  // seconds
constexpr int kTlsPort = 443;
const char kClockPath[] = "/device/time/";
constexpr unsigned int kMostMeasured = 204800;
// The service's data spells it without the second "d".
const char kBandwidthKey[] = "BandwithCheckURL";
const char kFound[] = "HTTP/1.1 200 OK";

struct SoapDeleter {
    void operator()(soap* context) const
    {
        soap_destroy(context);
        soap_end(context);
        soap_free(context);
    }
};

// "3/7/2011 1:30:00 PM", as UTC. An hour of 12 gets its twelve more like the others.
ZV_WS_Status ParseTime(const ZVString& text, time_t& time)
{
    tm parts = {};
    char suffix[3] = "";
    if (sscanf(text.c_str(), "%d/%d/%d %d:%d:%d %2s", &parts.tm_mon, &parts.tm_mday, &parts.tm_year, &parts.tm_hour,
               &parts.tm_min, &parts.tm_sec, suffix) < 7) {
        return ZV_WS_Status_general_error;
    }
    // Numbers that no date has would overflow below.
    for (const int part : {parts.tm_mon, parts.tm_mday, parts.tm_year, parts.tm_hour, parts.tm_min, parts.tm_sec}) {
        if (part < 0 || part > 9999) return ZV_WS_Status_general_error;
    }
    parts.tm_mon -= 1;
    parts.tm_year -= 1900;
    if (strcmp(suffix, "PM") == 0) parts.tm_hour += 12;
    time = timegm(&parts);
    return ZV_WS_Status_ok;
}

ZV_WS_Status ReadClock(RawHttp& http, const ZVString& host, time_t& time)
{
    if (!http.Connect(ZVString("http://") + host + kClockPath)) return ZV_WS_Status_connection_error;
    const char* body = nullptr;
    size_t received = 0;
    if (!http.SendGet(kClockPath, host, RawHttp::Order::AgentFirst) || !http.ReceiveHead() || !http.StatusIs(kFound)) {
        return ZV_WS_Status_net_error;
    }
    const unsigned int length = http.ContentLength();
    if (length < 1 || !http.BodyStart(body, received)) return ZV_WS_Status_net_error;
    if (length > received) return ZV_WS_Status_general_error;
    return ParseTime(ZVString(body, length), time);
}

// The session's address of the test file, asked from the service on first use.
ZV_WS_Status FindBandwidthURL(ZV_WS_Session* handle, ZVString& url)
{
    Account& customer = *handle->_pSessionImpl->m_Params.Customer;
    url = customer.BandwidthCheckURL();
    if (!url.empty()) return ZV_WS_Status_ok;
    ZV_WS_ConfigResponse config;
    const ZV_WS_Status status = ZV_WS_getConfig(handle, &config);
    const ZV_WS_ConfigurationItem* const begin = config.ConfigurationItem;
    const ZV_WS_ConfigurationItem* const end = begin + config.size;
    const auto* const item = std::find_if(begin, end, [](const ZV_WS_ConfigurationItem& candidate) {
        return candidate.Key && strcasecmp(candidate.Key, kBandwidthKey) == 0;
    });
    if (status == ZV_WS_Status_ok && item != end && item->Value) url = item->Value;
    ZV_WS_release(&config);
    if (status != ZV_WS_Status_ok) return status;
    customer.SetBandwidthCheckURL(url);
    return url.empty() ? ZV_WS_Status_failed_to_get_bandwidth_check_url : ZV_WS_Status_ok;
}

// Reads the rest of a body. False when it ends early.
bool Drain(RawHttp& http, size_t rest)
{
    char piece[RawHttp::kPiece];
    while (rest > 0) {
        const size_t received = http.Receive(piece, std::min(rest, sizeof piece));
        if (received == 0) return false;
        rest -= received;
    }
    return true;
}

ZV_WS_Status Measure(RawHttp& http, unsigned int& bitsPerSecond)
{
    if (!http.StatusIs(kFound)) {
        return http.Holds("HTTP/1.1 404 Not Found") ? ZV_WS_Status_file_not_found_on_server : ZV_WS_Status_net_error;
    }
    const unsigned int length = std::min(http.ContentLength(), kMostMeasured);
    const char* body = nullptr;
    size_t received = 0;
    if (length < 1 || !http.BodyStart(body, received)) return ZV_WS_Status_net_error;
    // What came with the head counts in the length, and not in the time.
    const uint64_t start = ZVUtilities::MillisecondTime();
    if (!Drain(http, length - std::min<size_t>(length, received))) return ZV_WS_Status_net_error;
    const unsigned int elapsed = std::max<unsigned int>(1, ZVUtilities::MillisecondTime() - start);
    bitsPerSecond = length * 8000u / elapsed;
    return ZV_WS_Status_ok;
}

ZV_WS_Status CheckBandwidth(ZV_WS_Session* handle, unsigned int& bitsPerSecond)
{
    ZVString url;
    const ZV_WS_Status found = FindBandwidthURL(handle, url);
    if (found != ZV_WS_Status_ok) return found;
    SessionImpl& session = *handle->_pSessionImpl;
    ZVString host, path;
    SplitUrl(url, host, path);
    if (host.empty() || path.empty() || !IsRequestText(url.c_str())) return ZV_WS_Status_invalid_bandwidth_check_url;
    RawHttp http(session.m_Stream.transport());
    if (!http.Connect(url)) return ZV_WS_Status_connection_error;
    if (!http.SendGet(ZVString("/") + path, host, RawHttp::Order::HostFirst) || !http.ReceiveHead()) {
        return ZV_WS_Status_net_error;
    }
    return Measure(http, bitsPerSecond);
}

// Where the session's requests go, as far as that is known: to a proxy, where there is one.
std::vector<Address> PeersOf(SessionImpl& session, const ZVString& host, int port)
{
    const Proxy& proxy = session.m_Browse.transport().proxy();
    std::vector<Address> peers =
        proxy.IsUsed() ? NameLookup::Known(proxy.host, proxy.port) : NameLookup::Known(host, port);
    const auto addPeerOf = [&](auto where, Transport& transport) {
        if (transport.peer().Family() != AF_UNSPEC) peers.insert(where, transport.peer());
    };
    addPeerOf(peers.begin(), session.m_Browse.transport());
    // These two also ask others than the service.
    addPeerOf(peers.end(), session.m_Stream.transport());
    addPeerOf(peers.end(), session.m_Download.transport());
    return peers;
}

ZV_WS_Status FindLocalAddress(SessionImpl& session, ZVString& address)
{
    ZVString hostPort, path, host;
    SplitUrl(session.m_Browse.Endpoint(), hostPort, path);
    int port = 0;
    if (!SplitHostPort(hostPort, kTlsPort, host, port)) return ZV_WS_Status_general_error;
    address = LocalAddressTowards(PeersOf(session, host, port));
    return address.empty() ? ZV_WS_Status_net_error : ZV_WS_Status_ok;
}

}  // namespace

ZV_WS_Status ZV_WS_getServerTime(time_t* serverTime)
{
    ZV_ASSERT(serverTime != 0);
    *serverTime = -1;
    return LogStatus(__func__, GuardCall([&] {
                         const std::unique_ptr<soap, SoapDeleter> context(soap_new());
                         if (!context) return ZV_WS_Status_general_error;
                         ClockQuery query(*context, kClockTimeout);
                         RawHttp http(query.transport());
                         return ReadClock(http, Deployment::Current().web_host, *serverTime);
                     }));
}

ZV_WS_Status ZV_WS_checkBandwidth(ZV_WS_Session* handle, unsigned int* bitsPerSecond)
{
    ZV_ASSERT(bitsPerSecond != 0);
    *bitsPerSecond = 0;
    return LogStatus(__func__, GuardCall([&] {
                         return SessionOf(handle) ? CheckBandwidth(handle, *bitsPerSecond) : ZV_WS_Status_invalid_param;
                     }));
}

ZV_WS_Status ZV_WS_getLocalIPAddr(ZV_WS_Session* handle, ZV_WS_String* address)
{
    ZV_ASSERT(address != 0);
    return LogStatus(__func__, Records::Fill(*address, [&] {
                         if (!SessionOf(handle)) return ZV_WS_Status_invalid_param;
                         ZVString text;
                         const ZV_WS_Status found = FindLocalAddress(*handle->_pSessionImpl, text);
                         if (found == ZV_WS_Status_ok) ZVUtilities::SetText(*address, text);
                         return found;
                     }));
}
