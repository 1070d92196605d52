#include "TrafficLog.h"

#include <string.h>
#include <strings.h>

#include <algorithm>
#include <iterator>
#include <mutex>

#include "ZV_Log.h"

namespace {

constexpr size_t kLongestName = 256;
constexpr int kSeverity = 4;

// Local names of the elements whose text never reaches a log.
const char* const kSecretElements[] = {"AuthToken", "Password", "password", "PIN", "Pin", "GiftCertificateCode"};

// Header lines whose values never reach one.
const char* const kSecretHeaders[] = {"Authorization", "Proxy-Authorization", "Cookie", "Set-Cookie"};

struct Area {
    const char* name;
    int id = -1;
};

Area s_Received = {ZVWS_SoapRecvLOG_AREA_NAME};
Area s_Sent = {ZVWS_SoapSentLOG_AREA_NAME};
Area s_Test = {ZVWS_SoapTestLOG_AREA_NAME};

void Write(const Area& area, SecretFilter& filter, const char* data, size_t length)
{
    if (length == 0 || !ZV_LogWouldOutput(area.id, kSeverity)) return;
    const ZVString text = filter.Filter(data, length);
    ZV_LogOutputwithLen(area.id, kSeverity, text.c_str(), static_cast<unsigned int>(text.length()));
}

}  // namespace

void soap_init_zv_log()
{
    static std::once_flag once;
    std::call_once(once, [] {
        for (Area* area : {&s_Received, &s_Sent, &s_Test})
            ZV_LogRegisterArea(area->name, &area->id);
    });
}

bool SecretFilter::TagNamesSecret() const
{
    const char* name = m_Name.c_str();
    const size_t length = strcspn(name, " \t\r\n/>");
    const char* colon = static_cast<const char*>(memchr(name, ':', length));
    const char* local = colon ? colon + 1 : name;
    const ZVString text(local, name + length - local);
    return std::any_of(std::begin(kSecretElements), std::end(kSecretElements),
                       [&](const char* secret) { return text == secret; });
}

void SecretFilter::EndHeadLine()
{
    m_Name.trim();
    const char* line = m_Name.c_str();
    m_IsCompressed = m_IsCompressed || strncasecmp(line, "Content-Encoding:", 17) == 0;
    m_IsChunked = m_IsChunked || strncasecmp(line, "Transfer-Encoding:", 18) == 0;
    m_State = !m_Name.empty() ? State::HeadLine : m_IsCompressed || m_IsChunked ? State::Hidden : State::Text;
    m_Name = ZVString();
}

void SecretFilter::StepHead(char c, ZVString& out)
{
    if (m_State == State::HeadLine || c == '\n') out.append(&c, 1);
    if (c == '\n') return EndHeadLine();
    if (m_State == State::HeadSecret) return;
    if (c == ':' && std::any_of(std::begin(kSecretHeaders), std::end(kSecretHeaders),
                                [&](const char* name) { return strcasecmp(name, m_Name.c_str()) == 0; })) {
        m_State = State::HeadSecret;
        out += " ***\r";
    }
    if (m_Name.length() < kLongestName) m_Name.append(&c, 1);
}

void SecretFilter::StepTag(char c, ZVString& out)
{
    out.append(&c, 1);
    if (c != '>') {
        if (m_Name.length() < kLongestName) m_Name.append(&c, 1);
        return;
    }
    const bool closedAtOnce = !m_Name.empty() && m_Name[m_Name.length() - 1] == '/';
    m_State = TagNamesSecret() && !closedAtOnce ? State::Secret : State::Text;
    if (m_State == State::Secret) out += "***";
}

void SecretFilter::Step(char c, ZVString& out)
{
    switch (m_State) {
        case State::HeadLine:
        case State::HeadSecret:
            return StepHead(c, out);
        case State::Text:
            out.append(&c, 1);
            if (c == '<') {
                m_State = State::Tag;
                m_Name = ZVString();
            }
            return;
        case State::Tag:
            return StepTag(c, out);
        case State::Secret:
            if (c == '<') m_State = State::SecretTag;
            return;
        case State::SecretTag:
            // Only a closing tag ends a secret: it may stand in a section or hold elements.
            m_State = c == '/' ? State::Tag : State::Secret;
            if (m_State == State::Tag) {
                out += "</";
                m_Name = "/";
            }
            return;
        case State::Hidden:
            return;
    }
}

ZVString SecretFilter::Filter(const char* data, size_t length)
{
    ZVString out;
    for (size_t i = 0; i < length; ++i)
        Step(data[i], out);
    if (m_State == State::Hidden && !m_IsChunked) m_State = State::Text;
    return out;
}

void TrafficLog::Sent(SecretFilter& filter, const char* data, size_t length)
{
    Write(s_Sent, filter, data, length);
}

void TrafficLog::Received(SecretFilter& filter, const char* data, size_t length)
{
    Write(s_Received, filter, data, length);
}
