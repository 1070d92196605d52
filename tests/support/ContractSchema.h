// The published contract: SOAP messages checked against its schemas, and what its WSDLs tell.
#pragma once

#include <libxml/xmlschemas.h>

#include <memory>
#include <string>
#include <vector>

class ContractSchema {
public:
    /// A file of the build's folder contract/, "request.xsd" or "answer.xsd". A schema that cannot be used fails the
    /// test.
    explicit ContractSchema(const std::string& name);

    /// What is wrong with a whole message, a line for each error; empty when nothing is.
    std::string Check(const std::string& message) const;

private:
    std::unique_ptr<xmlSchema, void (*)(xmlSchemaPtr)> m_Schema{nullptr, xmlSchemaFree};
};

/// An operation as a WSDL has it.
struct ContractOperation {
    std::string service;  ///< "StreamAPI"
    std::string name;
    std::string documentation;
};

/// Those of all WSDLs, in their order.
const std::vector<ContractOperation>& ContractOperations();
