#include "Faults.h"

#include <algorithm>
#include <cstdlib>
#include <sstream>
#include <vector>

namespace {

const struct {
    const char* kind;
    const char* help;
} kKinds[] = {
    {"ok", "no fault: the request passes (to let some requests through first)"},
    {"code:N", "the service refuses with response code N"},
    {"fault11", "a SOAP 1.1 fault"},
    {"fault12", "a SOAP 1.2 fault"},
    {"soap12", "the right answer in a SOAP 1.2 envelope"},
    {"http:N", "HTTP status N (302 with a Location)"},
    {"cut", "the connection is closed before the answer"},
    {"cut-header", "closed in the middle of the HTTP header"},
    {"cut-body", "closed in the middle of the body"},
    {"reset", "the connection is reset"},
    {"stall", "no answer, as long as the client waits"},
    {"stall-body", "half of the body, and then nothing"},
    {"drip:N", "the answer in single bytes, N milliseconds (100) apart"},
    {"split:N", "header and body in two writes, N milliseconds (50) apart"},
    {"garbage", "200, and a body that is no XML"},
    {"short", "less body than its length announces"},
    {"long", "bytes left over behind the announced length"},
    {"no-length", "no Content-Length"},
    {"zero-length", "Content-Length 0"},
    {"empty", "200 with an empty body"},
    {"endless", "a body that never ends"},
    {"bomb", "a compressed body of N MiB (256) of blanks"},
    {"damaged-gzip", "a compressed body with wrong bytes in it"},
    {"missing-result", "an answer without its result element"},
    {"must-understand", "an unknown header block that must be understood"},
    {"extra-header", "an unknown header block that need not be"},
    {"unknown-enum", "an enumeration text that no contract knows (in answers that hold one)"},
    {"not-modified", "304, for box art"},
    {"modified", "box art that is newer than the client's"},
    {"body:TEXT", "another body, for the clock"},
    {"close", "list \"connect\" only: closed before the TLS handshake"},
};

std::string Name(const std::string& kind)
{
    return kind.substr(0, kind.find(':'));
}

}  // namespace

int Fault::Number(int standard) const
{
    return value.empty() ? standard : atoi(value.c_str());
}

bool Faults::Add(const std::string& text, std::string& error)
{
    const size_t equals = text.find('=');
    error = "\"" + text + "\" is no fault: OPERATION=KIND[:VALUE][,delay=MS][,count=N][,after] expected";
    if (equals == std::string::npos || equals == 0) return false;
    std::vector<std::string> parts;
    std::istringstream rest(text.substr(equals + 1));
    for (std::string part; std::getline(rest, part, ',');)
        parts.push_back(part);
    if (parts.empty()) return false;
    Fault fault;
    fault.kind = Name(parts[0]);
    if (fault.kind.size() < parts[0].size()) fault.value = parts[0].substr(fault.kind.size() + 1);
    const bool known = std::any_of(std::begin(kKinds), std::end(kKinds),
                                   [&](const auto& row) { return Name(row.kind) == fault.kind; });
    if (!known) {
        error = "\"" + parts[0] + "\" is no kind of fault; --help lists them";
        return false;
    }
    for (size_t i = 1; i < parts.size(); ++i) {
        if (parts[i] == "after") {
            fault.afterEffect = true;
        } else if (parts[i].rfind("delay=", 0) == 0) {
            fault.delay = atoi(parts[i].c_str() + 6);
        } else if (parts[i].rfind("count=", 0) == 0) {
            fault.count = atoi(parts[i].c_str() + 6);
        } else {
            return false;
        }
    }
    const std::lock_guard<std::mutex> lock(m_Mutex);
    m_Lists[text.substr(0, equals)].push_back(fault);
    return true;
}

Fault Faults::Take(const std::string& operation)
{
    const std::lock_guard<std::mutex> lock(m_Mutex);
    for (const std::string& name : {operation, std::string("any")}) {
        if (name == "any" && operation == "connect") break;
        auto& list = m_Lists[name];
        if (list.empty()) continue;
        Fault fault = list.front();
        if (--list.front().count <= 0) list.pop_front();
        if (fault.Is("ok")) fault.kind.clear();
        return fault;
    }
    return Fault();
}

void Faults::Clear()
{
    const std::lock_guard<std::mutex> lock(m_Mutex);
    m_Lists.clear();
}

std::string Faults::Help()
{
    std::string help =
        "Faults: OPERATION=KIND[:VALUE][,delay=MS][,count=N][,after]\n"
        "  OPERATION is a SOAP operation (getTitleListing), discovery, clock, bandwidth, boxart, connect (before a "
        "TLS\n"
        "  handshake) or any. Each request takes the first fault of its list; count=N serves N requests. A fault "
        "suppresses\n"
        "  what it claims has failed, unless \"after\" is given: then it is done and only the answer lies.\n"
        "  Kinds:\n";
    for (const auto& row : kKinds) {
        help += std::string("    ") + row.kind +
                std::string(18 - std::min<size_t>(17, std::string(row.kind).size()), ' ') + row.help + "\n";
    }
    return help;
}
