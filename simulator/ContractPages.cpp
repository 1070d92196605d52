#include "ContractPages.h"

#include <strings.h>

#include "ContractFiles.h"
#include "SoapService.h"

namespace simulator {

namespace {

bool EndsWith(const std::string& text, const std::string& end)
{
    return text.size() >= end.size() && text.compare(text.size() - end.size(), end.size(), end) == 0;
}

// The file that a request wants; empty for none.
std::string FileOf(const HttpRequest& request)
{
    const std::string path = request.Path();
    const std::string folder = path.substr(0, path.rfind('/') + 1);
    if (request.method != "GET" || (folder != "/api/" && folder != "/kac/api/")) return "";
    std::string name = path.substr(folder.size());
    if (EndsWith(name, ".xsd")) return name;
    const bool asksForWsdl = strcasecmp(request.target.substr(path.size()).c_str(), "?wsdl") == 0;
    return SoapService::Find(path) && asksForWsdl ? name.substr(0, name.rfind('.')) + ".wsdl" : "";
}

// With the address of this storefront in the place of the compiled-in one.
std::string WithAddress(std::string wsdl, const std::string& endpoint)
{
    static const std::string kBefore = "<SOAP:address location=\"";
    const size_t start = wsdl.find(kBefore) + kBefore.size();
    return wsdl.replace(start, wsdl.find('"', start) - start, endpoint);
}

}  // namespace

bool AnswerContract(const HttpRequest& request, const std::string& endpoint, HttpResponse& response)
{
    const std::string name = FileOf(request);
    const auto file = ContractFiles().find(name);
    if (file == ContractFiles().end()) return false;
    response.contentType = "text/xml; charset=utf-8";
    response.body = EndsWith(name, ".wsdl") ? WithAddress(file->second, endpoint) : file->second;
    return true;
}

}  // namespace simulator
