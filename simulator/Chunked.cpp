#include "Chunked.h"

#include <algorithm>
#include <cstdio>
#include <cstdlib>

namespace simulator {

namespace {

constexpr size_t kLongestLine = 8192;
constexpr size_t kLargestChunk = size_t{1} << 30;

}  // namespace

size_t ChunkReader::Take(const std::string& bytes, std::string& content)
{
    size_t at = 0;
    while (at < bytes.size() && !Done() && !Failed()) {
        if (m_State == State::Content) {
            const size_t count = std::min(m_Left, bytes.size() - at);
            content.append(bytes, at, count);
            at += count;
            m_Left -= count;
            if (m_Left == 0) m_State = State::AfterContent;
            continue;
        }
        m_Line += bytes[at++];
        if (m_Line.size() > kLongestLine) m_State = State::Failed;
        if (m_Line.size() < 2 || m_Line.compare(m_Line.size() - 2, 2, "\r\n") != 0) continue;
        TakeLine(m_Line.substr(0, m_Line.size() - 2));
        m_Line.clear();
    }
    return at;
}

// A chunk's size, with or without extensions; the empty line behind its content; a line of the trailer.
void ChunkReader::TakeLine(const std::string& line)
{
    if (m_State == State::Trailer) {
        if (line.empty()) m_State = State::Done;
        return;
    }
    if (m_State == State::AfterContent) {
        m_State = line.empty() ? State::Size : State::Failed;
        return;
    }
    const size_t digits = std::min(line.find_first_not_of("0123456789abcdefABCDEF"), line.size());
    const size_t after = std::min(line.find_first_not_of(" \t", digits), line.size());
    m_Left = strtoul(line.substr(0, digits).c_str(), nullptr, 16);
    if (digits == 0 || digits > 8 || (after < line.size() && line[after] != ';') || m_Left > kLargestChunk) {
        m_State = State::Failed;
    } else {
        m_State = m_Left ? State::Content : State::Trailer;
    }
}

std::string Chunked(const std::string& content, size_t size)
{
    std::string body;
    for (size_t at = 0; at < content.size(); at += size) {
        const std::string piece = content.substr(at, size);
        char head[24];
        snprintf(head, sizeof head, "%zx\r\n", piece.size());
        body += head + piece + "\r\n";
    }
    return body + "0\r\n\r\n";
}

}  // namespace simulator
