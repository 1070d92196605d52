#include "Http.h"

#include <zlib.h>

#include <algorithm>
#include <cstdlib>

#include "Channel.h"
#include "Chunked.h"

namespace simulator {

namespace {

constexpr size_t kLargestRequest = 1 << 20;

const char* Reason(int status)
{
    switch (status) {
        case 100:
            return "Continue";
        case 200:
            return "OK";
        case 302:
            return "Found";
        case 304:
            return "Not Modified";
        case 400:
            return "Bad Request";
        case 403:
            return "Forbidden";
        case 404:
            return "Not Found";
        case 407:
            return "Proxy Authentication Required";
        case 500:
            return "Internal Server Error";
        case 502:
            return "Bad Gateway";
        case 503:
            return "Service Unavailable";
        default:
            return "Status";
    }
}

bool ReadMore(Channel& channel, std::string& text)
{
    char piece[8192];
    const size_t count = channel.Read(piece, sizeof piece);
    text.append(piece, count);
    return count > 0 && text.size() <= kLargestRequest;
}

bool ReadFirstLine(const std::string& line, HttpRequest& request)
{
    const std::vector<std::string> words = Split(line, ' ');
    if (words.size() != 3 || (words[2] != "HTTP/1.1" && words[2] != "HTTP/1.0")) return false;
    request.method = words[0];
    request.target = words[1];
    request.version = words[2];
    return true;
}

bool ReadChunkedBody(Channel& channel, std::string& rest, std::string& body)
{
    ChunkReader chunks;
    for (;;) {
        rest.erase(0, chunks.Take(rest, body));
        if (chunks.Done()) return true;
        if (chunks.Failed() || body.size() > kLargestRequest || !ReadMore(channel, rest)) return false;
    }
}

bool ReadBody(Channel& channel, std::string& rest, HttpRequest& request)
{
    const std::string coding = request.Header("transfer-encoding");
    const std::string length = request.Header("content-length");
    if (coding.empty() && length.empty()) return true;
    const bool expects = Lower(request.Header("expect")) == "100-continue" && request.version == "HTTP/1.1";
    if (expects && rest.empty() && !channel.Write("HTTP/1.1 100 Continue\r\n\r\n")) return false;
    if (!coding.empty()) return Lower(coding) == "chunked" && ReadChunkedBody(channel, rest, request.body);
    const size_t size = strtoul(length.c_str(), nullptr, 10);
    if (length.find_first_not_of("0123456789") != std::string::npos || size > kLargestRequest) return false;
    while (rest.size() < size) {
        if (!ReadMore(channel, rest)) return false;
    }
    request.body = rest.substr(0, size);
    rest.erase(0, size);
    return true;
}

class Deflater {
public:
    Deflater() { deflateInit2(&m_Stream, Z_DEFAULT_COMPRESSION, Z_DEFLATED, 15 + 16, 8, Z_DEFAULT_STRATEGY); }
    ~Deflater() { deflateEnd(&m_Stream); }
    Deflater(const Deflater&) = delete;
    Deflater& operator=(const Deflater&) = delete;

