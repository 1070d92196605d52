// Writes XML: elements of the service's namespace, which is the default one of every answer's body.
#pragma once

#include <string>

namespace simulator {

std::string XmlEscape(const std::string& text);

class XmlWriter {
public:
    const std::string& Xml() const { return m_Text; }
    /// The writer is empty after that.
    std::string Take() { return std::move(m_Text); }

    XmlWriter& Element(const char* name, const std::string& text);
    XmlWriter& Element(const char* name, const char* text) { return Element(name, std::string(text)); }
    XmlWriter& Element(const char* name, int number) { return Element(name, std::to_string(number)); }
    XmlWriter& Flag(const char* name, bool value) { return Element(name, value ? "true" : "false"); }
    /// Left out when the text is empty, as the service does with what it does not know.
    XmlWriter& Optional(const char* name, const std::string& text)
    {
        return text.empty() ? *this : Element(name, text);
    }
    template <class Content>
    XmlWriter& Group(const char* name, const Content& content)
    {
        Tag("<", name);
        content();
        return Tag("</", name);
    }
    /// An element without content; `attributes` as they stand in the tag.
    XmlWriter& Empty(const char* name, const std::string& attributes);
    XmlWriter& Raw(const std::string& xml);

private:
    XmlWriter& Tag(const char* open, const char* name);

    std::string m_Text;
};

}  // namespace simulator
