#include "CfgXMLDocument.h"

#include <libxml/parser.h>
#include <libxml/parserInternals.h>
#include <string.h>

#include <algorithm>
#include <memory>
#include <new>

#include "CallGuard.h"
#include "Serializer.h"
#include "soapStub.h"

namespace {

constexpr char kNamespace[] = "http://api.zorvane.example/api/";
constexpr char kPrefix[] = "ZV1";
constexpr char kRoot[] = "ZVWSLib";

bool Same(const xmlChar* a, const char* b)
{
    return a && xmlStrEqual(a, reinterpret_cast<const xmlChar*>(b));
}

const char* Chars(const xmlChar* text)
{
    return reinterpret_cast<const char*>(text);
}

// Line ends and tabs as references: a reader would make other characters of them.
ZVString Escaped(const ZVString& text)
{
    ZVString escaped;
    for (size_t i = 0; i < text.length(); ++i) {
        const char c = text[i];
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
            case '\t':
                escaped += "&#9;";
                break;
            case '\n':
                escaped += "&#10;";
                break;
            case '\r':
                escaped += "&#13;";
                break;
            default:
                escaped.append(&c, 1);
        }
    }
    return escaped;
}

ZVString EmptyDocument()
{
    ZVString text;
    Serializer(false, false).Write(ZV1__ArrayOfConfigurationItemOfString(), text);
    return text;
}

}  // namespace

// The parser's callbacks. A member that throws would throw through the parser, which is C.
struct CfgXMLReader {
    CfgXMLDocument& document;
    xmlParserCtxt* parser;
    int depth = 0;
    bool inSetting = false;  // an element with a key is open
    bool inValue = false;    // its first value is
    bool hasValue = false;
    bool refused = false;
    bool exhausted = false;  // memory was short, which the parser does not take for an error in the text

    template <class Function>
    void Guard(Function&& function)
    {
        if (WithinMemory(function)) return;
        exhausted = true;
        Refuse();
    }

    void Refuse()
    {
        refused = true;
        xmlStopParser(parser);
    }

    size_t Offset() const { return static_cast<size_t>(xmlByteConsumed(parser)); }

    // The parser stands before the ">" of a start tag, in which there is no other "<".
    size_t TagBegin() const
    {
        const char* text = document.m_Text.c_str();
        size_t begin = Offset();
        while (begin > 0 && text[begin] != '<')
            --begin;
        return begin;
    }

    void StartRoot(const xmlChar* name, const xmlChar* prefix, int count, const xmlChar** namespaces)
    {
        // Offsets are the text's own only while the parser converts nothing.
        if (!Same(name, kRoot) || parser->input->buf->encoder) return Refuse();
        document.m_RootName = prefix ? ZVString(Chars(prefix)) + ":" + kRoot : ZVString(kRoot);
        for (int i = 0; i < count; ++i) {
            if (Same(namespaces[2 * i], kPrefix)) document.m_PrefixDeclared = Same(namespaces[2 * i + 1], kNamespace);
        }
    }

    // Attributes are five pointers each: name, prefix, namespace, begin and end of the value.
    void StartSetting(int count, const xmlChar** attributes)
    {
        hasValue = false;
        for (int i = 0; i < count && !inSetting; ++i) {
            const xmlChar** attribute = attributes + 5 * i;
            if (!Same(attribute[0], "Key") || attribute[1]) continue;
            const ZVString key(Chars(attribute[3]), static_cast<size_t>(attribute[4] - attribute[3]));
            document.m_Elements.push_back({key, ZVString(), TagBegin(), 0});
            inSetting = true;
        }
    }

    void Start(const xmlChar* name, const xmlChar* prefix, const xmlChar* uri, int nsCount, const xmlChar** namespaces,
               int count, const xmlChar** attributes)
    {
        const bool ours = !uri || Same(uri, kNamespace);
        ++depth;
        if (depth == 1) StartRoot(name, prefix, nsCount, namespaces);
        if (depth == 2 && ours && Same(name, "Configuration")) StartSetting(count, attributes);
        if (depth == 3 && inSetting && !hasValue && ours && Same(name, "Value")) inValue = hasValue = true;
    }

    void End()
    {
        if (depth == 1) document.m_RootEnd = Offset();
        if (depth == 2 && inSetting) document.m_Elements.back().end = Offset();
        if (depth == 2) inSetting = false;
        if (depth == 3) inValue = false;
        --depth;
    }

    void Characters(const xmlChar* text, int length)
    {
        if (depth == 3 && inValue) document.m_Elements.back().value.append(Chars(text), static_cast<size_t>(length));
    }

