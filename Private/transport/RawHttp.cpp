#include "RawHttp.h"

#include <stdlib.h>
#include <string.h>

#include <algorithm>

#include "Url.h"

namespace {

const char kLineEnd[] = "\r\n";
const char kHeadEnd[] = "\r\n\r\n";

}  // namespace

RawHttp::RawHttp(Transport& transport) : m_Transport(transport)
{
    m_Head[0] = '\0';
    m_Transport.Close();
}

bool RawHttp::Connect(const ZVString& url)
{
    ZVString hostPort, path, host;
    int port = 0;
    SplitUrl(url, hostPort, path);
    m_IsTls = Transport::IsTls(url.c_str());
    const int standardPort = m_IsTls ? 443 : 80;
    if (!SplitHostPort(hostPort, standardPort, host, port) || !m_Transport.UseHost(url.c_str())) return false;
    soap& context = m_Transport.context();
    context.error = SOAP_OK;
    m_Transport.BeginExchange();
    context.socket = context.fopen(&context, url.c_str(), host.c_str(), port);
    return context.error == SOAP_OK && soap_valid_socket(context.socket);
}

bool RawHttp::SendGet(const ZVString& path, const ZVString& host, Order order, const ZVString& condition)
{
    if (!IsRequestText(path.c_str()) || !IsRequestText(host.c_str()) || !IsHeaderText(condition.c_str())) return false;
    const Proxy& proxy = m_Transport.proxy();
    // Inside a tunnel the proxy is not there.
    const bool asksProxy = proxy.IsUsed() && !m_IsTls;
    const ZVString agentLine = "User-Agent: ZVWSLib\r\n";
    const ZVString hostLine = ZVString("Host: ") + host + kLineEnd;
    const bool agentFirst = order == Order::AgentFirst;
    ZVString text = ZVString("GET ") + (asksProxy ? ZVString("http://") + host : ZVString()) + path + " HTTP/1.1\r\n";
    if (!condition.empty()) text += ZVString("If-Modified-Since: ") + condition + kLineEnd;
    text += (agentFirst ? agentLine : hostLine) + (agentFirst ? hostLine : agentLine);
    if (asksProxy) text += proxy.AuthorizationLine();
    text += kLineEnd;
    soap& context = m_Transport.context();
    return context.fsend(&context, text.c_str(), text.length()) == SOAP_OK;
}

size_t RawHttp::Receive(char* buffer, size_t size)
{
    soap& context = m_Transport.context();
    return context.frecv(&context, buffer, size);
}

bool RawHttp::ReceiveHead()
{
    m_HeadLength = Receive(m_Head, sizeof m_Head - 1);
    m_Head[m_HeadLength] = '\0';
    if (m_HeadLength != 0) m_Transport.retryAfter().ReadHead(m_Head);
    SecretFilter filter;
    TrafficLog::Received(filter, m_Head, m_HeadLength);
    return m_HeadLength != 0;
}

bool RawHttp::Holds(const char* text) const
{
    return strstr(m_Head, text) != nullptr;
}

bool RawHttp::StatusIs(const char* line) const
{
    const char* found = strstr(m_Head, line);
    return found && strncmp(found + strlen(line), kLineEnd, 2) == 0;
}

bool RawHttp::Header(const char* name, ZVString& value) const
{
    const ZVString start = ZVString(kLineEnd) + name + ": ";
    const char* found = strstr(m_Head, start.c_str());
    if (!found) return false;
    found += start.length();
    const char* end = strstr(found, kLineEnd);
    if (!end) return false;
    value.assign(found, end - found);
    return true;
}

unsigned int RawHttp::ContentLength() const
{
    ZVString text;
    if (!Header("Content-Length", text)) return 0;
    const long long length = strtoll(text.c_str(), nullptr, 10);
    return static_cast<unsigned int>(std::clamp(length, 0ll, 0x7fffffffll));
}

bool RawHttp::BodyStart(const char*& bytes, size_t& length) const
{
    const char* end = strstr(m_Head, kHeadEnd);
    if (!end) return false;
    bytes = end + strlen(kHeadEnd);
    length = m_Head + m_HeadLength - bytes;
    return true;
}
