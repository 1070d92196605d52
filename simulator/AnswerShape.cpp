#include "AnswerShape.h"

#include "Namespaces.h"
#include "Records.h"
#include "Xml.h"
#include "XmlNode.h"

namespace simulator {

namespace {

const char kBoolean[] = "xsd:boolean";
const char kFlag[] = "xsd:anyType";  // the contract's only element of any type holds a yes or a no

// Every character of ISO-8859-1 as its byte, the others as references.
std::string Latin1(const std::string& utf8)
{
    std::string bytes;
    for (size_t i = 0; i < utf8.size();) {
        const auto lead = static_cast<unsigned char>(utf8[i]);
        const size_t more = lead < 0x80 ? 0 : lead < 0xe0 ? 1 : lead < 0xf0 ? 2 : 3;
        unsigned code = more == 0 ? lead : lead & (0x3fu >> more);
        for (size_t next = i + 1; next <= i + more; ++next)
            code = code << 6 | (static_cast<unsigned char>(utf8[next]) & 0x3fu);
        if (code < 0x100) {
            bytes += static_cast<char>(code);
        } else {
            bytes += "&#" + std::to_string(code) + ";";
        }
        i += more + 1;
    }
    return bytes;
}

std::string WithAll(std::string text, const std::string& from, const std::string& to)
{
    for (size_t at = text.find(from); at != std::string::npos; at = text.find(from, at + to.size()))
        text.replace(at, from.size(), to);
    return text;
}

// Writes a document anew, in one form.
class ShapeWriter {
public:
    /// `value`: the fault's.
    ShapeWriter(Shape shape, const std::string& value) : m_Shape(shape), m_Value(value)
    {
        // Prefixes that mean something else wherever people write envelopes by hand.
        if (shape == Shape::Prefixes) m_Envelope = "xsd:", m_Service = "SOAP-ENV:";
    }

    std::string Write(const Node& envelope)
    {
        WriteElement(envelope, "");
        return m_Text;
    }

private:
    void WriteElement(const Node& element, const std::string& type);
    void WriteRecord(const Node& record, const std::string& type);
    void WriteAttributes(const Node& element, const std::string& type);
    void WriteNamespaces();
    void WriteAttribute(const std::string& name, const std::string& value);
    std::string Leaf(const Node& element, const std::string& type) const;
    std::string Given(const char* standard) const { return m_Value.empty() ? standard : m_Value; }
    // What stands between two elements, of a record or elsewhere.
    std::string Gap(bool record) const
    {
        if (m_Shape == Shape::Text && record) return "stray text";
        return m_Shape == Shape::Prefixes ? "\n\t<!-- <next> -->\r\n" : "";
    }

