#include "Records.h"

#include "ContractFiles.h"
#include "XmlNode.h"

namespace simulator {

namespace {

const char kSchema[] = "http://www.w3.org/2001/XMLSchema";
const char kXsdPrefix[] = "xsd:";

bool IsXsdType(const std::string& type)
{
    return type.rfind(kXsdPrefix, 0) == 0;
}

// The prefix of xsd's types stays.
std::string TypeOf(const std::string& name)
{
    return IsXsdType(name) ? name : name.substr(name.find(':') + 1);
}

// What a record holds of its own and, before that, of the one that it extends.
void ReadFields(const Node& node, std::map<std::string, Fields>& records, Fields& to)
{
    for (const Node& child : node.Children()) {
        const auto attribute = [&child](const char* name) { return child.Attribute(name, nullptr); };
        if (child.Is(kSchema, "extension")) to = records[TypeOf(attribute("base"))];
        const bool isAttribute = child.Is(kSchema, "attribute");
        if (!isAttribute && !child.Is(kSchema, "element")) {
            ReadFields(child, records, to);
        } else if (!attribute("name").empty()) {
            to.push_back({attribute("name"), TypeOf(attribute("type")),
                          isAttribute                             ? '@'
                          : attribute("maxOccurs") == "unbounded" ? '*'
                          : attribute("minOccurs") == "0"         ? '?'
                                                                  : '1'});
        }
    }
}

// A record stands behind the one that it extends, and an element behind its type.
std::map<std::string, Fields> ReadRecords()
{
    std::map<std::string, Fields> records;
    const Document document = ReadXml(ContractFiles().at("api.xsd"));
    for (const Node& node : Node(document).Children()) {
        const std::string name = node.Attribute("name", nullptr);
        if (node.Is(kSchema, "complexType")) ReadFields(node, records, records[name]);
        if (node.Is(kSchema, "element")) records["_" + name] = records[TypeOf(node.Attribute("type", nullptr))];
    }
    return records;
}

}  // namespace

const Fields* FindRecord(const std::string& type)
{
    static const std::map<std::string, Fields> records = ReadRecords();
    const auto found = records.find(type);
    return found == records.end() ? nullptr : &found->second;
}

bool IsArray(const std::string& type)
{
    const Fields* fields = FindRecord(type);
    return fields && fields->size() == 1 && fields->front().occurs == '*';
}

bool IsEnumeration(const std::string& type)
{
    return !type.empty() && !FindRecord(type) && !IsXsdType(type);
}

}  // namespace simulator
