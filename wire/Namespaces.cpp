#include "Namespaces.h"

// The envelope is written in the first row's form (SOAP 1.1); the third column lets the SOAP 1.2 namespaces be read.
// clang-format off
struct Namespace namespaces[] = {
    {"SOAP-ENV", "http://schemas.xmlsoap.org/soap/envelope/", "http://www.w3.org/*/soap-envelope", nullptr},
    {"SOAP-ENC", "http://schemas.xmlsoap.org/soap/encoding/", "http://www.w3.org/*/soap-encoding", nullptr},
    {"xsi", "http://www.w3.org/2001/XMLSchema-instance", "http://www.w3.org/*/XMLSchema-instance", nullptr},
    {"xsd", "http://www.w3.org/2001/XMLSchema", "http://www.w3.org/*/XMLSchema", nullptr},
    {"c14n", "http://www.w3.org/2001/10/xml-exc-c14n#", nullptr, nullptr},
    {"wsu", "http://docs.oasis-open.org/wss/2004/01/oasis-200401-wss-wssecurity-utility-1.0.xsd", nullptr, nullptr},
    {"ds", "http://www.w3.org/2000/09/xmldsig#", nullptr, nullptr},
    {"wsse", "http://docs.oasis-open.org/wss/2004/01/oasis-200401-wss-wssecurity-secext-1.0.xsd", nullptr, nullptr},
    {"wsa", "http://schemas.xmlsoap.org/ws/2004/08/addressing", nullptr, nullptr},
    {"ZV2", "http://api.zorvane.example/api/StreamAPISoap12", nullptr, nullptr},
    {"ZV3", "http://api.zorvane.example/api/RealTimeBrowseSoap12", nullptr, nullptr},
    {"ZV4", "http://api.zorvane.example/api/DownloadAPISoap12", nullptr, nullptr},
    {"ZV1", "http://api.zorvane.example/api/", nullptr, nullptr},
    {"ZV5", "http://api.zorvane.example/api/DownloadAuthenticateSoap12", nullptr, nullptr},
    {nullptr, nullptr, nullptr, nullptr},
};
// clang-format on
