// HTTP/1.1 as far as the simulator needs it.
#pragma once

#include <string>
#include <utility>
#include <vector>

class Channel;

using Headers = std::vector<std::pair<std::string, std::string>>;

struct HttpRequest {
    std::string method;
    std::string target;  ///< Path and query.
    Headers headers;     ///< Names in lower case.
    std::string body;

    std::string Header(const std::string& name) const;
    std::string Path() const { return target.substr(0, target.find('?')); }
    /// A parameter of the query, decoded; empty when there is none.
    std::string Parameter(const std::string& name) const;
    bool KeepAlive() const;
};

struct HttpResponse {
    int status = 200;
    Headers headers;
    std::string body;
    std::string contentType = "text/plain; charset=utf-8";

    /// The lines before the body, with the length given.
    std::string Head(size_t length, bool keepAlive) const;
};

/// Reads one request; `rest` holds what came too early. False when the connection ends, or the request is none or
/// larger than 1 MiB.
bool ReadRequest(Channel& channel, std::string& rest, HttpRequest& request);

std::string UrlDecode(const std::string& text);
std::string Gzip(const std::string& text);