    std::string Pack(const std::string& text)
    {
        deflateReset(&m_Stream);
        std::string packed(deflateBound(&m_Stream, text.size()), '\0');
        m_Stream.next_in = reinterpret_cast<Bytef*>(const_cast<char*>(text.data()));
        m_Stream.avail_in = static_cast<uInt>(text.size());
        m_Stream.next_out = reinterpret_cast<Bytef*>(&packed[0]);
        m_Stream.avail_out = static_cast<uInt>(packed.size());
        deflate(&m_Stream, Z_FINISH);
        packed.resize(m_Stream.total_out);
        return packed;
    }

private:
    z_stream m_Stream = {};
};

}  // namespace

std::string Lower(std::string text)
{
    std::transform(text.begin(), text.end(), text.begin(), [](unsigned char c) { return tolower(c); });
    return text;
}

std::string Trimmed(const std::string& text)
{
    const char* const blanks = " \t\r\n";
    const size_t first = text.find_first_not_of(blanks);
    return first == std::string::npos ? "" : text.substr(first, text.find_last_not_of(blanks) - first + 1);
}

std::vector<std::string> Split(const std::string& text, char separator)
{
    std::vector<std::string> parts;
    for (size_t start = 0; start <= text.size();) {
        const size_t end = std::min(text.find(separator, start), text.size());
        parts.push_back(Trimmed(text.substr(start, end - start)));
        start = end + 1;
    }
    return parts;
}

std::string HeaderOf(const Headers& headers, const std::string& name)
{
    for (const auto& header : headers) {
        if (header.first == name) return header.second;
    }
    return std::string();
}

bool ReadHead(const std::string& head, std::string& first, Headers& headers)
{
    size_t end = head.find("\r\n");
    first = head.substr(0, end);
    while (end != std::string::npos && end + 2 < head.size()) {
        const size_t start = end + 2;
        end = head.find("\r\n", start);
        const std::string line = head.substr(start, end == std::string::npos ? end : end - start);
        const size_t colon = line.find(':');
        if (colon == std::string::npos) return false;
        headers.emplace_back(Lower(line.substr(0, colon)), Trimmed(line.substr(colon + 1)));
    }
    return true;
}

std::string HttpRequest::Local() const
{
    for (const std::string scheme : {"http://", "https://"}) {
        if (target.compare(0, scheme.size(), scheme) != 0) continue;
        const size_t slash = target.find('/', scheme.size());
        return slash == std::string::npos ? "/" : target.substr(slash);
    }
    return target;
}

std::string HttpRequest::Parameter(const std::string& name) const
{
    const size_t question = target.find('?');
    if (question == std::string::npos) return std::string();
    std::string rest = target.substr(question + 1);
    while (!rest.empty()) {
        const size_t end = std::min(rest.find('&'), rest.size());
        const std::string pair = rest.substr(0, end);
        rest.erase(0, end + 1);
        const size_t equals = std::min(pair.find('='), pair.size());
        if (pair.substr(0, equals) == name) return UrlDecode(pair.substr(std::min(equals + 1, pair.size())));
    }
    return std::string();
}

bool HttpRequest::KeepAlive() const
{
    bool keeps = version != "HTTP/1.0";
    for (const auto& [name, value] : headers) {
        if (name != "connection") continue;
        for (const std::string& option : Split(Lower(value), ','))
            keeps = option != "close" && (keeps || option == "keep-alive");
    }
    return keeps;
}

bool HttpRequest::AcceptsGzip() const
{
    for (const std::string& coding : Split(Lower(Header("accept-encoding")), ',')) {
        const std::vector<std::string> parts = Split(coding, ';');
        if (parts[0] != "gzip" && parts[0] != "*") continue;
        return parts.size() < 2 || parts[1].rfind("q=", 0) != 0 || atof(parts[1].c_str() + 2) > 0;
    }
    return false;
}

std::string HttpResponse::Head(const Framing& framing) const
{
    std::string head = framing.version + (" " + std::to_string(status)) + " ";
    head += opensTunnel ? "Connection established" : Reason(status);
    head += "\r\nServer: storefront-simulator\r\n";
    if (!opensTunnel) head += "Content-Type: " + contentType + "\r\n";
    for (const auto& header : headers)
        head += header.first + ": " + header.second + "\r\n";
    if (framing.length == Framing::Announced) {
        head += "Content-Length: " + std::to_string(framing.announced) + "\r\n";
    } else if (framing.length == Framing::Chunks) {
        head += "Transfer-Encoding: chunked\r\n";
    }
    if (!opensTunnel) head += std::string("Connection: ") + (framing.keepAlive ? "keep-alive" : "close") + "\r\n";
    return head + "\r\n";
}

Incoming ReadRequest(Channel& channel, std::string& rest, HttpRequest& request)
{
    size_t headEnd = std::string::npos;
    while (headEnd == std::string::npos) {
        // Empty lines before a request mean nothing.
        rest.erase(0, std::min(rest.find_first_not_of("\r\n"), rest.size()));
        headEnd = rest.find("\r\n\r\n");
        if (headEnd == std::string::npos && !ReadMore(channel, rest)) {
            return rest.empty() ? Incoming::End : Incoming::Malformed;
        }
    }
    std::string first;
    const bool good = ReadHead(rest.substr(0, headEnd), first, request.headers) && ReadFirstLine(first, request);
    rest.erase(0, headEnd + 4);
    return good && ReadBody(channel, rest, request) ? Incoming::Request : Incoming::Malformed;
}

std::string UrlDecode(const std::string& text)
{
    std::string decoded;
    for (size_t i = 0; i < text.size(); ++i) {
        if (text[i] == '%' && i + 2 < text.size()) {
            decoded += static_cast<char>(strtol(text.substr(i + 1, 2).c_str(), nullptr, 16));
            i += 2;
        } else {
            decoded += text[i];
        }
    }
    return decoded;
}

std::string Gzip(const std::string& text)
{
    // Of a thread, as it takes longer to make than to use: 256 KiB.
    static thread_local Deflater deflater;
    return deflater.Pack(text);
}

}  // namespace simulator
