#include "Xml.h"

namespace simulator {

std::string XmlEscape(const std::string& text)
{
    std::string escaped;
    for (const char c : text) {
        switch (c) {
            case '&':
                escaped += "&amp;";
                break;
            case '<':
                escaped += "&lt;";
                break;
            case '>':
                escaped += "&gt;";
                break;
            case '"':
                escaped += "&quot;";
                break;
            default:
                escaped += c;
        }
    }
    return escaped;
}

XmlWriter& XmlWriter::Element(const char* name, const std::string& text)
{
    return Group(name, [&] { m_Text += XmlEscape(text); });
}

XmlWriter& XmlWriter::Group(const char* name, const std::function<void()>& content)
{
    m_Text += std::string("<") + name + ">";
    content();
    m_Text += std::string("</") + name + ">";
    return *this;
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
