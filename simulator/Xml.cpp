#include "Xml.h"

#include <algorithm>

namespace simulator {

namespace {

void AppendEscaped(std::string& xml, const std::string& text)
{
    for (size_t at = 0; at < text.size();) {
        const size_t end = std::min(text.find_first_of("&<>\"", at), text.size());
        xml.append(text, at, end - at);
        at = end + 1;
        if (end == text.size()) return;
        switch (text[end]) {
            case '&':
                xml += "&amp;";
                break;
            case '<':
                xml += "&lt;";
                break;
            case '>':
                xml += "&gt;";
                break;
            default:
                xml += "&quot;";
        }
    }
}

}  // namespace

std::string XmlEscape(const std::string& text)
{
    std::string escaped;
    AppendEscaped(escaped, text);
    return escaped;
}

XmlWriter& XmlWriter::Tag(const char* open, const char* name)
{
    m_Text.append(open).append(name).append(">");
    return *this;
}

XmlWriter& XmlWriter::Element(const char* name, const std::string& text)
{
    Tag("<", name);
    AppendEscaped(m_Text, text);
    return Tag("</", name);
}

XmlWriter& XmlWriter::Empty(const char* name, const std::string& attributes)
{
    m_Text += std::string("<") + name + " " + attributes + "/>";
    return *this;
}

XmlWriter& XmlWriter::Raw(const std::string& xml)
{
    m_Text += xml;
    return *this;
}

}  // namespace simulator
