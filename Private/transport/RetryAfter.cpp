#include "RetryAfter.h"

#include "ZVString.h"

#include <limits.h>
#include <stdlib.h>
#include <string.h>
#include <strings.h>

#include <algorithm>
#include <utility>

namespace {

constexpr int kUnavailable = 503;
const char kHeader[] = "Retry-After";

}  // namespace

void RetryAfter::Begin()
{
    m_Heard = Heard();
    m_Heard.silent = true;
}

void RetryAfter::Answered(int status)
{
    m_Heard.answered = true;
    m_Heard.silent = false;
    m_Heard.unavailable = status == kUnavailable;
}

void RetryAfter::ReadHeader(int status, const char* name, const char* value)
{
    Answered(status);
    if (m_Heard.unavailable && strcasecmp(name, kHeader) == 0) m_Heard.seconds = SecondsOf(value);
}

void RetryAfter::ReadHead(const char* head)
{
    const char* status = strchr(head, ' ');
    Answered(status ? atoi(status) : 0);
    const char* end = strstr(head, "\r\n\r\n");
    const char* header = strcasestr(head, (ZVString("\r\n") + kHeader + ":").c_str());
    if (!m_Heard.unavailable || !header || (end && header > end)) return;
    m_Heard.seconds = SecondsOf(strchr(header, ':') + 1);
}

unsigned int RetryAfter::SecondsOf(const char* text)
{
    text += strspn(text, " \t");
    const size_t digits = strspn(text, "0123456789");
    const size_t length = strcspn(text, "\r\n");
    if (digits == 0 || digits + strspn(text + digits, " \t") != length) return 0;
    return static_cast<unsigned int>(std::min<unsigned long long>(strtoull(text, nullptr, 10), UINT_MAX));
}

RetryAfter::Heard RetryAfter::Take()
{
    return std::exchange(m_Heard, Heard());
}
