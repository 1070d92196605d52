#include "Faults.h"

#include <algorithm>
#include <cstdlib>
#include <sstream>
#include <vector>

#include "Service.h"
#include "SimulatedClock.h"

namespace simulator {

namespace {

// Where a kind makes sense.
enum Place : unsigned { kSoap = 1, kPlain = 2, kBoxArt = 4, kConnect = 8, kProxy = 16 };
constexpr unsigned kAnswers = kSoap | kPlain | kBoxArt;
constexpr unsigned kAll = kAnswers | kConnect | kProxy;

// Whether what the request asks for is done with such an answer.
enum Effect { kDone, kUndone };

const struct KindRow {
    const char* kind;  // ":N" behind it takes a number, ":SECONDS" one with a sign, ":TEXT" any text
    unsigned places;
    Effect effect;
    const char* help;
} kKinds[] = {
    {"ok", kAll, kDone, "no fault: the request passes (to let some requests through first)"},
    {"code:N", kSoap, kUndone, "the service refuses with response code N (answers that have one)"},
    {"fault11", kSoap, kUndone, "a SOAP 1.1 fault"},
    {"fault12", kSoap, kUndone, "a SOAP 1.2 fault"},
    {"soap12", kSoap, kDone, "the right answer in a SOAP 1.2 envelope"},
    {"http:N", kAnswers | kProxy, kUndone, "HTTP status N (302 with a Location; retry=SECONDS adds a Retry-After)"},
    {"cut", kAnswers | kProxy, kUndone, "the connection is closed before the answer"},
    {"cut-header", kAnswers | kProxy, kUndone, "closed in the middle of the HTTP header"},
    {"cut-body", kAnswers, kUndone, "closed in the middle of the body"},
    {"reset", kAll, kUndone, "the connection is reset"},
    {"stall", kAll, kUndone, "no answer (connect: no handshake), as long as the client waits"},
    {"stall-header", kAnswers | kProxy, kUndone, "half of the HTTP header, and then nothing"},
    {"stall-body", kAnswers, kDone, "half of the body, and then nothing"},
    {"stall-handshake", kConnect, kUndone, "the beginning of a handshake record, and then nothing"},
    {"drip:N", kAnswers | kProxy, kDone, "the answer in single bytes, N milliseconds (100) apart"},
    {"hold", kAnswers | kProxy, kDone, "the right answer, made now and kept back until the faults are cleared"},
    {"split:N", kAnswers, kDone, "header and body in two writes, N milliseconds (50) apart"},
    {"garbage", kAnswers | kProxy, kUndone, "200, and a body that is no XML"},
    {"no-http", kAll, kUndone, "bytes that are no HTTP (connect: no TLS)"},
    {"short", kAnswers, kUndone, "less body than its length announces"},
    {"long", kAnswers | kProxy, kDone, "bytes left over behind the announced length"},
    {"stray", kAnswers, kDone, "a whole answer of 408 behind the right one, which nobody has asked for"},
    {"no-length", kAnswers, kUndone, "no Content-Length"},
    {"zero-length", kAnswers | kProxy, kUndone, "Content-Length 0"},
    {"chunked:N", kAnswers | kProxy, kDone, "in chunks of N (1000) bytes"},
    {"connection-close", kAnswers | kProxy, kDone, "closed behind the answer, which says so"},
    {"http10", kAnswers | kProxy, kDone, "an answer of HTTP/1.0, which the connection's end ends"},
    {"continue", kAnswers | kProxy, kDone, "a 100 Continue before the answer"},
    {"empty", kAnswers, kUndone, "200 with an empty body"},
    {"endless", kAnswers | kProxy, kUndone, "a body that never ends"},
    {"endless-header", kAnswers | kProxy, kUndone, "header lines that never end"},
    {"headers:N", kAnswers | kProxy, kDone, "N KiB (64) of further header lines"},
    {"date:SECONDS", kAnswers | kProxy, kDone, "a Date that is SECONDS (3600) ahead of the clock"},
    {"bad-date", kAnswers | kProxy, kDone, "a Date that is none"},
    {"no-date", kAnswers | kProxy, kDone, "no Date"},
    {"age:N", kAnswers | kProxy, kDone, "an Age of N seconds (60), as of an answer that was kept somewhere"},
    {"bomb:N", kAnswers, kUndone, "a compressed body of N MiB (256) of blanks"},
    {"damaged-gzip", kAnswers, kUndone, "a compressed body with wrong bytes in it"},
    {"wrong-checksum", kAnswers, kUndone, "a compressed body whose checksum is wrong"},
    {"missing-result", kSoap, kUndone, "an answer without its result element"},
    {"must-understand", kSoap, kDone, "an unknown header block that must be understood"},
    {"extra-header", kSoap, kDone, "an unknown header block that need not be"},
    {"unknown-enum", kSoap, kDone, "an enumeration text that no contract knows (in answers that hold one)"},
    {"prefixes", kSoap, kDone, "other prefixes, and comments, white space and quotes where XML has a choice"},
    {"nil", kSoap, kDone, "children that are left out else, with xsi:nil"},
    {"absent-arrays", kSoap, kDone, "empty arrays left out"},
    {"latin1", kSoap, kDone, "in ISO-8859-1"},
    {"bom", kSoap, kDone, "with a byte order mark"},
    {"xsi-types", kSoap, kDone, "each element with its xsi:type"},
    {"cdata", kSoap, kDone, "texts in CDATA sections"},
    {"text", kSoap, kDone, "text between the children of records"},
    {"boolean:TEXT", kSoap, kDone, "TEXT in each boolean, as it stands in XML (1 and 0 for true and false)"},
    {"enum:TEXT", kSoap, kDone, "TEXT (NEW_TEXT) in each enumeration, elements and attributes"},
    {"counter:N", kSoap, kDone, "N (40000) as TotalItems"},
    {"not-modified", kBoxArt, kDone, "304"},
    {"modified", kBoxArt, kDone, "box art that is newer than the client's"},
    {"body:TEXT", kPlain, kUndone, "another body"},
    {"close", kConnect, kUndone, "closed before the TLS handshake"},
    {"cut-tunnel:N", kProxy, kDone, "closed when N bytes (0) have come back through the proxy"},
    {"stall-tunnel:N", kProxy, kDone, "nothing more passes when N bytes (0) have come back"},
};

std::string Name(const std::string& kind)
{
    return kind.substr(0, kind.find(':'));
}

const KindRow* FindKind(const std::string& kind)
{
    const KindRow* row = std::find_if(std::begin(kKinds), std::end(kKinds),
                                      [&](const KindRow& known) { return Name(known.kind) == kind; });
    return row == std::end(kKinds) ? nullptr : row;
}

// Where the faults of a list go; 0 when there is no such list.
unsigned PlacesOf(const std::string& operation)
{
    if (operation == "any") return kAnswers;
    if (operation == "connect") return kConnect;
    if (operation == "proxy") return kProxy;
    if (operation == "boxart") return kBoxArt;
    if (operation == "discovery" || operation == "clock" || operation == "bandwidth") return kPlain;
    for (const ServiceRow& service : Services()) {
        if (FindOperation(service, operation)) return kSoap;
    }
    return 0;
}

bool IsBare(const std::string& operation)
{
    for (const ServiceRow& service : Services()) {
        const OperationRow* row = FindOperation(service, operation);
        if (row) return row->bare;
    }
    return false;
}

// A decimal number of at most an hour's milliseconds.
bool ReadNumber(const std::string& text, int least, int& number)
{
    constexpr int kMost = 3600000;
    if (text.empty() || text.size() > 7 || text.find_first_not_of("0123456789") != std::string::npos) return false;
    number = atoi(text.c_str());
    return number >= least && number <= kMost;
}

std::string ReadKind(const std::string& operation, unsigned places, const std::string& text, Fault& fault)
{
    fault.kind = Name(text);
    if (fault.kind.size() < text.size()) fault.value = text.substr(fault.kind.size() + 1);
    const KindRow* row = FindKind(fault.kind);
    if (!row) return "\"" + text + "\" is no kind of fault; --help lists them";
    if ((row->places & places) == 0) return fault.kind + " cannot happen to " + operation;
    const std::string shape = row->kind;
    int number = 0;
    if (shape == fault.kind && !fault.value.empty()) return fault.kind + " takes no value";
    const std::string wanted = shape.substr(std::min(Name(shape).size() + 1, shape.size()));
    long long seconds = 0;
    if (!fault.value.empty() && ((wanted == "N" && !ReadNumber(fault.value, 0, number)) ||
                                 (wanted == "SECONDS" && !ReadSeconds(fault.value, seconds)))) {
        return "\"" + fault.value + "\" is no number";
    }
    if (fault.kind == "http" && !fault.value.empty() && (number < 200 || number > 599)) {
        return "an HTTP status goes from 200 to 599";
    }
    if (fault.kind == "code" && IsBare(operation)) return "the answer of " + operation + " has no response code";
    return "";
}

// One of "after", "delay=MS", "count=N", "retry=SECONDS".
bool ReadCondition(const std::string& text, Fault& fault)
{
    if (text == "after") return fault.afterEffect = true;
    if (text.rfind("delay=", 0) == 0) return ReadNumber(text.substr(6), 0, fault.delay);
    if (text.rfind("retry=", 0) == 0) return fault.Is("http") && ReadNumber(text.substr(6), 0, fault.retryAfter);
    return text.rfind("count=", 0) == 0 && ReadNumber(text.substr(6), 1, fault.count);
}

}  // namespace

bool Fault::ClaimsFailure() const
{
    const KindRow* row = FindKind(kind);
    return row && row->effect == kUndone && !afterEffect;
}

int Fault::Number(int standard) const
{
    return value.empty() ? standard : atoi(value.c_str());
}

long long Fault::Seconds(long long standard) const
{
    return value.empty() ? standard : atoll(value.c_str());
}

bool Faults::Add(const std::string& text, std::string& error)
{
    const size_t equals = text.find('=');
    const std::string operation = text.substr(0, equals);
    const unsigned places = PlacesOf(operation);
    std::vector<std::string> parts;
    std::istringstream rest(equals == std::string::npos ? std::string() : text.substr(equals + 1));
    for (std::string part; std::getline(rest, part, ',');)
        parts.push_back(part);
    error =
        "\"" + text + "\" is no fault: OPERATION=KIND[:VALUE][,delay=MS][,count=N][,retry=SECONDS][,after] expected";
    if (parts.empty()) return false;
    if (places == 0) {
        error = "\"" + text + "\": there is no operation " + operation + "; --help names what is none of a service's";
        return false;
    }
    Fault fault;
    const std::string wrong = ReadKind(operation, places, parts[0], fault);
    if (!wrong.empty()) {
        error = "\"" + text + "\": " + wrong;
        return false;
    }
    for (size_t i = 1; i < parts.size(); ++i) {
        if (!ReadCondition(parts[i], fault)) return false;
    }
    const std::lock_guard<std::mutex> lock(m_Mutex);
    m_Lists[operation].push_back(fault);
    return true;
}

Fault Faults::Take(const std::string& operation)
{
    const std::lock_guard<std::mutex> lock(m_Mutex);
    for (const std::string& name : {operation, std::string("any")}) {
        if (name == "any" && (operation == "connect" || operation == "proxy")) break;
        auto& list = m_Lists[name];
        if (list.empty()) continue;
        Fault fault = list.front();
        if (--list.front().count <= 0) list.pop_front();
        if (fault.Is("ok")) fault.kind.clear();
        fault.clears = m_Clears;
        return fault;
    }
    return Fault();
}

void Faults::Clear()
{
    const std::lock_guard<std::mutex> lock(m_Mutex);
    m_Lists.clear();
    ++m_Clears;
    m_Changed.notify_all();
}

bool Faults::WaitForClear(const Fault& fault)
{
    std::unique_lock<std::mutex> lock(m_Mutex);
    m_Changed.wait(lock, [&] { return m_Ended || m_Clears != fault.clears; });
    return !m_Ended;
}

void Faults::End()
{
    const std::lock_guard<std::mutex> lock(m_Mutex);
    m_Ended = true;
    m_Changed.notify_all();
}

std::string Faults::Pending() const
{
    const std::lock_guard<std::mutex> lock(m_Mutex);
    std::string lines;
    for (const auto& [operation, list] : m_Lists) {
        for (const Fault& fault : list)
            lines += operation + "=" + fault.Text() + ",count=" + std::to_string(fault.count) + "\n";
    }
    return lines;
}

std::string Faults::Help()
{
    std::string help =
        "Faults: OPERATION=KIND[:VALUE][,delay=MS][,count=N][,retry=SECONDS][,after]\n"
        "  OPERATION is a SOAP operation (getTitleListing), discovery, clock, bandwidth, boxart, any (of these), "
        "connect\n"
        "  (before a TLS handshake) or proxy (a request to the proxy). Each request takes the first fault of its "
        "list;\n"
        "  count=N serves N requests. A fault suppresses what it claims has failed, unless \"after\" is given: then it "
        "is\n"
        "  done and only the answer lies. With http, retry=SECONDS adds a Retry-After.\n"
        "  Kinds:\n";
    for (const auto& row : kKinds) {
        help += std::string("    ") + row.kind +
                std::string(18 - std::min<size_t>(17, std::string(row.kind).size()), ' ') + row.help + "\n";
    }
    return help;
}

}  // namespace simulator
