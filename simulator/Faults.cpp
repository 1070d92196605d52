#include "Faults.h"

#include <algorithm>
#include <cstdlib>
#include <sstream>
#include <vector>

#include "Service.h"
#include "SimulatedClock.h"

namespace simulator {

namespace {

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

// Reads "KIND" or "KIND:VALUE"; empty when it may happen to the operation, else what is wrong.
std::string ReadKind(const std::string& operation, unsigned places, const std::string& text, Fault& fault)
{
    const size_t colon = text.find(':');
    const std::string name = text.substr(0, colon);
    if (colon != std::string::npos) fault.value = text.substr(colon + 1);
    for (const KindRow& row : FaultKinds()) {
        if (name == row.name) fault.row = &row;
    }
    if (!fault.row) return "\"" + text + "\" is no kind of fault; --help lists them";
    if ((fault.row->places & places) == 0) return name + " cannot happen to " + operation;
    if (fault.Is(Result::Code) && IsBare(operation)) return "the answer of " + operation + " has no response code";
    if (fault.value.empty()) return "";
    const std::string wanted = fault.row->value;
    if (wanted.empty()) return name + " takes no value";
    int number = 0;
    long long seconds = 0;
    if ((wanted == "N" && !ReadNumber(fault.value, 0, number)) ||
        (wanted == "SECONDS" && !ReadSeconds(fault.value, seconds))) {
        return "\"" + fault.value + "\" is no number";
    }
    const bool isStatus = fault.Is(Content::Status);
    return isStatus && (number < 200 || number > 599) ? "an HTTP status goes from 200 to 599" : "";
}

// One of "after", "delay=MS", "count=N", "retry=SECONDS".
bool ReadCondition(const std::string& text, Fault& fault)
{
    if (text == "after") return fault.afterEffect = true;
    if (text.rfind("delay=", 0) == 0) return ReadNumber(text.substr(6), 0, fault.delay);
    if (text.rfind("retry=", 0) == 0)
        return fault.Is(Content::Status) && ReadNumber(text.substr(6), 0, fault.retryAfter);
    return text.rfind("count=", 0) == 0 && ReadNumber(text.substr(6), 1, fault.count);
}

}  // namespace

std::string Fault::Spelling() const
{
    const std::string name = row ? row->name : "";
    return value.empty() ? name : name + ":" + value;
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
        if (fault.Is(std::monostate())) fault.row = nullptr;
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
            lines += operation + "=" + fault.Spelling() + ",count=" + std::to_string(fault.count) + "\n";
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
    for (const KindRow& row : FaultKinds()) {
        const std::string kind = row.name + std::string(*row.value ? ":" : "") + row.value;
        help += "    " + kind + std::string(18 - std::min<size_t>(17, kind.size()), ' ') + row.help + "\n";
    }
    return help;
}

}  // namespace simulator
