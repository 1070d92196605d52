#include "ContractSchema.h"

#include <gtest/gtest.h>
#include <libxml/parser.h>

#include <pugixml.hpp>

namespace {

void Append(void* text, xmlErrorPtr error)
{
    *static_cast<std::string*>(text) += error->message;
}

}  // namespace

ContractSchema::ContractSchema(const std::string& name)
{
    std::string errors;
    const std::unique_ptr<xmlSchemaParserCtxt, void (*)(xmlSchemaParserCtxtPtr)> parser(
        xmlSchemaNewParserCtxt((std::string(ZV_CONTRACT) + name).c_str()), xmlSchemaFreeParserCtxt);
    xmlSchemaSetParserStructuredErrors(parser.get(), Append, &errors);
    m_Schema.reset(xmlSchemaParse(parser.get()));
    EXPECT_TRUE(m_Schema) << name;
    EXPECT_EQ("", errors) << name;
}

std::string ContractSchema::Check(const std::string& message) const
{
    const int options = XML_PARSE_NONET | XML_PARSE_NOERROR | XML_PARSE_NOWARNING;
    const std::unique_ptr<xmlDoc, void (*)(xmlDocPtr)> document(
        xmlReadMemory(message.data(), static_cast<int>(message.size()), nullptr, nullptr, options), xmlFreeDoc);
    if (!document) return "no XML: " + message;
    std::string errors;
    const std::unique_ptr<xmlSchemaValidCtxt, void (*)(xmlSchemaValidCtxtPtr)> context(
        xmlSchemaNewValidCtxt(m_Schema.get()), xmlSchemaFreeValidCtxt);
    xmlSchemaSetValidStructuredErrors(context.get(), Append, &errors);
    const int result = xmlSchemaValidateDoc(context.get(), document.get());
    return result == 0 ? "" : "not valid: " + errors;
}

const std::vector<ContractOperation>& ContractOperations()
{
    static const auto kOperations = [] {
        std::vector<ContractOperation> operations;
        for (const char* service : {"RealTimeBrowse", "DownloadAPI", "StreamAPI"}) {
            pugi::xml_document wsdl;
            const std::string file = std::string(ZV_CONTRACT) + service + ".wsdl";
            EXPECT_TRUE(wsdl.load_file(file.c_str(), pugi::parse_default | pugi::parse_trim_pcdata)) << file;
            for (const auto& operation : wsdl.child("definitions").child("portType").children("operation")) {
                operations.push_back(
                    {service, operation.attribute("name").value(), operation.child_value("documentation")});
            }
        }
        return operations;
    }();
    return kOperations;
}
