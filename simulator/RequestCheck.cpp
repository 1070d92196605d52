#include "RequestCheck.h"

#include <openssl/evp.h>

#include <algorithm>
#include <cerrno>
#include <cstdlib>
#include <cstring>
#include <ctime>
#include <memory>

#include "Base64.h"
#include "MessageForm.h"
#include "Namespaces.h"
#include "Tokens.h"
#include "XmlNode.h"

namespace simulator {

namespace {

const char kDigestType[] =
    "http://docs.oasis-open.org/wss/2004/01/oasis-200401-wss-username-token-profile-1.0#PasswordDigest";
const char kNonceType[] =
    "http://docs.oasis-open.org/wss/2004/01/oasis-200401-wss-soap-message-security-1.0#Base64Binary";
const char kNextActor[] = "http://schemas.xmlsoap.org/soap/actor/next";
constexpr int kFreshSeconds = 300;

std::string Sha1(const std::string& text)
{
    unsigned char digest[EVP_MAX_MD_SIZE];
    unsigned int length = 0;
    EVP_Digest(text.data(), text.size(), digest, &length, EVP_sha1(), nullptr);
    return Base64(std::string(digest, digest + length));
}

bool IsInt(const std::string& text)
{
    const std::string digits = Trimmed(text);
    const size_t first = digits.find_first_of("0123456789");
    if (first > 1 || digits.find_first_not_of("0123456789", first) != std::string::npos) return false;
    if (first == 1 && digits[0] != '-' && digits[0] != '+') return false;
    errno = 0;
    const long long number = strtoll(digits.c_str(), nullptr, 10);
    return errno == 0 && number >= INT32_MIN && number <= INT32_MAX;
}

// A base64 text may be written on several lines.
std::string Joined(std::string text)
{
    text.erase(std::remove_if(text.begin(), text.end(), [](unsigned char c) { return isspace(c); }), text.end());
    return text;
}

// ---- Header

// A header block as it must stand.
struct Block {
    const char* space;
    const char* name;
    bool mustUnderstand;
};

// Who a block is for, and whether it must be understood.
std::string CheckMarks(const Node& block, bool mustUnderstand)
{
    const std::string marked = block.Attribute("mustUnderstand", kSoap11);
    const bool isYes = marked == "1" || marked == "true";
    const bool isNo = marked == "0" || marked == "false" || !block.HasAttribute("mustUnderstand", kSoap11);
    if (mustUnderstand ? !isYes : !isNo) return "mustUnderstand of " + block.Name() + " is wrong";
    const std::string actor = block.Attribute("actor", kSoap11);
    return actor.empty() || actor == kNextActor ? "" : "header block " + block.Name() + " is for another actor";
}

std::string CheckBlocks(const std::vector<Node>& blocks, const std::vector<Block>& wanted)
{
    for (size_t i = 0; i < std::max(blocks.size(), wanted.size()); ++i) {
        if (i >= wanted.size()) return "header block " + blocks[i].Name() + " is not expected";
        if (i >= blocks.size() || !blocks[i].Is(wanted[i].space, wanted[i].name)) {
            return "header block " + std::to_string(i + 1) + " must be " + wanted[i].name;
        }
        std::string wrong = CheckMarks(blocks[i], wanted[i].mustUnderstand);
        if (!wrong.empty()) return wrong;
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

bool IsFresh(time_t when, time_t now)
{
    return std::llabs(static_cast<long long>(when) - now) <= kFreshSeconds;
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

// When the message was made, and how long it may be used: each once at most, in this order, before what others add.
std::string CheckTimestamp(const Node& timestamp, time_t now)
{
    time_t created = now, expires = now;
    const std::vector<Node> children = timestamp.Children();
    size_t next = 0;
    for (const auto& [name, when] : {std::pair<const char*, time_t*>("Created", &created), {"Expires", &expires}}) {
        if (next == children.size() || !children[next].Is(kUtility, name)) continue;
        if (!ReadDateTime(children[next++].Value(), *when)) return "the message's timestamp holds no time";
        if (when == &created) expires = std::max(expires, created);
    }
    for (; next < children.size(); ++next) {
        if (children[next].Namespace() == kUtility) return "the message's timestamp is out of order";
    }
    if (!IsFresh(created, now)) return "the message is not fresh";
    return expires < std::max(created, now) ? "the message has expired" : "";
}

std::string CheckToken(const Node& security, time_t now)
{
    static const std::pair<const char*, const char*> kOrder[] = {
        {kSecurity, "Username"}, {kSecurity, "Password"}, {kSecurity, "Nonce"}, {kUtility, "Created"}};
    const Node token = security.Child(kSecurity, "UsernameToken");
    const Node timestamp = security.Child(kUtility, "Timestamp");
    const std::vector<Node> children = token.Children();
    if (security.Children().size() != (timestamp ? 2 : 1) || children.size() != 4) return "no complete user-name token";
    std::string wrong = CheckTimestamp(timestamp, now);
    if (!wrong.empty()) return wrong;
    for (size_t i = 0; i < 4; ++i) {
        if (!children[i].Is(kOrder[i].first, kOrder[i].second)) {
            return std::string("the token has no ") + kOrder[i].second + " in its place";
        }
    }
    if (token.Attribute("Id", kUtility) != "User") return "wsu:Id of the token is not User";
    if (children[1].Attribute("Type", nullptr) != kDigestType) return "the password is no digest";
    if (children[2].Attribute("EncodingType", nullptr) != kNonceType) return "the nonce is no Base64Binary";
    if (Unbase64(Joined(children[2].Content())).empty()) return "the nonce is no base64 text";
    time_t created;
    const bool isTime = ReadDateTime(children[3].Value(), created);
    return isTime && IsFresh(created, now) ? "" : "the token is not fresh";
}

// The charset that the content type names, in lower case; "utf-8" when it names none, and "" when it is no text/xml.
std::string CharsetOf(const HttpRequest& request)
{
    const std::vector<std::string> parts = Split(Lower(request.Header("content-type")), ';');
    if (parts[0] != "text/xml") return "";
    for (const std::string& part : parts) {
        if (part.rfind("charset=", 0) != 0) continue;
        const std::string charset = part.substr(strlen("charset="));
        const bool quoted = charset.size() > 2 && charset.front() == '"' && charset.back() == '"';
        return quoted ? charset.substr(1, charset.size() - 2) : charset;
    }
    return "utf-8";
}

std::string CheckHttp(const HttpRequest& request)
{
    if (request.method != "POST") return "the method is not POST";
    if (CharsetOf(request) != "utf-8") return "the content type is not text/xml; charset=utf-8";
    if (request.Header("user-agent").empty()) return "no user agent";
    return "";
}

}  // namespace

bool RequestCheck::IsNewNonce(const std::string& digest)
{
    const std::lock_guard<std::mutex> lock(m_Mutex);
    const auto [place, isNew] = m_Nonces.insert(digest);
    if (isNew) m_InOrder.push_back(place);
    if (m_InOrder.size() > m_Remembered) {
        m_Nonces.erase(m_InOrder.front());
        m_InOrder.pop_front();
    }
    return isNew;
}

// Whether the text is the address of the services with that path, under whatever name of theirs.
bool RequestCheck::IsEndpoint(const std::string& text, const std::string& path) const
{
    const std::string scheme = "https://";
    const size_t slash = text.find('/', scheme.size());
    return text.compare(0, scheme.size(), scheme) == 0 && slash != std::string::npos && text.substr(slash) == path &&
           m_Hosts.IsOurs(text.substr(scheme.size(), slash - scheme.size()), true);
}

std::string RequestCheck::Check(const HttpRequest& request, const ServiceRow& service, CheckedRequest& checked,
                                LoggedRequest& log)
{
    // A charset of HTTP's goes before what the XML declaration says.
    const bool named = Lower(request.Header("content-type")).find("charset") != std::string::npos;
    const Document document = ReadXml(request.body, named ? "UTF-8" : nullptr);
    const Node envelope(document);
    NoteHeader(envelope.Child(kSoap11, "Header"), m_Database, checked, log);
    const std::vector<Node> bodies = envelope.Child(kSoap11, "Body").Children();
    const Node body = bodies.empty() ? Node() : bodies[0];
    log.operation = body.Name();
    for (const Node& child : body.Children()) {
        log.children.emplace_back(child.Name(), IsSecret(child.Name()) ? "***" : child.Content());
    }

    std::string wrong = CheckHttp(request);
    if (!wrong.empty()) return wrong;
    if (!document) return "the body is no XML";
    if (document->intSubset) return "the body has a document type declaration";
    if (!envelope.Is(kSoap11, "Envelope")) return "the body is no SOAP 1.1 envelope";
    wrong = CheckForm(document);
    if (!wrong.empty()) return wrong;
    if (bodies.size() != 1 || body.Namespace() != kService)
        return "the SOAP body holds no single element of the service";
    checked.operation = FindOperation(service, body.Name());
    if (!checked.operation) return "the service has no operation " + body.Name();
    const std::string action = kService + body.Name();
    if (request.Header("soapaction") != "\"" + action + "\"") return "SOAPAction is not " + action;

    const std::vector<Node> blocks = envelope.Child(kSoap11, "Header").Children();
    wrong = CheckBlocks(blocks, {{kSecurity, "Security", true},
                                 {kAddressing, "MessageID", false},
                                 {kAddressing, "ReplyTo", true},
                                 {kAddressing, "To", true},
                                 {kAddressing, "Action", true},
                                 {kService, service.settingsBlock, true}});
    if (!wrong.empty()) return wrong;
    if (blocks[1].Value() != "uuid:" + body.Name()) return "wsa:MessageID is not uuid:" + body.Name();
    const std::vector<Node> address = blocks[2].Children();
    if (address.size() != 1 || !address[0].Is(kAddressing, "Address") ||
        address[0].Value() != std::string(kAddressing) + "/role/anonymous") {
        return "wsa:ReplyTo is not the anonymous role alone";
    }
    if (!IsEndpoint(blocks[3].Value(), request.Path()))
        return "wsa:To is not https://" + m_Hosts.Https() + request.Path();
    if (blocks[4].Value() != action) return "wsa:Action is not " + action;

    wrong = CheckToken(blocks[0], m_Clock.Now());
    if (!wrong.empty()) return wrong;
    const Node token = blocks[0].Child(kSecurity, "UsernameToken");
    const Node password = token.Child(kSecurity, "Password");
    const std::string nonce = Unbase64(Joined(token.Child(kSecurity, "Nonce").Content()));
    const std::string created = token.Child(kUtility, "Created").Value();
    const std::string secret =
        m_Database.Text("SELECT password FROM service WHERE user = ?", {token.Child(kSecurity, "Username").Content()});
    if (secret.empty() || password.Value() != Sha1(nonce + created + secret)) return "authentication failed";
    if (!IsNewNonce(Sha1(nonce))) return "the nonce was used before";

    wrong = CheckSettings(blocks[5], m_Database.Text("SELECT api_key FROM service"));
    return wrong.empty() ? CheckChildren(body, *checked.operation, checked.arguments) : wrong;
}

}  // namespace simulator
