// A call over a connection that is open: the library against the bare SOAP toolkit, and against libcurl with libxml2
// and with pugixml. All of them verify the server, authenticate each request with a fresh digest and accept a
// compressed answer.
#include <curl/curl.h>
#include <libxml/parser.h>
#include <libxml/tree.h>
#include <openssl/evp.h>
#include <openssl/rand.h>
#include <string.h>
#include <time.h>
#include <wsaapi.h>
#include <wsseapi.h>
#include <pugixml.hpp>

#include "Namespaces.h"
#include "Store.h"
#include "soapRealTimeBrowseSoap12Proxy.h"

namespace {

const std::string kNamespace = "http://api.zorvane.example/api/";
const std::string kTitles = "getTitlesByNavigation";
const char kAnonymous[] = "http://schemas.xmlsoap.org/ws/2004/08/addressing/role/anonymous";

std::string Endpoint()
{
    return "https://localhost:" + std::to_string(TheStore().HttpsPort()) + "/api/RealTimeBrowse.asmx";
}

std::string Authorities()
{
    return TheStore().DataFolder() + "/ca.pem";
}

void Library(benchmark::State& state)
{
    BenchSession session;
    session.GetTitles();
    while (state.KeepRunning())
        session.GetTitles();
}

// ---- The toolkit alone

class Toolkit {
public:
    Toolkit() : m_Endpoint(Endpoint()), m_Proxy(SOAP_IO_KEEPALIVE | SOAP_C_UTFSTRING)
    {
        soap_set_namespaces(&m_Proxy, namespaces);
        soap_register_plugin(&m_Proxy, soap_wsa);
        soap_register_plugin(&m_Proxy, soap_wsse);
        const auto flags = SOAP_SSL_DEFAULT | SOAP_TLSv1_2 | SOAP_TLSv1_3;
        Check(soap_ssl_client_context(&m_Proxy, flags, nullptr, nullptr, Authorities().c_str(), nullptr, nullptr) ==
                  SOAP_OK,
              "a TLS context");
        m_Proxy.soap_endpoint = m_Endpoint.c_str();
    }
    ~Toolkit()
    {
        m_Proxy.destroy();
        soap_done(&m_Proxy);
    }

