#include "XmlNode.h"

#include <cstring>

#include "Http.h"

namespace simulator {

namespace {

const char* Chars(const xmlChar* text)
{
    return reinterpret_cast<const char*>(text);
}

// Takes what the parser has allocated.
std::string Taken(xmlChar* text)
{
    const std::unique_ptr<xmlChar, void (*)(void*)> owned(text, xmlFree);
    return owned ? Chars(owned.get()) : "";
}

bool HasInstruction(xmlNodePtr first)
{
    for (xmlNodePtr node = first; node; node = node->next) {
        if (node->type == XML_PI_NODE || (node->type == XML_ELEMENT_NODE && HasInstruction(node->children)))
            return true;
    }
    return false;
}

}  // namespace

Document ReadXml(const std::string& text, const char* encoding)
{
    return {xmlReadMemory(text.data(), static_cast<int>(text.size()), nullptr, encoding,
                          XML_PARSE_NONET | XML_PARSE_NOERROR | XML_PARSE_NOWARNING),
            xmlFreeDoc};
}

bool HasInstruction(const Document& document)
{
    return document && HasInstruction(document->children);
}

std::string Node::Name() const
{
    return m_Node ? Chars(m_Node->name) : "";
}

std::string Node::Namespace() const
{
    return m_Node && m_Node->ns ? Chars(m_Node->ns->href) : "";
}

bool Node::Is(const char* space, const char* name) const
{
    return m_Node && m_Node->ns && strcmp(Chars(m_Node->name), name) == 0 &&
           strcmp(Chars(m_Node->ns->href), space) == 0;
}

std::vector<Node> Node::Children() const
{
    std::vector<Node> children;
    for (xmlNodePtr child = m_Node ? m_Node->children : nullptr; child; child = child->next) {
        if (child->type == XML_ELEMENT_NODE) children.emplace_back(child);
    }
    return children;
}

Node Node::Child(const char* space, const char* name) const
{
    for (const Node& child : Children()) {
        if (child.Is(space, name)) return child;
    }
    return Node();
}

std::string Node::Content() const
{
    return m_Node ? Taken(xmlNodeGetContent(m_Node)) : "";
}

std::string Node::Value() const
{
    return Trimmed(Content());
}

bool Node::HasText() const
{
    for (xmlNodePtr child = m_Node ? m_Node->children : nullptr; child; child = child->next) {
        if (child->type != XML_ELEMENT_NODE && child->type != XML_COMMENT_NODE && !xmlIsBlankNode(child)) return true;
    }
    return false;
}

std::string Node::Attribute(const char* name, const char* space) const
{
    const auto* n = reinterpret_cast<const xmlChar*>(name);
    return Taken(space ? xmlGetNsProp(m_Node, n, reinterpret_cast<const xmlChar*>(space)) : xmlGetNoNsProp(m_Node, n));
}

bool Node::HasAttribute(const char* name, const char* space) const
{
    return m_Node &&
           xmlHasNsProp(m_Node, reinterpret_cast<const xmlChar*>(name), reinterpret_cast<const xmlChar*>(space));
}

std::string Node::AttributeOutside(const char* space) const
{
    for (const xmlAttr* one = m_Node ? m_Node->properties : nullptr; one; one = one->next) {
        if (!one->ns || strcmp(Chars(one->ns->href), space) != 0) return Chars(one->name);
    }
    return "";
}

std::string Node::NamespaceOf(const std::string& prefix) const
{
    const auto* name = prefix.empty() ? nullptr : reinterpret_cast<const xmlChar*>(prefix.c_str());
    const xmlNs* space = m_Node ? xmlSearchNs(m_Node->doc, m_Node, name) : nullptr;
    return space && space->href ? Chars(space->href) : "";
}

std::vector<std::pair<std::string, std::string>> Node::Attributes() const
{
    std::vector<std::pair<std::string, std::string>> attributes;
    for (const xmlAttr* one = m_Node ? m_Node->properties : nullptr; one; one = one->next) {
        if (!one->ns) attributes.emplace_back(Chars(one->name), Attribute(Chars(one->name), nullptr));
    }
    return attributes;
}

}  // namespace simulator
