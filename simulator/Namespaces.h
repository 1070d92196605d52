// The namespaces of messages.
#pragma once

namespace simulator {

inline constexpr char kSoap11[] = "http://schemas.xmlsoap.org/soap/envelope/";
inline constexpr char kSoap12[] = "http://www.w3.org/2003/05/soap-envelope";
inline constexpr char kAddressing[] = "http://schemas.xmlsoap.org/ws/2004/08/addressing";
inline constexpr char kSecurity[] = "http://docs.oasis-open.org/wss/2004/01/oasis-200401-wss-wssecurity-secext-1.0.xsd";
inline constexpr char kUtility[] = "http://docs.oasis-open.org/wss/2004/01/oasis-200401-wss-wssecurity-utility-1.0.xsd";
inline constexpr char kService[] = "http://api.zorvane.example/api/";
inline constexpr char kSchema[] = "http://www.w3.org/2001/XMLSchema";
inline constexpr char kSchemaInstance[] = "http://www.w3.org/2001/XMLSchema-instance";

}  // namespace simulator