    void Failed(const xmlError& error) { exhausted = exhausted || error.code == XML_ERR_NO_MEMORY; }

    static CfgXMLReader& Of(void* reader) { return *static_cast<CfgXMLReader*>(reader); }
    static xmlSAXHandler Handler();
};

xmlSAXHandler CfgXMLReader::Handler()
{
    xmlSAXHandler handler;
    memset(&handler, 0, sizeof handler);
    handler.initialized = XML_SAX2_MAGIC;
    handler.startElementNs = [](void* reader, const xmlChar* name, const xmlChar* prefix, const xmlChar* uri,
                                int nsCount, const xmlChar** namespaces, int count, int, const xmlChar** attributes) {
        Of(reader).Guard([&] { Of(reader).Start(name, prefix, uri, nsCount, namespaces, count, attributes); });
    };
    handler.endElementNs = [](void* reader, const xmlChar*, const xmlChar*, const xmlChar*) { Of(reader).End(); };
    handler.characters = [](void* reader, const xmlChar* text, int length) {
        Of(reader).Guard([&] { Of(reader).Characters(text, length); });
    };
    handler.cdataBlock = handler.characters;
    handler.ignorableWhitespace = handler.characters;
    handler.serror = [](void* reader, xmlError* error) { Of(reader).Failed(*error); };
    handler.internalSubset = [](void* reader, const xmlChar*, const xmlChar*, const xmlChar*) { Of(reader).Refuse(); };
    return handler;
}

bool CfgXMLDocument::Parse(const ZVString& text)
{
    m_Text = text;
    m_Elements.clear();
    m_RootName = ZVString();
    m_RootEnd = 0;
    m_PrefixDeclared = false;
    if (text.empty()) return true;

    const std::unique_ptr<xmlParserCtxt, decltype(&xmlFreeParserCtxt)> parser(xmlNewParserCtxt(), xmlFreeParserCtxt);
    if (!parser) throw std::bad_alloc();
    CfgXMLReader reader{*this, parser.get()};
    *parser->sax = CfgXMLReader::Handler();
    parser->userData = &reader;
    // Without XML_PARSE_NOENT an "&" in an attribute would arrive as a reference. There are no entities to expand.
    xmlCtxtReadMemory(parser.get(), text.c_str(), static_cast<int>(text.length()), nullptr, nullptr,
                      XML_PARSE_NOENT | XML_PARSE_NONET | XML_PARSE_NOERROR | XML_PARSE_NOWARNING);
    const bool isDocument = parser->wellFormed && !reader.refused && m_RootEnd > 0;
    // Where the parser is short of memory before it begins, it tells nobody: nothing is wrong, and nothing was read.
    const bool wasRead = isDocument || !parser->wellFormed || reader.refused;
    if (reader.exhausted || parser->errNo == XML_ERR_NO_MEMORY || !wasRead) throw std::bad_alloc();
    if (isDocument) return true;
    m_Elements.clear();
    return false;
}

const CfgXMLDocument::Element* CfgXMLDocument::FindElement(const ZVString& key) const
{
    const auto found =
        std::find_if(m_Elements.begin(), m_Elements.end(), [&](const Element& element) { return element.key == key; });
    return found == m_Elements.end() ? nullptr : &*found;
}

const ZVString* CfgXMLDocument::Find(const ZVString& key) const
{
    const Element* element = FindElement(key);
    return element ? &element->value : nullptr;
}

ZVString CfgXMLDocument::With(const ZVString& key, const ZVString& value) const
{
    if (m_Text.empty()) {
        CfgXMLDocument empty;
        return empty.Parse(EmptyDocument()) && !empty.m_Text.empty() ? empty.With(key, value) : ZVString();
    }
    const ZVString declaration =
        m_PrefixDeclared ? ZVString() : ZVString(" xmlns:") + kPrefix + "=\"" + kNamespace + "\"";
    const ZVString element = ZVString("<ZV1:Configuration") + declaration + " Key=\"" + Escaped(key) +
                             "\"><ZV1:Value>" + Escaped(value) + "</ZV1:Value></ZV1:Configuration>";
    if (const Element* old = FindElement(key)) return m_Text.substr(0, old->begin) + element + m_Text.substr(old->end);

    if (m_Text[m_RootEnd - 2] == '/') {  // "<ZVWSLib/>"
        return m_Text.substr(0, m_RootEnd - 2) + ">" + element + "</" + m_RootName + ">" + m_Text.substr(m_RootEnd);
    }
    size_t closing = m_RootEnd;
    while (m_Text[closing - 1] != '<')
        --closing;
    return m_Text.substr(0, closing - 1) + element + m_Text.substr(closing - 1);
}
