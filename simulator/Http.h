// HTTP/1.1 as far as the simulator needs it.
#pragma once

#include <string>
#include <utility>
#include <vector>

namespace simulator {

class Channel;

using Headers = std::vector<std::pair<std::string, std::string>>;

/// The text in lower case; without white space around it.
std::string Lower(std::string text);
std::string Trimmed(const std::string& text);

/// The parts between the separators, trimmed.
std::vector<std::string> Split(const std::string& text, char separator);

/// The value of the first header of the name, which is in lower case; empty when there is none.
std::string HeaderOf(const Headers& headers, const std::string& name);

/// The first line of a head, and its headers with their names in lower case. False when it is no head.
bool ReadHead(const std::string& head, std::string& first, Headers& headers);

struct HttpRequest {
    std::string method;
    std::string target;   ///< As it stands: path and query, a whole address, or host and port.
    std::string version;  ///< "HTTP/1.1" or "HTTP/1.0".
    Headers headers;      ///< Names in lower case.
    std::string body;     ///< Without its chunks.

    std::string Header(const std::string& name) const { return HeaderOf(headers, name); }
    std::string Path() const { return Local().substr(0, Local().find('?')); }
    /// The target as a server that is no proxy takes it: without "http://host".
    std::string Local() const;
    /// A parameter of the query, decoded; empty when there is none.
    std::string Parameter(const std::string& name) const;
    bool KeepAlive() const;
    bool AcceptsGzip() const;
};

/// What an answer's head tells of its body's end and of the connection's.
struct Framing {
    enum Length { Announced, Chunks, Unannounced } length = Announced;
    size_t announced = 0;
    bool keepAlive = true;
    const char* version = "HTTP/1.1";
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

enum class Incoming {
    Request,
    End,        ///< Of the connection, between two requests.
    Malformed,  ///< No request, not all of one, or one of more than 1 MiB.
};

/// Reads one request, and says that it may go on when it asks; `rest` holds what came too early.
Incoming ReadRequest(Channel& channel, std::string& rest, HttpRequest& request);

std::string UrlDecode(const std::string& text);
std::string Gzip(const std::string& text);

}  // namespace simulator
