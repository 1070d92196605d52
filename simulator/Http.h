// HTTP/1.1 as far as the simulator needs it.
#pragma once

#include <string>
#include <utility>
#include <vector>

namespace simulator {

class Channel;

using Headers = std::vector<std::pair<std::string, std::string>>;

/// The value of the first header of the name, which is in lower case; empty when there is none.
std::string HeaderOf(const Headers& headers, const std::string& name);

/// The first line of a head, and its headers with their names in lower case. False when it is no head.
bool ReadHead(const std::string& head, std::string& first, Headers& headers);

struct HttpRequest {
    std::string method;
    std::string target;  ///< As it stands: path and query, a whole address, or host and port.
    Headers headers;     ///< Names in lower case.
    std::string body;

    std::string Header(const std::string& name) const { return HeaderOf(headers, name); }
    std::string Path() const { return Local().substr(0, Local().find('?')); }
    /// The target as a server that is no proxy takes it: without "http://host".
    std::string Local() const;
    /// A parameter of the query, decoded; empty when there is none.
    std::string Parameter(const std::string& name) const;
    bool KeepAlive() const;
};

/// What an answer's head tells of its body's end and of the connection's.
struct Framing {
    enum Length { Announced, Unannounced } length = Announced;
    size_t announced = 0;
    bool keepAlive = true;
};

struct HttpResponse {
    int status = 200;
    Headers headers;
    std::string body;
    std::string contentType = "text/plain; charset=utf-8";
    bool opensTunnel = false;  ///< Not an answer with a body: bytes of a tunnel follow.

    /// The lines before the body.
    std::string Head(const Framing& framing) const;
};

/// Reads one request; `rest` holds what came too early. False when the connection ends, or the request is none or
/// larger than 1 MiB.
bool ReadRequest(Channel& channel, std::string& rest, HttpRequest& request);

std::string UrlDecode(const std::string& text);
std::string Gzip(const std::string& text);

}  // namespace simulator
