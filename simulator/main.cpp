// zv_storefront: the storefront simulator as a program.
#include <signal.h>
#include <unistd.h>

#include <cstdio>
#include <cstdlib>
#include <cstring>

#include "SimulatedClock.h"
#include "Storefront.h"

using simulator::ReadDateTime;
using simulator::ReadSeconds;

namespace {

const struct {
    const char* name;
    CertificateKind kind;
} kCertificates[] = {{"good", CertificateKind::Good},
                     {"untrusted", CertificateKind::Untrusted},
                     {"expired", CertificateKind::Expired},
                     {"not-yet-valid", CertificateKind::NotYetValid},
                     {"wrong-name", CertificateKind::WrongName},
                     {"wide-wildcard", CertificateKind::WideWildcard},
                     {"name-only", CertificateKind::NameOnly}};

bool ReadNumber(const char* text, int most, int& number)
{
    char* end = nullptr;
    const long value = strtol(text, &end, 10);
    number = static_cast<int>(value);
    return *text && !*end && value >= 0 && value <= most;
}

bool ReadCertificate(const char* text, StorefrontOptions& options)
{
    for (const auto& row : kCertificates) {
        if (strcmp(row.name, text) != 0) continue;
        options.certificate = row.kind;
        return true;
    }
    return false;
}

bool ReadProxyUser(const char* text, StorefrontOptions& options)
{
    const char* colon = strchr(text, ':');
    if (!colon || colon == text) return false;
    options.proxyUser.assign(text, colon);
    options.proxyPassword = colon + 1;
    return true;
}

struct Option {
    const char* name;
    const char* argument;  // null: a switch
    const char* help;
    bool (*read)(const char* text, StorefrontOptions& options);
};

const Option kOptions[] = {
    {"--data", "DIR", "database, certificates, deployment file; kept (default: a temporary folder, removed at the end)",
     [](const char* text, StorefrontOptions& o) { return !(o.dataFolder = text).empty(); }},
    {"--https-port", "N", "port of the SOAP services and discovery (default 0: a free one)",
     [](const char* text, StorefrontOptions& o) { return ReadNumber(text, 65535, o.httpsPort); }},
    {"--http-port", "N", "port of box art, clock, bandwidth file and control (default 0: a free one)",
     [](const char* text, StorefrontOptions& o) { return ReadNumber(text, 65535, o.httpPort); }},
    {"--proxy-port", "N", "also a proxy on that port, 0: a free one (default: none)",
     [](const char* text, StorefrontOptions& o) { return ReadNumber(text, 65535, o.proxyPort); }},
    {"--proxy-user", "USER:PASSWORD", "whom the proxy lets through, by Basic credentials (default: everyone)",
     ReadProxyUser},
    {"--latency", "MS", "wait before every answer",
     [](const char* text, StorefrontOptions& o) { return ReadNumber(text, 600000, o.latency); }},
    {"--environment", "N", "what discovery answers, 0 to 9 (default 2: production)",
     [](const char* text, StorefrontOptions& o) { return ReadNumber(text, 9, o.environment); }},
    {"--largest-page", "N",
     "items that a page holds at most, whatever is asked for (default 0: only the catalogue has one, 200)",
     [](const char* text, StorefrontOptions& o) { return ReadNumber(text, 32767, o.largestPage); }},
    {"--clock", "SECONDS", "pretend a clock that is ahead of the real one by so many, or behind by -SECONDS",
     [](const char* text, StorefrontOptions& o) { return ReadSeconds(text, o.clock); }},
    {"--certificate", "KIND", "good, untrusted, expired, not-yet-valid, wrong-name, wide-wildcard or name-only",
     ReadCertificate},
    {"--valid-from", "TIME", "when the certificate begins to be valid, such as 2026-11-22T06:30:00Z",
     [](const char* text, StorefrontOptions& o) { return ReadDateTime(text, o.certificateDates.from); }},
    {"--valid-until", "TIME", "when it ends to be valid",
     [](const char* text, StorefrontOptions& o) { return ReadDateTime(text, o.certificateDates.until); }},
    {"--old-tls", nullptr, "TLS 1.1 at most", [](const char*, StorefrontOptions& o) { return o.oldTls = true; }},
    {"--no-gzip", nullptr, "never compress answers",
     [](const char*, StorefrontOptions& o) { return !(o.gzip = false); }},
    {"--remember", "N",
     "requests that are remembered, the last ones: in the log, and that their nonces do not come again (default 50000)",
     [](const char* text, StorefrontOptions& o) {
         return ReadNumber(text, 100000000, o.remembered) && o.remembered > 0;
     }},
    {"--fault", "SPEC", "a fault, see below; may be given again",
     [](const char* text, StorefrontOptions& o) { return o.faults.emplace_back(text), true; }},
};

void PrintHelp()
{
    printf("zv_storefront: the storefront's services on this machine.\n\nOptions:\n");
    for (const Option& option : kOptions) {
        printf("  %-14s %-14s %s\n", option.name, option.argument ? option.argument : "", option.help);
    }
    printf("  %-14s %-14s %s\n\n", "--help", "", "this text");
    printf(
        "Account: user \"%s\", password \"%s\", API key \"%s\", adult PIN %s, activation PIN %s (000000 locks out), "
        "gift\n"
        "codes GIFT1 to GIFT5. Products 9001 to 9022 refuse to be bought with response code 1 to 22, 9101 to 9122 to "
        "be taxed.\n"
        "Activation PIN %s signs in a second customer on the same player: a request is answered for the customer whom "
        "its\n"
        "token was given out to. Without a token, or with one that was never given out or was withdrawn when its "
        "device was\n"
        "deactivated, it is answered for the first. How the token stands is in the log, the token is not.\n\n",
        StorefrontAccount::kUser, StorefrontAccount::kPassword, StorefrontAccount::kApiKey,
        StorefrontAccount::kAdultPin, StorefrontAccount::kActivationPin, StorefrontAccount::kSecondActivationPin);
    printf(
        "The proxy tunnels (CONNECT) to every host and port, and takes plain requests with their whole address. It "
        "finds\n"
        "the services under the client's own names for them: \"behind-proxy.conf\" in the data folder is a deployment "
        "that\n"
        "works through it alone. Its requests are in the log with their method, target and how their credentials "
        "stand;\n"
        "every other request with the proxy's connection that it came through, 0 when it came directly.\n\n");
    printf("%s\n", Storefront::HelpOnFaults().c_str());
    printf(
        "Contract, on the HTTPS port: GET /api/NAME.asmx?wsdl (RealTimeBrowse, DownloadAPI, StreamAPI), and the "
        "schemas it\n"
        "imports beside it. docs/contract.md tells the rest.\n\n"
        "Control, on the plain HTTP port: POST /control/faults (a fault a line), GET and DELETE /control/faults,\n"
        "GET /control/log (a JSON object a line), DELETE /control/log, GET and POST /control/clock (seconds, as with\n"
        "--clock), POST /control/idle: what to do now to each kept connection that waits for its next request, "
        "\"close\",\n"
        "\"reset\", \"silence\" (answer nothing more), \"ticket\" (a late TLS session ticket) or \"write\", with the "
        "bytes on\n"
        "the next lines (an answer of 408); it says how many these were. Date, the clock service and how fresh a token "
        "is\n"
        "follow the clock; certificates do not.\n\n"
        "Every spelling of a request that the standards allow is taken: chunks, prefixes of any name, white space "
        "around\n"
        "numbers, times with fractions and zones, a charset in any case or none, a wsu:Timestamp, 100-continue, an "
        "xsi:type\n"
        "that is right. Stricter than the standards on purpose, since players send it so:\n"
        "  - POST with a user agent, in UTF-8, SOAPAction in quotes; Host is one of the simulator's with its port;\n"
        "  - the envelope holds a Header and a Body and nothing else; these three have no attribute but "
        "xsi:schemaLocation;\n"
        "  - the header blocks are those six, in their order, each with its mustUnderstand, for no other actor;\n"
        "  - wsa:MessageID is \"uuid:\" and the operation; wsa:ReplyTo is the anonymous role and nothing beside it;\n"
        "  - the token's wsu:Id is \"User\", with name, digest, nonce and time in this order;\n"
        "  - a time has a zone; the token's and the wsu:Timestamp's Created lie at most 300 s off the simulator's "
        "clock;\n"
        "  - children stand in the contract's order; an xsi:type names the contract's own type, none derived from it.\n"
        "Box art is there for the titles of the catalogue in the sizes of the store, and 404 elsewhere.\n\n"
        "Not checked: which device asks (any DestinationUniqueID and type will do), whether it is activated before it "
        "buys,\n"
        "which device a token was given to, the user agent's text, unused namespace declarations, and anything behind\n"
        "the addresses of streams and licences. Header blocks that the client has no use for (RelatesTo, From, "
        "FaultTo) are\n"
        "refused, and so are the operations that it never calls.\n");
}

// 0 to go on, else the exit code (-1: help was printed).
int ReadArguments(int argc, char** argv, StorefrontOptions& options)
{
    for (int i = 1; i < argc; ++i) {
        if (strcmp(argv[i], "--help") == 0) {
            PrintHelp();
            return -1;
        }
        const Option* option = nullptr;
        for (const Option& row : kOptions) {
            if (strcmp(row.name, argv[i]) == 0) option = &row;
        }
        if (!option) {
            fprintf(stderr, "zv_storefront: unknown option %s; --help lists them\n", argv[i]);
            return 2;
        }
        const char* text = option->argument ? argv[++i] : "";
        if (!text || !option->read(text, options)) {
            fprintf(stderr, "zv_storefront: %s needs %s: %s\n", option->name, option->argument, option->help);
            return 2;
        }
    }
    return 0;
}

}  // namespace

int main(int argc, char** argv)
{
    StorefrontOptions options;
    if (const int code = ReadArguments(argc, argv, options)) return code < 0 ? 0 : code;
    // Blocked before any thread starts, so that every thread leaves them to sigwait below.
    sigset_t ends;
    sigemptyset(&ends);
    sigaddset(&ends, SIGTERM);
    sigaddset(&ends, SIGINT);
    pthread_sigmask(SIG_BLOCK, &ends, nullptr);

    std::string error;
    const std::unique_ptr<Storefront> storefront = Storefront::Start(options, error);
    if (!storefront) {
        fprintf(stderr, "zv_storefront: %s\n", error.c_str());
        return 1;
    }
    printf("https port %d\nhttp port %d\ndeployment file %s\n", storefront->HttpsPort(), storefront->HttpPort(),
           storefront->DeploymentFile().c_str());
    if (storefront->ProxyPort() >= 0) {
        printf("proxy port %d\nproxy deployment file %s\n", storefront->ProxyPort(),
               storefront->ProxyDeploymentFile().c_str());
    }
    printf("ready\n");
    fflush(stdout);
    int received;
    sigwait(&ends, &received);
    return 0;
}
