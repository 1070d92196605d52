#include "ZVString.h"

ZVString ZVString::substr(size_t from, size_t count) const
{
    ZVString part;
    if (from < length()) part.m_Text = m_Text.substr(from, count);
    return part;
}

ZVString& ZVString::trim()
{
    static const char kBlank[] = " \t\r\n";
    const size_t first = m_Text.find_first_not_of(kBlank);
    if (first == std::string::npos) {
        m_Text.clear();
    } else {
        m_Text = m_Text.substr(first, m_Text.find_last_not_of(kBlank) - first + 1);
    }
    return *this;
}
