#include "Http.h"

#include <strings.h>
#include <zlib.h>

#include <algorithm>
#include <cstdlib>

#include "Channel.h"

namespace simulator {

namespace {

constexpr size_t kLargestRequest = 1 << 20;

std::string Lower(std::string text)
{
    std::transform(text.begin(), text.end(), text.begin(), [](unsigned char c) { return tolower(c); });
    return text;
}

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

}  // namespace

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
        const size_t value = line.find_first_not_of(' ', colon + 1);
        headers.emplace_back(Lower(line.substr(0, colon)),
                             value == std::string::npos ? std::string() : line.substr(value));
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
    return strcasecmp(Header("connection").c_str(), "close") != 0;
}

std::string HttpResponse::Head(const Framing& framing) const
{
    std::string head = "HTTP/1.1 " + std::to_string(status) + " ";
    head += opensTunnel ? "Connection established" : Reason(status);
    head += "\r\nServer: storefront-simulator\r\n";
    if (!opensTunnel) head += "Content-Type: " + contentType + "\r\n";
    for (const auto& header : headers)
        head += header.first + ": " + header.second + "\r\n";
    if (framing.length == Framing::Announced) {
        head += "Content-Length: " + std::to_string(framing.announced) + "\r\n";
    }
    if (!opensTunnel) head += std::string("Connection: ") + (framing.keepAlive ? "keep-alive" : "close") + "\r\n";
    return head + "\r\n";
}

bool ReadRequest(Channel& channel, std::string& rest, HttpRequest& request)
{
    size_t headEnd;
    while ((headEnd = rest.find("\r\n\r\n")) == std::string::npos) {
        if (!ReadMore(channel, rest)) return false;
    }
    std::string first;
    if (!ReadHead(rest.substr(0, headEnd), first, request.headers)) return false;
    const size_t blank = first.find(' ');
    const size_t second = first.find(' ', blank + 1);
    if (blank == std::string::npos || second == std::string::npos) return false;
    request.method = first.substr(0, blank);
    request.target = first.substr(blank + 1, second - blank - 1);
    rest.erase(0, headEnd + 4);
    const size_t length = strtoul(request.Header("content-length").c_str(), nullptr, 10);
    if (length > kLargestRequest) return false;
    while (rest.size() < length) {
        if (!ReadMore(channel, rest)) return false;
    }
    request.body = rest.substr(0, length);
    rest.erase(0, length);
    return true;
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
    z_stream stream = {};
    deflateInit2(&stream, Z_DEFAULT_COMPRESSION, Z_DEFLATED, 15 + 16, 8, Z_DEFAULT_STRATEGY);
    std::string packed(deflateBound(&stream, text.size()), '\0');
    stream.next_in = reinterpret_cast<Bytef*>(const_cast<char*>(text.data()));
    stream.avail_in = static_cast<uInt>(text.size());
    stream.next_out = reinterpret_cast<Bytef*>(&packed[0]);
    stream.avail_out = static_cast<uInt>(packed.size());
    deflate(&stream, Z_FINISH);
    packed.resize(stream.total_out);
    deflateEnd(&stream);
    return packed;
}

}  // namespace simulator
