// A parsed document, and its elements as the simulator looks at them.
#pragma once

#include <libxml/parser.h>

#include <memory>
#include <string>
#include <utility>
#include <vector>

namespace simulator {

using Document = std::unique_ptr<xmlDoc, void (*)(xmlDocPtr)>;
/// Null when the text is no XML. `encoding`: what the text is in, whatever it says itself; null: what it says.
Document ReadXml(const std::string& text, const char* encoding = nullptr);

/// Whether a processing instruction stands anywhere in it.
bool HasInstruction(const Document& document);

/// An element, or none. Copies are cheap; the document must live.
class Node {
public:
    explicit Node(xmlNodePtr node = nullptr) : m_Node(node) {}
    /// The root.
    explicit Node(const Document& document) : m_Node(document ? xmlDocGetRootElement(document.get()) : nullptr) {}
    explicit operator bool() const { return m_Node != nullptr; }

    std::string Name() const;
    std::string Namespace() const;
    bool Is(const char* space, const char* name) const;

    std::vector<Node> Children() const;
    /// The first one of the name.
    Node Child(const char* space, const char* name) const;
    std::string Content() const;
    /// Without the white space around it, which means nothing in numbers, addresses and times.
    std::string Value() const;
    /// Text of its own beside its elements.
    bool HasText() const;
    /// `space` null: of no namespace. Empty when there is none.
    std::string Attribute(const char* name, const char* space) const;
    bool HasAttribute(const char* name, const char* space) const;
    /// The name of one that is not of the namespace; empty when there is none.
    std::string AttributeOutside(const char* space) const;
    /// The namespace that a prefix stands for here, "" being the default one; empty when it stands for none.
    std::string NamespaceOf(const std::string& prefix) const;
    /// Names and values of those without a namespace.
    std::vector<std::pair<std::string, std::string>> Attributes() const;

private:
    xmlNodePtr m_Node;
};

}  // namespace simulator
