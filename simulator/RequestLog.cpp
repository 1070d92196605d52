#include "RequestLog.h"

#include <algorithm>
#include <cstdio>

namespace simulator {

namespace {

// What a client may send is larger than what is worth to be kept.
constexpr size_t kLongestText = 4096;
constexpr size_t kMostPairs = 100;

void Cut(std::string& text)
{
    if (text.size() <= kLongestText) return;
    size_t end = kLongestText;
    while (end > 0 && (static_cast<unsigned char>(text[end]) & 0xC0) == 0x80)
        --end;
    text.resize(end);
    text.shrink_to_fit();
}

void Cut(LoggedRequest& request)
{
    for (std::string* text : {&request.operation, &request.method, &request.target, &request.violation})
        Cut(*text);
    for (auto* pairs : {&request.headers, &request.soap, &request.children}) {
        pairs->resize(std::min(pairs->size(), kMostPairs));
        pairs->shrink_to_fit();
        for (auto& [name, value] : *pairs) {
            Cut(name);
            Cut(value);
        }
    }
}

std::string Quoted(const std::string& text)
{
    std::string quoted = "\"";
    for (const unsigned char c : text) {
        if (c == '"' || c == '\\') {
            quoted += '\\';
            quoted += static_cast<char>(c);
        } else if (c < 0x20) {
            char escape[8];
            snprintf(escape, sizeof escape, "\\u%04x", c);
            quoted += escape;
        } else {
            quoted += static_cast<char>(c);
        }
    }
    return quoted + "\"";
}

std::string Pairs(const std::vector<std::pair<std::string, std::string>>& pairs)
{
    std::string text = "[";
    for (const auto& pair : pairs) {
        text += (text.size() > 1 ? ", [" : "[") + Quoted(pair.first) + ", " + Quoted(pair.second) + "]";
    }
    return text + "]";
}

std::string Line(const LoggedRequest& request)
{
    char numbers[160];
    snprintf(numbers, sizeof numbers, "\"connection\": %lu, \"tls\": %s, \"resumed\": %s, \"time\": %.3f",
             request.connection, request.tls ? "true" : "false", request.resumed ? "true" : "false", request.time);
    return "{\"number\": " + std::to_string(request.number) + ", \"service\": " + Quoted(request.service) +
           ", \"operation\": " + Quoted(request.operation) + ", \"method\": " + Quoted(request.method) +
           ", \"target\": " + Quoted(request.target) + ", " + numbers +
           ", \"proxy\": " + std::to_string(request.proxy) + ", \"credentials\": " + Quoted(request.credentials) +
           ", \"headers\": " + Pairs(request.headers) + ", \"soap\": " + Pairs(request.soap) +
           ", \"children\": " + Pairs(request.children) + ", \"fault\": " + Quoted(request.fault) +
           ", \"violation\": " + Quoted(request.violation) + "}\n";
}

}  // namespace

void RequestLog::Add(LoggedRequest request)
{
    Cut(request);
    const std::lock_guard<std::mutex> lock(m_Mutex);
    request.number = ++m_Count;
    m_Requests.push_back(std::move(request));
    if (m_Requests.size() > m_Most) m_Requests.pop_front();
    m_Changed.notify_all();
}

std::vector<LoggedRequest> RequestLog::All() const
{
    const std::lock_guard<std::mutex> lock(m_Mutex);
    return {m_Requests.begin(), m_Requests.end()};
}

void RequestLog::Clear()
{
    const std::lock_guard<std::mutex> lock(m_Mutex);
    m_Requests.clear();
    m_Cleared = m_Count;
}

bool RequestLog::WaitFor(size_t count) const
{
    std::unique_lock<std::mutex> lock(m_Mutex);
    m_Changed.wait(lock, [&] { return m_Ended || m_Count - m_Cleared >= count; });
    return m_Count - m_Cleared >= count;
}

void RequestLog::End()
{
    const std::lock_guard<std::mutex> lock(m_Mutex);
    m_Ended = true;
    m_Changed.notify_all();
}

std::string RequestLog::Json() const
{
    std::string text;
    for (const LoggedRequest& request : All())
        text += Line(request);
    return text;
}

}  // namespace simulator
