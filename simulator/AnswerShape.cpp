#include "AnswerShape.h"

#include <algorithm>
#include <iterator>

#include "Namespaces.h"
#include "Records.h"
#include "Xml.h"
#include "XmlNode.h"

namespace simulator {

namespace {

const char* const kKinds[] = {"prefixes", "nil",  "absent-arrays", "latin1",  "bom", "xsi-types",
                              "cdata",    "text", "boolean",       "counter", "enum"};

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
    explicit ShapeWriter(const Fault& fault) : m_Fault(fault)
    {
        // Prefixes that mean something else wherever people write envelopes by hand.
        if (fault.Is("prefixes")) m_Envelope = "xsd:", m_Service = "SOAP-ENV:";
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
    std::string Given(const char* standard) const { return m_Fault.value.empty() ? standard : m_Fault.value; }
    // What stands between two elements, of a record or elsewhere.
    std::string Gap(bool record) const
    {
        if (m_Fault.Is("text") && record) return "stray text";
        return m_Fault.Is("prefixes") ? "\n\t<!-- <next> -->\r\n" : "";
    }

    const Fault& m_Fault;
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
    const bool leavesOut = m_Fault.Is("absent-arrays") && type[0] != '_';
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
        if (absent && field.occurs == '?' && m_Fault.Is("nil")) {
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
    if (m_Fault.Is("nil") || m_Fault.Is("xsi-types")) declare("xsi", kSchemaInstance);
    if (!m_Fault.Is("xsi-types")) return;
    declare("xsd", kSchema);
    declare("tns", kService);
}

void ShapeWriter::WriteAttributes(const Node& element, const std::string& type)
{
    if (m_Fault.Is("xsi-types") && !type.empty() && type[0] != '_') {
        const bool hasPrefix = type.find(':') != std::string::npos;
        WriteAttribute("xsi:type", type == kFlag ? kBoolean : (hasPrefix ? "" : "tns:") + type);
    }
    const Fields* fields = FindRecord(type);
    for (const auto& [name, value] : element.Attributes()) {
        bool replaced = false;
        for (size_t i = 0; fields && i < fields->size(); ++i)
            replaced = replaced || ((*fields)[i].name == name && IsEnumeration((*fields)[i].type));
        WriteAttribute(name, replaced && m_Fault.Is("enum") ? Given("NEW_TEXT") : value);
    }
}

void ShapeWriter::WriteAttribute(const std::string& name, const std::string& value)
{
    const bool single = m_Fault.Is("prefixes");
    const std::string quote = single ? "'" : "\"";
    const std::string text = single ? WithAll(XmlEscape(value), "'", "&#39;") : XmlEscape(value);
    m_Text += (single ? "\n" : " ") + name + (single ? " = " : "=") + quote + text + quote;
}

std::string ShapeWriter::Leaf(const Node& element, const std::string& type) const
{
    const std::string text = element.Content();
    if (m_Fault.Is("boolean") && (type == kBoolean || type == kFlag)) return Given(text == "true" ? "1" : "0");
    if (m_Fault.Is("enum") && IsEnumeration(type)) return Given("NEW_TEXT");
    if (m_Fault.Is("counter") && element.Name() == "TotalItems") return Given("40000");
    if (m_Fault.Is("cdata")) return "<![CDATA[" + WithAll(text, "]]>", "]]]]><![CDATA[>") + "]]>";
    return XmlEscape(text);
}

}  // namespace

HttpResponse Reshaped(HttpResponse response, const Fault& fault)
{
    if (std::none_of(std::begin(kKinds), std::end(kKinds), [&](const char* kind) { return fault.Is(kind); })) {
        return response;
    }
    const Document document = ReadXml(response.body);
    const bool latin1 = fault.Is("latin1");
    const std::string envelope = ShapeWriter(fault).Write(Node(document));
    response.body = std::string(fault.Is("bom") ? "\xef\xbb\xbf" : "") + "<?xml version=\"1.0\" encoding=\"" +
                    (latin1 ? "ISO-8859-1" : "utf-8") + "\"?>" + (latin1 ? Latin1(envelope) : envelope);
    if (latin1) response.contentType = "text/xml; charset=ISO-8859-1";
    return response;
}

}  // namespace simulator
