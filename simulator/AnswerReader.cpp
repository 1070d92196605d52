#include "AnswerReader.h"

#include <strings.h>

#include <algorithm>
#include <cstdlib>

namespace simulator {

void AnswerReader::Take(const std::string& bytes)
{
    m_Bytes += bytes;
    while (!m_HeadDone) {
        if (!TakeHead()) return;
    }
    TakeBody();
}

// False when it has not come yet. What is no head is the body of an answer that the connection's end ends.
bool AnswerReader::TakeHead()
{
    constexpr size_t kLargest = 1 << 20;
    const size_t end = m_Bytes.find("\r\n\r\n");
    if (end == std::string::npos && m_Bytes.size() < kLargest) return false;
    std::string first;
    Headers headers;
    m_Response = HttpResponse();
    if (end == std::string::npos || !ReadHead(m_Bytes.substr(0, end), first, headers) || first.rfind("HTTP/", 0) != 0) {
        return m_HeadDone = true;
    }
    m_Bytes.erase(0, end + 4);
    m_Response.status = atoi(first.substr(std::min(first.find(' '), first.size())).c_str());
    if (m_Response.status / 100 == 1) return true;
    m_HeadDone = true;
    m_KeepAlive = first.rfind("HTTP/1.1", 0) == 0;
    m_Response.contentType.clear();
    for (const auto& [name, value] : headers) {
        if (name == "content-length") {
            m_End = BodyEnd::Length;
            m_Left = strtoul(value.c_str(), nullptr, 10);
        } else if (name == "connection") {
            m_KeepAlive = strcasecmp(value.c_str(), "close") != 0;
        } else if (name == "content-type") {
            m_Response.contentType = value;
        } else if (name != "transfer-encoding" && name != "server" && name != "date") {
            m_Response.headers.emplace_back(name, value);
        }
    }
    if (strcasecmp(HeaderOf(headers, "transfer-encoding").c_str(), "chunked") == 0) m_End = BodyEnd::Chunks;
    if (m_Bodiless || m_Response.status == 204 || m_Response.status == 304) {
        m_End = BodyEnd::Length;
        m_Left = 0;
    }
    return true;
}

void AnswerReader::TakeBody()
{
    if (m_Done) return;
    if (m_End == BodyEnd::Chunks) {
        m_Chunks.Take(m_Bytes, m_Response.body);
        m_Done = m_Chunks.Done();
        if (m_Chunks.Failed()) m_End = BodyEnd::Connection;
    } else if (m_End == BodyEnd::Length) {
        const size_t count = std::min(m_Left, m_Bytes.size());
        m_Response.body.append(m_Bytes, 0, count);
        m_Left -= count;
        m_Done = m_Left == 0;
    } else {
        m_Response.body += m_Bytes;
    }
    m_Bytes.clear();
}

}  // namespace simulator
