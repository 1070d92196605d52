// The services' contract, for those who write clients of their own.
#pragma once

#include "Http.h"

namespace simulator {

/// Answers "GET /api/NAME.asmx?wsdl" with the WSDL of that service, in which `endpoint` (the path's whole address) is
/// the service's address, and "GET /api/NAME.xsd" with a schema that it imports. False for everything else.
bool AnswerContract(const HttpRequest& request, const std::string& endpoint, HttpResponse& response);

}  // namespace simulator
