#include "TrafficLog.h"

#include <string.h>

#include <mutex>

#include "ZV_Log.h"

namespace {

constexpr size_t kLongestTag = 256;
constexpr int kSeverity = 4;

// Local names of the elements whose text never reaches a log.
const char* const kSecretElements[] = {"AuthToken", "Password", "password", "PIN", "Pin", "GiftCertificateCode"};

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
    const char* name = m_Tag.c_str();
    const size_t length = strcspn(name, " \t\r\n/>");
    const char* colon = static_cast<const char*>(memchr(name, ':', length));
    const char* local = colon ? colon + 1 : name;
    const ZVString text(local, name + length - local);
    for (const char* secret : kSecretElements) {
        if (text == secret) return true;
    }
    return false;
}

void SecretFilter::Step(char c, ZVString& out)
{
    if (c == '<') {
        m_State = State::Tag;
        m_Tag = "";
    } else if (m_State == State::Secret) {
        return;
    } else if (m_State == State::Tag && c == '>') {
        const bool closedAtOnce = m_Tag.length() > 0 && m_Tag[m_Tag.length() - 1] == '/';
        m_State = TagNamesSecret() && !closedAtOnce ? State::Secret : State::Text;
        out += ">";
        if (m_State == State::Secret) out += "***";
        return;
    } else if (m_State == State::Tag && m_Tag.length() < kLongestTag) {
        m_Tag.append(&c, 1);
    }
    out.append(&c, 1);
}

ZVString SecretFilter::Filter(const char* data, size_t length)
{
    ZVString out;
    for (size_t i = 0; i < length; ++i)
        Step(data[i], out);
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
