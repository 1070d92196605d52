#include "SoapService.h"

#include "AnswerShape.h"
#include "Namespaces.h"

namespace simulator {

namespace {

const char kXmlType[] = "text/xml; charset=utf-8";

std::string Envelope(const std::string& header, const std::string& body, bool soap12)
{
    return std::string("<?xml version=\"1.0\" encoding=\"utf-8\"?><soap:Envelope xmlns:soap=\"") +
           (soap12 ? kSoap12 : kSoap11) + "\">" + header + "<soap:Body>" + body + "</soap:Body></soap:Envelope>";
}

// Damages the first enumeration text of an answer.
std::string WithUnknownEnum(std::string xml)
{
    for (const char* element : {"<PurchaseType>", "<AudioAssetProfile>", "<Status>", "<File_AccessType>"}) {
        const size_t at = xml.find(element);
        if (at != std::string::npos) return xml.insert(at + std::string(element).size(), "New_");
    }
    return xml;
}

}  // namespace

const std::vector<std::string>& EnumTexts(ChildType type)
{
    static const std::map<ChildType, std::vector<std::string>> texts = {
        {ChildType::PurchaseType, {"rent", "buy", "any"}},
        {ChildType::TitleType, {"any", "tv", "movies"}},
        {ChildType::FileProfile,
         {"UNKNOWN", "STANDARD", "HIGH_DEFINITION", "PORTABLE", "PORTABLE_STANDARD", "TEMP5", "PORTABLE_WIDE",
          "STANDARD_DEFINITION_3D", "HIGH_DEFINITION_3D", "STANDARD_DEFINITION_REALD_3D", "HIGH_DEFINITION_REALD_3D"}},
        {ChildType::AudioProfile,
         {"Stereo_Standard", "Dolby_Stereo_AC3", "Dolby_Digital_Plus_Stereo", "Dolby_Digital_Plus_51",
          "DTS_Express_Stereo", "DTS_Express_51"}},
        {ChildType::BonusAssetType, {"Trailer"}},
        {ChildType::StreamStatus, {"play", "stopped", "paused", "resumeplay", "errorinplayback"}},
        {ChildType::WatchStatus, {"WatchNow", "RentAgain", "NotAvailable", "Undefined"}},
    };
    static const std::vector<std::string> none;
    const auto found = texts.find(type);
    return found == texts.end() ? none : found->second;
}

const std::vector<ServiceRow>& Services()
{
    static const std::vector<ServiceRow> services = {
        {"browse", "RealTimeBrowse.asmx", "DeviceSettings", {&BrowseOperations()}},
        {"account", "DownloadAPI.asmx", "DownloadDeviceRequestSettings", {&SharedOperations(), &AccountOperations()}},
        {"stream", "StreamAPI.asmx", "StreamDeviceRequestSettings", {&SharedOperations(), &StreamOperations()}},
    };
    return services;
}

int Call::AccountInt(const char* column) const
{
    return database.Int(std::string("SELECT ") + column + " FROM account WHERE id = ?", {account});
}

std::string Call::AccountText(const char* column) const
{
    return database.Text(std::string("SELECT ") + column + " FROM account WHERE id = ?", {account});
}

void Call::Refuse(int code, const std::string& message) const
{
    const std::string text = refusal;
    const size_t bar = text.find('|');
    xml.Raw(text.substr(0, bar));
    Standard(code, message);
    xml.Raw(text.substr(bar + 1));
}

const OperationRow* FindOperation(const ServiceRow& service, const std::string& name)
{
    for (const Operations* rows : service.operations) {
        for (const OperationRow& row : *rows) {
            if (name == row.name) return &row;
        }
    }
    return nullptr;
}

const ServiceRow* SoapService::Find(const std::string& path)
{
    for (const ServiceRow& service : Services()) {
        for (const char* base : {"/api/", "/kac/api/"}) {
            if (path == std::string(base) + service.path) return &service;
        }
    }
    return nullptr;
}

std::string SoapService::RunHandler(const CheckedRequest& checked, const Fault& fault)
{
    XmlWriter xml, refusal;
    const auto into = [&](XmlWriter& writer) {
        return Call{m_Database,     checked.arguments, writer,         checked.operation->refusal,
                    m_PlainAddress, checked.account,   checked.device, m_LargestPage};
    };
    Call call = into(xml);
    checked.operation->handle(call);
    if (!fault.Is("code") || checked.operation->bare) return xml.Take();
    into(refusal).Refuse(fault.Number(1), "refused as asked");
    return refusal.Take();
}

HttpResponse SoapService::Respond(const CheckedRequest& checked, std::string result, const Fault& fault)
{
    const std::string name = checked.operation->name;
    if (fault.Is("fault11") || fault.Is("fault12")) return Refuse("Server", "the shop is closed", fault.Is("fault12"));
    if (fault.Is("unknown-enum")) result = WithUnknownEnum(result);

    std::string body = "<" + name + "Response xmlns=\"" + kService + "\">";
    body.reserve(body.size() + result.size() + 4 * name.size() + 64);
    if (!fault.Is("missing-result")) body.append("<" + name + "Result>").append(result).append("</" + name + "Result>");
    body += "</" + name + "Response>";
    std::string header;
    if (fault.Is("must-understand") || fault.Is("extra-header")) {
        header = std::string("<soap:Header><x:Trace xmlns:x=\"urn:trace\"") +
                 (fault.Is("must-understand") ? " soap:mustUnderstand=\"1\"" : "") + ">1</x:Trace></soap:Header>";
    }
    HttpResponse response;
    response.contentType = fault.Is("soap12") ? "application/soap+xml; charset=utf-8" : kXmlType;
    response.body = Envelope(header, body, fault.Is("soap12"));
    return Reshaped(std::move(response), fault);
}

HttpResponse SoapService::Refuse(const std::string& code, const std::string& text, bool soap12)
{
    HttpResponse response;
    response.status = 500;
    response.contentType = soap12 ? "application/soap+xml; charset=utf-8" : kXmlType;
    const std::string fault =
        soap12 ? "<soap:Fault><soap:Code><soap:Value>soap:" + std::string(code == "Client" ? "Sender" : "Receiver") +
                     "</soap:Value></soap:Code><soap:Reason><soap:Text xml:lang=\"en\">" + XmlEscape(text) +
                     "</soap:Text></soap:Reason></soap:Fault>"
               : "<soap:Fault><faultcode>soap:" + code + "</faultcode><faultstring>" + XmlEscape(text) +
                     "</faultstring></soap:Fault>";
    response.body = Envelope("", fault, soap12);
    return response;
}

}  // namespace simulator
