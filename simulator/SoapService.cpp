#include "SoapService.h"

#include "AnswerShape.h"
#include "Namespaces.h"

namespace simulator {

namespace {

const char kXmlType[] = "text/xml; charset=utf-8";
const char kSoap12Type[] = "application/soap+xml; charset=utf-8";

std::string Envelope(const std::string& header, const std::string& body, bool soap12)
{
    return std::string("<?xml version=\"1.0\" encoding=\"utf-8\"?><soap:Envelope xmlns:soap=\"") +
           (soap12 ? kSoap12 : kSoap11) + "\">" + header + "<soap:Body>" + body + "</soap:Body></soap:Envelope>";
}

// A header with a block that no client knows; `mark`: a further attribute.
std::string UnknownBlock(const std::string& mark)
{
    return "<soap:Header><x:Trace xmlns:x=\"urn:trace\"" + mark + ">1</x:Trace></soap:Header>";
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

Call SoapService::CallOf(const CheckedRequest& checked, XmlWriter& xml)
{
    return {m_Database,      checked.arguments, xml,          checked.operation->refusal, m_PlainAddress,
            checked.account, checked.device,    m_LargestPage};
}

std::string SoapService::RunHandler(const CheckedRequest& checked)
{
    XmlWriter xml;
    Call call = CallOf(checked, xml);
    checked.operation->handle(call);
    return xml.Take();
}

std::string SoapService::RefuseAsAsked(const CheckedRequest& checked, int code)
{
    XmlWriter xml;
    CallOf(checked, xml).Refuse(code, "refused as asked");
    return xml.Take();
}

HttpResponse SoapService::Respond(const CheckedRequest& checked, std::string result, const Fault& fault)
{
    std::string header;
    bool hasResult = true, isSoap12 = false;
    if (const Result* kind = fault.As<Result>()) {
        switch (*kind) {
            case Result::Code:
                if (!checked.operation->bare) result = RefuseAsAsked(checked, fault.Number(1));
                break;
            case Result::Fault11:
                return Refuse("Server", "the shop is closed", false);
            case Result::Fault12:
                return Refuse("Server", "the shop is closed", true);
            case Result::Soap12:
                isSoap12 = true;
                break;
            case Result::MissingResult:
                hasResult = false;
                break;
            case Result::MustUnderstand:
                header = UnknownBlock(" soap:mustUnderstand=\"1\"");
                break;
            case Result::ExtraHeader:
                header = UnknownBlock("");
                break;
            case Result::UnknownEnum:
                result = WithUnknownEnum(std::move(result));
                break;
        }
    }
    const std::string name = checked.operation->name;
    std::string body = "<" + name + "Response xmlns=\"" + kService + "\">";
    body.reserve(body.size() + result.size() + 4 * name.size() + 64);
    if (hasResult) body.append("<" + name + "Result>").append(result).append("</" + name + "Result>");
    body += "</" + name + "Response>";
    HttpResponse response;
    response.contentType = isSoap12 ? kSoap12Type : kXmlType;
    response.body = Envelope(header, body, isSoap12);
    return Reshaped(std::move(response), fault);
}

HttpResponse SoapService::Refuse(const std::string& code, const std::string& text, bool soap12)
{
    HttpResponse response;
    response.status = 500;
    response.contentType = soap12 ? kSoap12Type : kXmlType;
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