    void GetTitles()
    {
        ZV1__DeviceSettings settings;
        settings.APIKey = const_cast<char*>(StorefrontAccount::kApiKey);
        settings.DestinationUniqueID = const_cast<char*>("bench");
        settings.DestinationTypeID = 48;
        m_Proxy.header = nullptr;
        soap_wsa_request(&m_Proxy, ("uuid:" + kTitles).c_str(), m_Endpoint.c_str(), (kNamespace + kTitles).c_str());
        soap_wsa_add_ReplyTo(&m_Proxy, kAnonymous);
        soap_wsse_add_UsernameTokenDigest(&m_Proxy, "User", StorefrontAccount::kUser, StorefrontAccount::kPassword);
        m_Proxy.header->ZV1__DeviceSettings_ = &settings;
        _ZV1__getTitlesByNavigation request;
        _ZV1__getTitlesByNavigationResponse response;
        request.GenreID = 1;
        request.CurrentPageNumber = 1;
        request.ItemsPerPage = kItems;
        request.PurchaseType = ZV1__StreamAPIPurchaseType(PURCHASE_TYPE_RENT);
        Check(m_Proxy.getTitlesByNavigation(&request, &response) == SOAP_OK && response.getTitlesByNavigationResult,
              "the toolkit's call");
        m_Proxy.destroy();
    }

private:
    const std::string m_Endpoint;
    RealTimeBrowseSoap12Proxy m_Proxy;
};

void BareToolkit(benchmark::State& state)
{
    Toolkit toolkit;
    toolkit.GetTitles();
    while (state.KeepRunning())
        toolkit.GetTitles();
}

// ---- libcurl, and a parser

std::string Base64(const unsigned char* bytes, int length)
{
    std::string text(static_cast<size_t>(length) * 2 + 4, '\0');
    text.resize(static_cast<size_t>(EVP_EncodeBlock(reinterpret_cast<unsigned char*>(&text[0]), bytes, length)));
    return text;
}

std::string Token()
{
    unsigned char nonce[20], digest[EVP_MAX_MD_SIZE];
    unsigned int length = 0;
    RAND_bytes(nonce, sizeof nonce);
    char created[32];
    const time_t now = time(nullptr);
    tm parts;
    strftime(created, sizeof created, "%Y-%m-%dT%H:%M:%SZ", gmtime_r(&now, &parts));
    const std::string hashed =
        std::string(reinterpret_cast<char*>(nonce), sizeof nonce) + created + StorefrontAccount::kPassword;
    EVP_Digest(hashed.data(), hashed.size(), digest, &length, EVP_sha1(), nullptr);
    return std::string("<wsse:UsernameToken wsu:Id=\"User\"><wsse:Username>") + StorefrontAccount::kUser +
           "</wsse:Username><wsse:Password Type=\"http://docs.oasis-open.org/wss/2004/01/"
           "oasis-200401-wss-username-token-profile-1.0#PasswordDigest\">" +
           Base64(digest, static_cast<int>(length)) +
           "</wsse:Password><wsse:Nonce EncodingType=\"http://docs.oasis-open.org/wss/2004/01/"
           "oasis-200401-wss-soap-message-security-1.0#Base64Binary\">" +
           Base64(nonce, sizeof nonce) + "</wsse:Nonce><wsu:Created>" + created + "</wsu:Created></wsse:UsernameToken>";
}

std::string Page()
{
    return "<z:GenreID>1</z:GenreID><z:CurrentPageNumber>1</z:CurrentPageNumber><z:ItemsPerPage>" +
           std::to_string(kItems) + "</z:ItemsPerPage><z:PurchaseType>rent</z:PurchaseType>";
}

std::string Envelope(const std::string& endpoint, const std::string& operation, const std::string& children)
{
    return "<s:Envelope xmlns:s=\"http://schemas.xmlsoap.org/soap/envelope/\" "
           "xmlns:a=\"http://schemas.xmlsoap.org/ws/2004/08/addressing\" "
           "xmlns:wsse=\"http://docs.oasis-open.org/wss/2004/01/oasis-200401-wss-wssecurity-secext-1.0.xsd\" "
           "xmlns:wsu=\"http://docs.oasis-open.org/wss/2004/01/oasis-200401-wss-wssecurity-utility-1.0.xsd\" "
           "xmlns:z=\"http://api.zorvane.example/api/\"><s:Header><wsse:Security s:mustUnderstand=\"1\">" +
           Token() + "</wsse:Security><a:MessageID>uuid:" + operation +
           "</a:MessageID><a:ReplyTo s:mustUnderstand=\"1\"><a:Address>" + kAnonymous +
           "</a:Address></a:ReplyTo><a:To s:mustUnderstand=\"1\">" + endpoint +
           "</a:To><a:Action s:mustUnderstand=\"1\">" + kNamespace + operation +
           "</a:Action><z:DeviceSettings s:mustUnderstand=\"1\"><z:APIKey>" + StorefrontAccount::kApiKey +
           "</z:APIKey><z:DestinationUniqueID>bench</z:DestinationUniqueID><z:DestinationTypeID>48"
           "</z:DestinationTypeID></z:DeviceSettings></s:Header><s:Body><z:" +
           operation + ">" + children + "</z:" + operation + "></s:Body></s:Envelope>";
}

unsigned int CountTitles(xmlNodePtr node)
{
    unsigned int count = 0;
    for (; node; node = node->next) {
        if (node->type != XML_ELEMENT_NODE) continue;
        count += strcmp(reinterpret_cast<const char*>(node->name), "TitleID") == 0;
        count += CountTitles(node->children);
    }
    return count;
}

unsigned int CountTitles(const pugi::xml_node& node)
{
    unsigned int count = strcmp(node.name(), "TitleID") == 0;
    for (const pugi::xml_node& child : node)
        count += CountTitles(child);
    return count;
}

unsigned int CountWithXml(std::string& answer)
{
    const xmlDocPtr document =
        xmlReadMemory(answer.data(), static_cast<int>(answer.size()), nullptr, nullptr, XML_PARSE_NONET);
    if (!document) return 0;
    const unsigned int count = CountTitles(xmlDocGetRootElement(document));
    xmlFreeDoc(document);
    return count;
}

unsigned int CountWithPugi(std::string& answer)
{
    pugi::xml_document document;
    return document.load_buffer_inplace(answer.data(), answer.size()) ? CountTitles(document) : 0;
}

// An answer that is not read: what it takes to ask and to be answered.
unsigned int CountOfWhatCame(std::string& answer)
{
    return answer.find("Result>") != std::string::npos ? kItems : 0;
}

class Curl {
public:
    explicit Curl(const std::string& operation = kTitles, const std::string& children = Page())
        : m_Operation(operation),
          m_Children(children),
          m_Endpoint(Endpoint()),
          m_Authorities(Authorities()),
          m_Curl(curl_easy_init())
    {
        m_Headers = curl_slist_append(nullptr, "Content-Type: text/xml; charset=utf-8");
        m_Headers = curl_slist_append(m_Headers, ("SOAPAction: \"" + kNamespace + operation + "\"").c_str());
        curl_easy_setopt(m_Curl, CURLOPT_URL, m_Endpoint.c_str());
        curl_easy_setopt(m_Curl, CURLOPT_CAINFO, m_Authorities.c_str());
        curl_easy_setopt(m_Curl, CURLOPT_HTTPHEADER, m_Headers);
        curl_easy_setopt(m_Curl, CURLOPT_USERAGENT, "bench");
        curl_easy_setopt(m_Curl, CURLOPT_ACCEPT_ENCODING, "gzip");
        curl_easy_setopt(m_Curl, CURLOPT_WRITEFUNCTION, Take);
        curl_easy_setopt(m_Curl, CURLOPT_WRITEDATA, &m_Answer);
    }
    ~Curl()
    {
        curl_slist_free_all(m_Headers);
        curl_easy_cleanup(m_Curl);
    }

