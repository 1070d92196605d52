#include "RequestCheck.h"

#include <libxml/parser.h>
#include <openssl/evp.h>

#include <algorithm>
#include <cstdlib>
#include <cstring>
#include <ctime>
#include <memory>

#include "Base64.h"
#include "Tokens.h"

namespace simulator {

namespace {

const char kEnvelope[] = "http://schemas.xmlsoap.org/soap/envelope/";
const char kAddressing[] = "http://schemas.xmlsoap.org/ws/2004/08/addressing";
const char kSecurity[] = "http://docs.oasis-open.org/wss/2004/01/oasis-200401-wss-wssecurity-secext-1.0.xsd";
const char kUtility[] = "http://docs.oasis-open.org/wss/2004/01/oasis-200401-wss-wssecurity-utility-1.0.xsd";
const char kService[] = "http://api.zorvane.example/api/";
const char kDigestType[] =
    "http://docs.oasis-open.org/wss/2004/01/oasis-200401-wss-username-token-profile-1.0#PasswordDigest";
const char kNonceType[] =
    "http://docs.oasis-open.org/wss/2004/01/oasis-200401-wss-soap-message-security-1.0#Base64Binary";
constexpr int kFreshSeconds = 300;

const char* Text(const xmlChar* text)
{
    return reinterpret_cast<const char*>(text);
}

// An element, as this file looks at one. Copies are cheap; the document must live.
class Node {
public:
    explicit Node(xmlNodePtr node = nullptr) : m_Node(node) {}
    explicit operator bool() const { return m_Node != nullptr; }

    std::string Name() const { return m_Node ? Text(m_Node->name) : ""; }
    std::string Namespace() const { return m_Node && m_Node->ns ? Text(m_Node->ns->href) : ""; }
    bool Is(const char* space, const std::string& name) const { return Name() == name && Namespace() == space; }