    const Shape m_Shape;
    const std::string m_Value;
    std::string m_Envelope = "soap:";
    std::string m_Service;
    std::string m_Text;
};

void ShapeWriter::WriteElement(const Node& element, const std::string& type)
{
    const std::string name = (element.Namespace() == kSoap11 ? m_Envelope : m_Service) + element.Name();
    const Fields* fields = FindRecord(type);
    const std::vector<Node> children = element.Children();
    m_Text += "<" + name;
    if (element.Is(kSoap11, "Envelope")) WriteNamespaces();
    WriteAttributes(element, type);
    m_Text += ">";
    if (fields) {
        WriteRecord(element, type);
    } else if (children.empty()) {
        m_Text += Leaf(element, type);
    }
    for (size_t i = 0; !fields && i < children.size(); ++i) {
        m_Text += Gap(false);
        WriteElement(children[i], element.Is(kSoap11, "Body") ? "_" + children[i].Name() : "");
        m_Text += Gap(false);
    }
    m_Text += "</" + name + ">";
}

void ShapeWriter::WriteRecord(const Node& record, const std::string& type)
{
    const std::vector<Node> children = record.Children();
    // An answer without its result is no right one.
    const bool leavesOut = m_Shape == Shape::AbsentArrays && type[0] != '_';
    auto next = children.begin();
    for (const Field& field : *FindRecord(type)) {
        if (field.occurs == '@') continue;
        bool absent = true;
        for (; next != children.end() && next->Name() == field.name; ++next) {
            absent = false;
            if (leavesOut && IsArray(field.type) && next->Children().empty()) continue;
            m_Text += Gap(true);
            WriteElement(*next, field.type);
        }
        if (absent && field.occurs == '?' && m_Shape == Shape::Nil) {
            m_Text += "<" + m_Service + field.name + " xsi:nil=\"true\"/>";
        }
    }
    if (!children.empty()) m_Text += Gap(true);
}

void ShapeWriter::WriteNamespaces()
{
    const auto declare = [&](const std::string& prefix, const char* space) {
        WriteAttribute(prefix.empty() ? "xmlns" : "xmlns:" + prefix.substr(0, prefix.find(':')), space);
    };
    declare(m_Envelope, kSoap11);
    declare(m_Service, kService);
    if (m_Shape == Shape::Nil || m_Shape == Shape::XsiTypes) declare("xsi", kSchemaInstance);
    if (m_Shape != Shape::XsiTypes) return;
    declare("xsd", kSchema);
    declare("tns", kService);
}

void ShapeWriter::WriteAttributes(const Node& element, const std::string& type)
{
    if (m_Shape == Shape::XsiTypes && !type.empty() && type[0] != '_') {
        const bool hasPrefix = type.find(':') != std::string::npos;
        WriteAttribute("xsi:type", type == kFlag ? kBoolean : (hasPrefix ? "" : "tns:") + type);
    }
    const Fields* fields = FindRecord(type);
    for (const auto& [name, value] : element.Attributes()) {
        bool replaced = false;
        for (size_t i = 0; fields && i < fields->size(); ++i)
            replaced = replaced || ((*fields)[i].name == name && IsEnumeration((*fields)[i].type));
        WriteAttribute(name, replaced && m_Shape == Shape::Enum ? Given("NEW_TEXT") : value);
    }
}

void ShapeWriter::WriteAttribute(const std::string& name, const std::string& value)
{
    const bool single = m_Shape == Shape::Prefixes;
    const std::string quote = single ? "'" : "\"";
    const std::string text = single ? WithAll(XmlEscape(value), "'", "&#39;") : XmlEscape(value);
    m_Text += (single ? "\n" : " ") + name + (single ? " = " : "=") + quote + text + quote;
}

std::string ShapeWriter::Leaf(const Node& element, const std::string& type) const
{
    const std::string text = element.Content();
    switch (m_Shape) {
        case Shape::Boolean:
            if (type == kBoolean || type == kFlag) return Given(text == "true" ? "1" : "0");
            break;
        case Shape::Enum:
            if (IsEnumeration(type)) return Given("NEW_TEXT");
            break;
        case Shape::Counter:
            if (element.Name() == "TotalItems") return Given("40000");
            break;
        case Shape::Cdata:
            return "<![CDATA[" + WithAll(text, "]]>", "]]]]><![CDATA[>") + "]]>";
        // What stands around it is another's, or all of the document.
        case Shape::Prefixes:
        case Shape::Nil:
        case Shape::AbsentArrays:
        case Shape::Latin1:
        case Shape::Bom:
        case Shape::XsiTypes:
        case Shape::Text:
            break;
    }
    return XmlEscape(text);
}

}  // namespace

HttpResponse Reshaped(HttpResponse response, const Fault& fault)
{
    const Shape* shape = fault.As<Shape>();
    if (!shape) return response;
    const Document document = ReadXml(response.body);
    const bool latin1 = *shape == Shape::Latin1;
    const std::string envelope = ShapeWriter(*shape, fault.value).Write(Node(document));
    response.body = std::string(*shape == Shape::Bom ? "\xef\xbb\xbf" : "") + "<?xml version=\"1.0\" encoding=\"" +
                    (latin1 ? "ISO-8859-1" : "utf-8") + "\"?>" + (latin1 ? Latin1(envelope) : envelope);
    if (latin1) response.contentType = "text/xml; charset=ISO-8859-1";
    return response;
}

}  // namespace simulator