    void Get(unsigned int (*count)(std::string& answer))
    {
        const std::string envelope = Envelope(m_Endpoint, m_Operation, m_Children);
        m_Answer.clear();
        curl_easy_setopt(m_Curl, CURLOPT_POSTFIELDS, envelope.data());
        curl_easy_setopt(m_Curl, CURLOPT_POSTFIELDSIZE, static_cast<long>(envelope.size()));
        Check(curl_easy_perform(m_Curl) == CURLE_OK, "libcurl's request");
        Check(count(m_Answer) == kItems, "libcurl's answer");
    }

private:
    static size_t Take(char* bytes, size_t, size_t length, void* answer)
    {
        static_cast<std::string*>(answer)->append(bytes, length);
        return length;
    }

    const std::string m_Operation;
    const std::string m_Children;
    const std::string m_Endpoint;
    const std::string m_Authorities;
    CURL* m_Curl;
    curl_slist* m_Headers;
    std::string m_Answer;
};

void CurlAndParser(benchmark::State& state, unsigned int (*count)(std::string&))
{
    Curl curl;
    curl.Get(count);
    while (state.KeepRunning())
        curl.Get(count);
}

// What the simulator itself takes, and the measuring of it: a page, and as little as an answer can be.
void Simulator(benchmark::State& state, bool page)
{
    Curl curl(page ? kTitles : "getLastCacheLoadTimeUTC", page ? Page() : "");
    curl.Get(CountOfWhatCame);
    while (state.KeepRunning())
        curl.Get(CountOfWhatCame);
}

}  // namespace

BENCHMARK(Library)->Name("warm/library");
BENCHMARK(BareToolkit)->Name("warm/toolkit");
BENCHMARK_CAPTURE(CurlAndParser, xml, CountWithXml)->Name("warm/curl");
BENCHMARK_CAPTURE(CurlAndParser, pugi, CountWithPugi)->Name("warm/curl-pugixml");
BENCHMARK_CAPTURE(Simulator, page, true)->Name("simulator/page");
BENCHMARK_CAPTURE(Simulator, text, false)->Name("simulator/text");