    std::vector<Node> Children() const
    {
        std::vector<Node> children;
        for (xmlNodePtr child = m_Node ? m_Node->children : nullptr; child; child = child->next) {
            if (child->type == XML_ELEMENT_NODE) children.emplace_back(child);
        }
        return children;
    }
    Node Child(const char* space, const char* name) const
    {
        for (const Node& child : Children()) {
            if (child.Is(space, name)) return child;
        }
        return Node();
    }
    std::string Content() const
    {
        if (!m_Node) return "";
        const std::unique_ptr<xmlChar, void (*)(void*)> content(xmlNodeGetContent(m_Node), xmlFree);
        return content ? Text(content.get()) : "";
    }
    // Text of its own beside its elements.
    bool HasText() const
    {
        for (xmlNodePtr child = m_Node ? m_Node->children : nullptr; child; child = child->next) {
            if (child->type != XML_ELEMENT_NODE && child->type != XML_COMMENT_NODE && !xmlIsBlankNode(child))
                return true;
        }
        return false;
    }
    std::string Attribute(const char* name, const char* space) const
    {
        const auto* n = reinterpret_cast<const xmlChar*>(name);
        const std::unique_ptr<xmlChar, void (*)(void*)> value(
            space ? xmlGetNsProp(m_Node, n, reinterpret_cast<const xmlChar*>(space)) : xmlGetNoNsProp(m_Node, n),
            xmlFree);
        return value ? Text(value.get()) : "";
    }

private:
    xmlNodePtr m_Node;
};

std::string Sha1(const std::string& text)
{
    unsigned char digest[EVP_MAX_MD_SIZE];
    unsigned int length = 0;
    EVP_Digest(text.data(), text.size(), digest, &length, EVP_sha1(), nullptr);
    return Base64(std::string(digest, digest + length));
}

bool IsInt(const std::string& text)
{
    if (text.empty()) return false;
    char* end = nullptr;
    const long long number = strtoll(text.c_str(), &end, 10);
    return *end == '\0' && number >= INT32_MIN && number <= INT32_MAX && !isspace(static_cast<unsigned char>(text[0]));
}

// ---- Header

// A header block as it must stand.
struct Block {
    const char* space;
    std::string name;
    bool mustUnderstand;
};

std::string CheckBlocks(const std::vector<Node>& blocks, const std::vector<Block>& wanted)
{
    for (size_t i = 0; i < std::max(blocks.size(), wanted.size()); ++i) {
        if (i >= wanted.size()) return "header block " + blocks[i].Name() + " is not expected";
        if (i >= blocks.size() || !blocks[i].Is(wanted[i].space, wanted[i].name)) {
            return "header block " + std::to_string(i + 1) + " must be " + wanted[i].name;
        }
        const std::string marked = blocks[i].Attribute("mustUnderstand", kEnvelope);
        if (wanted[i].mustUnderstand != (marked == "1" || marked == "true")) {
            return "mustUnderstand of " + wanted[i].name + " is wrong";
        }
    }
    return "";
}

std::string CheckSettings(const Node& settings, const std::string& apiKey)
{
    // Texts may be left out; what is there stands in this order.
    static const char* const kOrder[] = {"APIKey", "DestinationUniqueID", "DestinationTypeID", "AuthToken"};
    size_t next = 0;
    for (const Node& child : settings.Children()) {
        while (next < 4 && !child.Is(kService, kOrder[next]))
            ++next;
        if (next == 4) return "child " + child.Name() + " of the device settings is unknown or out of order";
        ++next;
    }
    if (settings.Child(kService, "APIKey").Content() != apiKey) return "unknown API key";
    if (settings.Child(kService, "DestinationUniqueID").Content().empty()) return "no DestinationUniqueID";
    if (!IsInt(settings.Child(kService, "DestinationTypeID").Content())) return "DestinationTypeID is no xsd:int";
    return "";
}

bool IsFresh(const std::string& created, time_t now)
{
    time_t when;
    return ReadDateTime(created, when) && std::llabs(static_cast<long long>(when) - now) <= kFreshSeconds;
}

// ---- Body

std::string CheckIntArray(const Node& child, std::vector<int>& numbers)
{
    for (const Node& item : child.Children()) {
        if (!item.Is(kService, "int") || !IsInt(item.Content())) return "an item of " + child.Name() + " is no ZV1:int";
        numbers.push_back(atoi(item.Content().c_str()));
    }
    return "";
}

std::string CheckValue(const Child& wanted, const Node& child, Arguments& arguments)
{
    const std::string text = child.Content();
    if (wanted.type == ChildType::IntArray) return CheckIntArray(child, arguments.arrays[wanted.name]);
    if (!child.Children().empty()) return std::string(wanted.name) + " has children";
    arguments.texts[wanted.name] = text;
    if (wanted.type == ChildType::Int) {
        if (!IsInt(text)) return std::string(wanted.name) + " is no xsd:int";
        arguments.numbers[wanted.name] = atoi(text.c_str());
    } else if (wanted.type != ChildType::Text) {
        const auto& texts = EnumTexts(wanted.type);
        const auto found = std::find(texts.begin(), texts.end(), text);
        if (found == texts.end()) return std::string(wanted.name) + " has no value \"" + text + "\"";
        arguments.numbers[wanted.name] = static_cast<int>(found - texts.begin());
    }
    return "";
}

std::string CheckChildren(const Node& body, const OperationRow& operation, Arguments& arguments)
{
    if (body.HasText()) return body.Name() + " holds text beside its children";
    const std::vector<Node> children = body.Children();
    size_t at = 0;
    for (const Child& wanted : operation.children) {
        if (at < children.size() && children[at].Is(kService, wanted.name)) {
            std::string wrong = CheckValue(wanted, children[at++], arguments);
            if (!wrong.empty()) return wrong;
        } else if (wanted.type == ChildType::IntArray) {
            arguments.arrays[wanted.name];
        } else if (wanted.type != ChildType::Text) {
            return std::string("child ") + wanted.name + " is missing or out of order";
        }
    }
    return at == children.size() ? "" : "child " + children[at].Name() + " is not expected there";
}

bool IsSecret(const std::string& name)
{
    return name == "password" || name == "PIN" || name == "Pin" || name == "AuthToken" || name == "GiftCertificateCode";
}

// What the log tells of a header, right or wrong, and who asks.
void NoteHeader(const Node& header, Database& database, CheckedRequest& checked, LoggedRequest& log)
{
    for (const Node& block : header.Children()) {
        if (block.Is(kSecurity, "Security")) {
            const Node token = block.Child(kSecurity, "UsernameToken");
            log.soap.emplace_back("user", token.Child(kSecurity, "Username").Content());
        } else if (block.Is(kAddressing, "MessageID")) {
            log.soap.emplace_back("messageID", block.Content());
        } else if (block.Is(kAddressing, "To")) {
            log.soap.emplace_back("to", block.Content());
        } else if (block.Namespace() == kService) {
            log.soap.emplace_back("settings", block.Name());
            for (const Node& child : block.Children()) {
                const bool token = child.Name() == "AuthToken" && !child.Content().empty();
                log.soap.emplace_back(child.Name(), token ? "***" : child.Content());
            }
            const TokenStanding standing = StandingOf(database, block.Child(kService, "AuthToken").Content());
            log.soap.emplace_back("token", standing.name);
            checked.account = standing.account;
            checked.device = block.Child(kService, "DestinationUniqueID").Content();
        }
    }
}

std::string CheckToken(const Node& security, time_t now)
{
    static const std::pair<const char*, const char*> kOrder[] = {
        {kSecurity, "Username"}, {kSecurity, "Password"}, {kSecurity, "Nonce"}, {kUtility, "Created"}};
    const Node token = security.Child(kSecurity, "UsernameToken");
    const std::vector<Node> children = token.Children();
    if (security.Children().size() != 1 || children.size() != 4) return "no complete user-name token";
    for (size_t i = 0; i < 4; ++i) {
        if (!children[i].Is(kOrder[i].first, kOrder[i].second)) {
            return std::string("the token has no ") + kOrder[i].second + " in its place";
        }
    }
    if (token.Attribute("Id", kUtility) != "User") return "wsu:Id of the token is not User";
    if (children[1].Attribute("Type", nullptr) != kDigestType) return "the password is no digest";
    if (children[2].Attribute("EncodingType", nullptr) != kNonceType) return "the nonce is no Base64Binary";
    if (Unbase64(children[2].Content()).empty()) return "the nonce is no base64 text";
    if (!IsFresh(children[3].Content(), now)) return "the token is not fresh";
    return "";
}

std::string CheckHttp(const HttpRequest& request)
{
    if (request.method != "POST") return "the method is not POST";
    if (request.Header("content-type") != "text/xml; charset=utf-8")
        return "the content type is not text/xml; charset=utf-8";
    if (request.Header("user-agent").empty()) return "no user agent";
    return "";
}

}  // namespace

bool RequestCheck::IsNewNonce(const std::string& nonce)
{
    const std::lock_guard<std::mutex> lock(m_Mutex);
    return m_Nonces.insert(nonce).second;
}

// Whether the text is the address of the services with that path, under whatever name of theirs.
bool RequestCheck::IsEndpoint(const std::string& text, const std::string& path) const
{
    const std::string scheme = "https://";
    const size_t slash = text.find('/', scheme.size());
    return text.compare(0, scheme.size(), scheme) == 0 && slash != std::string::npos && text.substr(slash) == path &&
           m_Hosts.IsService(text.substr(scheme.size(), slash - scheme.size()));
}

std::string RequestCheck::Check(const HttpRequest& request, const ServiceRow& service, CheckedRequest& checked,
                                LoggedRequest& log)
{
    const std::unique_ptr<xmlDoc, void (*)(xmlDocPtr)> document(
        xmlReadMemory(request.body.data(), static_cast<int>(request.body.size()), nullptr, nullptr,
                      XML_PARSE_NONET | XML_PARSE_NOERROR | XML_PARSE_NOWARNING),
        xmlFreeDoc);
    const Node envelope(document ? xmlDocGetRootElement(document.get()) : nullptr);
    NoteHeader(envelope.Child(kEnvelope, "Header"), m_Database, checked, log);
    const std::vector<Node> bodies = envelope.Child(kEnvelope, "Body").Children();
    const Node body = bodies.empty() ? Node() : bodies[0];
    log.operation = body.Name();
    for (const Node& child : body.Children()) {
        log.children.emplace_back(child.Name(), IsSecret(child.Name()) ? "***" : child.Content());
    }

    std::string wrong = CheckHttp(request);
    if (!wrong.empty()) return wrong;
    if (!document) return "the body is no XML";
    if (document->intSubset) return "the body has a document type declaration";
    if (!envelope.Is(kEnvelope, "Envelope")) return "the body is no SOAP 1.1 envelope";
    if (bodies.size() != 1 || body.Namespace() != kService)
        return "the SOAP body holds no single element of the service";
    checked.operation = FindOperation(service, body.Name());
    if (!checked.operation) return "the service has no operation " + body.Name();
    const std::string action = kService + body.Name();
    if (request.Header("soapaction") != "\"" + action + "\"") return "SOAPAction is not " + action;

    const std::vector<Node> blocks = envelope.Child(kEnvelope, "Header").Children();
    wrong = CheckBlocks(blocks, {{kSecurity, "Security", true},
                                 {kAddressing, "MessageID", false},
                                 {kAddressing, "ReplyTo", true},
                                 {kAddressing, "To", true},
                                 {kAddressing, "Action", true},
                                 {kService, service.settingsBlock, true}});
    if (!wrong.empty()) return wrong;
    if (blocks[1].Content() != "uuid:" + body.Name()) return "wsa:MessageID is not uuid:" + body.Name();
    if (blocks[2].Child(kAddressing, "Address").Content() != std::string(kAddressing) + "/role/anonymous") {
        return "wsa:ReplyTo is not anonymous";
    }
    if (!IsEndpoint(blocks[3].Content(), request.Path()))
        return "wsa:To is not https://" + m_Hosts.Https() + request.Path();
    if (blocks[4].Content() != action) return "wsa:Action is not " + action;

    wrong = CheckToken(blocks[0], m_Clock.Now());
    if (!wrong.empty()) return wrong;
    const Node token = blocks[0].Child(kSecurity, "UsernameToken");
    const Node password = token.Child(kSecurity, "Password");
    const std::string nonce = Unbase64(token.Child(kSecurity, "Nonce").Content());
    const std::string created = token.Child(kUtility, "Created").Content();
    const std::string secret =
        m_Database.Text("SELECT password FROM service WHERE user = ?", {token.Child(kSecurity, "Username").Content()});
    if (secret.empty() || password.Content() != Sha1(nonce + created + secret)) return "authentication failed";
    if (!IsNewNonce(nonce)) return "the nonce was used before";

    wrong = CheckSettings(blocks[5], m_Database.Text("SELECT api_key FROM service"));
    return wrong.empty() ? CheckChildren(body, *checked.operation, checked.arguments) : wrong;
}

}  // namespace simulator
