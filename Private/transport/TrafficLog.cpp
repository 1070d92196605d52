#include "TrafficLog.h"

#include <ctype.h>
#include <string.h>
#include <strings.h>

#include <algorithm>
#include <iterator>
#include <mutex>

#include "ZV_Log.h"

namespace {

constexpr size_t kLongestName = 256;
constexpr int kSeverity = 4;

// Local names of elements and attributes, and names of header lines, whose values never reach a log; in lower case and
// without the marks between words.
const char* const kSecrets[] = {
    "authorization", "proxyauthorization", "cookie",     "cookie2",  "setcookie", "setcookie2",         "apikey",
    "xapikey",       "authtoken",          "xauthtoken", "password", "pin",       "giftcertificatecode"};

constexpr char kBlanks[] = " \t\r\n";
constexpr char kOpening[] = "&lt;";
constexpr char kClosing[] = "&gt;";

bool NamesSecret(const ZVString& name)
{
    const char* const colon = strrchr(name.c_str(), ':');
    ZVString plain;
    for (const char* c = colon ? colon + 1 : name.c_str(); *c; ++c) {
        const char lower = static_cast<char>(tolower(static_cast<unsigned char>(*c)));
        if (!strchr("-_ \t", lower)) plain.append(&lower, 1);
    }
    return std::any_of(std::begin(kSecrets), std::end(kSecrets), [&](const char* secret) { return plain == secret; });
}

// What stands between a tag's brackets; `c` has just ended it.
ZVString TagIn(const ZVString& name, char c)
{
    const size_t reference = c == '>' ? 0 : std::min(name.length(), strlen(kClosing) - 1);
    ZVString tag = name.substr(0, name.length() - reference);
    tag.trim();
    return tag;
}

ZVString ElementIn(const ZVString& tag)
{
    return tag.substr(0, strcspn(tag.c_str(), " \t\r\n/"));
}

// The attribute whose value begins behind the tag's last "=".
ZVString AttributeIn(const ZVString& tag)
{
    ZVString name = tag.substr(0, tag.length() - 1);
    name.trim();
    size_t begin = name.length();
    while (begin > 0 && !strchr(kBlanks, name[begin - 1]))
        --begin;
    return name.substr(begin);
}

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

// ---- The head

void SecretFilter::EndHeadLine()
{
    const char* line = m_Name.c_str();
    const bool isLast = m_Name.empty() || strcmp(line, "\r") == 0;
    if (strncmp(line, "HTTP/1.", 7) == 0) m_IsInterim = m_Name.length() > 9 && line[9] == '1';
    m_IsCompressed = m_IsCompressed || strncasecmp(line, "Content-Encoding:", 17) == 0;
    m_IsChunked = m_IsChunked || strncasecmp(line, "Transfer-Encoding:", 18) == 0;
    const bool isOver = isLast && !m_IsInterim;
    m_State = !isOver ? State::HeadLine : m_IsCompressed || m_IsChunked ? State::Hidden : State::Text;
    m_Name = ZVString();
}

void SecretFilter::StepHead(char c, ZVString& out)
{
    const auto hide = [&] {
        m_State = State::HeadSecret;
        out += " ***\r";
    };
    if (m_Name.empty()) {
        m_LineIsSecret = m_LineIsSecret && (c == ' ' || c == '\t');
        if (m_LineIsSecret) hide();
    }
    if (m_State == State::HeadLine || c == '\n') out.append(&c, 1);
    if (c == '\n') return EndHeadLine();
    if (m_State == State::HeadLine && c == ':' && NamesSecret(m_Name)) {
        m_LineIsSecret = true;
        hide();
    }
    if (m_Name.length() < kLongestName) m_Name.append(&c, 1);
}

// ---- The body, whose brackets may be written as references

bool SecretFilter::OpensTag(char c) const
{
    return c == '<' || memcmp(m_Last, kOpening, sizeof m_Last) == 0;
}

bool SecretFilter::ClosesTag(char c) const
{
    return c == '>' || memcmp(m_Last, kClosing, sizeof m_Last) == 0;
}

void SecretFilter::BeginTag()
{
    m_State = State::Tag;
    m_Name = ZVString();
}

void SecretFilter::EndTag(char c, ZVString& out)
{
    const ZVString tag = TagIn(m_Name, c);
    const bool isEmpty = !tag.empty() && tag[tag.length() - 1] == '/';
    m_Element = ElementIn(tag);
    m_State = NamesSecret(m_Element) && !isEmpty ? State::Secret : State::Text;
    if (m_State == State::Secret) out += "***";
}

// Where no tag should begin, in a value or in a comment, one begins all the same.
void SecretFilter::StepTag(char c, ZVString& out)
{
    out.append(&c, 1);
    if (OpensTag(c)) return BeginTag();
    if (ClosesTag(c)) return EndTag(c, out);
    if (c == '"' || c == '\'') return BeginValue(c, out);
    if (m_Name.length() < kLongestName) m_Name.append(&c, 1);
}

void SecretFilter::BeginValue(char quote, ZVString& out)
{
    m_Name.trim();
    if (m_Name.empty() || m_Name[m_Name.length() - 1] != '=') return;
    m_State = State::Value;
    m_Quote = quote;
    m_ValueIsSecret = NamesSecret(AttributeIn(m_Name));
    if (m_ValueIsSecret) out += "***";
}

void SecretFilter::StepValue(char c, ZVString& out)
{
    const bool isOver = c == m_Quote;
    if (isOver || !m_ValueIsSecret) out.append(&c, 1);
    if (isOver) {
        m_State = State::Tag;
        m_Name = ElementIn(m_Name) + " ";
    } else if (!m_ValueIsSecret && OpensTag(c)) {
        BeginTag();
    }
}

// Only the element's own closing tag ends a secret: it may stand in a section or hold elements.
void SecretFilter::StepSecret(char c, ZVString& out)
{
    if (OpensTag(c)) {
        m_State = State::SecretTag;
        m_Name = ZVString();
    } else if (m_State == State::SecretTag && ClosesTag(c)) {
        const ZVString tag = TagIn(m_Name, c);
        m_State = tag == ZVString("/") + m_Element ? State::Text : State::Secret;
        if (m_State == State::Text) out += (c == '>' ? "<" : kOpening) + tag + (c == '>' ? ">" : kClosing);
    } else if (m_State == State::SecretTag && m_Name.length() < kLongestName) {
        m_Name.append(&c, 1);
    }
}

void SecretFilter::Step(char c, ZVString& out)
{
    memmove(m_Last, m_Last + 1, sizeof m_Last - 1);
    m_Last[sizeof m_Last - 1] = c;
    switch (m_State) {
        case State::HeadLine:
        case State::HeadSecret:
            return StepHead(c, out);
        case State::Text:
            out.append(&c, 1);
            if (OpensTag(c)) BeginTag();
            return;
        case State::Tag:
            return StepTag(c, out);
        case State::Value:
            return StepValue(c, out);
        case State::Secret:
        case State::SecretTag:
            return StepSecret(c, out);
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
