#include "MessageForm.h"

#include <algorithm>

#include "Http.h"
#include "Namespaces.h"
#include "Records.h"

namespace simulator {

namespace {

// What the standards say of the header's elements; each one's type is of its own namespace.
const struct HeaderElement {
    const char* space;
    const char* name;
    const char* type;
    bool isText;
} kHeaderElements[] = {
    {kSecurity, "Security", "SecurityHeaderType", false}, {kSecurity, "UsernameToken", "UsernameTokenType", false},
    {kSecurity, "Username", "AttributedString", true},    {kSecurity, "Password", "PasswordString", true},
    {kSecurity, "Nonce", "EncodedString", true},          {kUtility, "Timestamp", "TimestampType", false},
    {kUtility, "Created", "AttributedDateTime", true},    {kUtility, "Expires", "AttributedDateTime", true},
    {kAddressing, "MessageID", "AttributedURI", true},    {kAddressing, "ReplyTo", "EndpointReferenceType", false},
    {kAddressing, "Address", "AttributedURI", true},      {kAddressing, "To", "AttributedURI", true},
    {kAddressing, "Action", "AttributedURI", true},
};

// The content of an element, and the type that it may say that it has.
struct Expected {
    std::string space;
    std::string type;
    bool isText;
};

std::string CheckElement(const Node& element, const Expected& expected)
{
    const std::string name = element.Name();
    if (element.HasAttribute("nil", kSchemaInstance)) return name + " cannot be nil";
    if (element.HasAttribute("type", kSchemaInstance)) {
        const std::string type = Trimmed(element.Attribute("type", kSchemaInstance));
        const size_t colon = type.find(':');
        const std::string prefix = colon == std::string::npos ? "" : type.substr(0, colon);
        if (expected.type.empty() || type.substr(colon + 1) != expected.type ||
            element.NamespaceOf(prefix) != expected.space) {
            return "xsi:type of " + name + " is wrong";
        }
    }
    if (expected.isText) return element.Children().empty() ? "" : name + " has children";
    return element.HasText() ? name + " holds text beside its children" : "";
}

// An element of the service: of a record's type, or of one of the schema's.
std::string CheckRecord(const Node& element, const std::string& type)
{
    const Fields* fields = FindRecord(type);
    const size_t colon = type.find(':');
    const bool isStandard = colon != std::string::npos;
    std::string wrong =
        CheckElement(element, {isStandard ? kSchema : kService, isStandard ? type.substr(colon + 1) : type, !fields});
    for (const Node& child : element.Children()) {
        for (size_t i = 0; fields && wrong.empty() && i < fields->size(); ++i) {
            if (child.Is(kService, (*fields)[i].name.c_str())) wrong = CheckRecord(child, (*fields)[i].type);
        }
    }
    return wrong;
}

// A header block or the request, with all that is in it. What is known to nobody is another's to refuse.
std::string CheckBlock(const Node& block)
{
    const std::string name = block.Name();
    if (block.Namespace() == kService) return FindRecord(name) ? CheckRecord(block, name) : "";
    std::string wrong;
    for (const HeaderElement& row : kHeaderElements) {
        if (block.Is(row.space, row.name)) wrong = CheckElement(block, {row.space, row.type, row.isText});
    }
    for (const Node& child : block.Children())
        wrong = wrong.empty() ? CheckBlock(child) : wrong;
    return wrong;
}

// One of SOAP's own three elements.
std::string CheckOwn(const Node& element)
{
    const std::string foreign = element.AttributeOutside(kSchemaInstance);
    if (!foreign.empty()) return "attribute " + foreign + " of the SOAP " + element.Name() + " is not expected";
    return CheckElement(element, {"", "", false});
}

}  // namespace

std::string CheckForm(const Document& message)
{
    if (HasInstruction(message)) return "the message holds a processing instruction";
    const Node envelope(message);
    const std::vector<Node> parts = envelope.Children();
    static const char* const kParts[] = {"Header", "Body"};
    for (size_t i = 0; i < std::max(parts.size(), std::size(kParts)); ++i) {
        if (i >= std::size(kParts)) return "the envelope holds " + parts[i].Name() + " behind its body";
        if (i >= parts.size() || !parts[i].Is(kSoap11, kParts[i])) {
            return "part " + std::to_string(i + 1) + " of the envelope must be " + kParts[i];
        }
    }
    std::string wrong = CheckOwn(envelope);
    for (const Node& part : parts) {
        if (wrong.empty()) wrong = CheckOwn(part);
        for (const Node& block : part.Children())
            wrong = wrong.empty() ? CheckBlock(block) : wrong;
    }
    return wrong;
}

}  // namespace simulator
