// The services' contract as WSDL and XSD, as the build made it.
#pragma once

#include <map>
#include <string>

/// Content by file name: "StreamAPI.wsdl", "api.xsd", ... A WSDL's address is the one that is compiled into the client.
/// Any thread.
const std::map<std::string, std::string>& ContractFiles();
