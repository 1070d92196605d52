#include "RequestLoop.h"

namespace simulator {

void ServeRequests(Server& server, Connection& connection, RequestLog& log, const ServeRequest& serve)
{
    std::string rest;
    Incoming incoming;
    for (bool first = true;; first = false) {
        HttpRequest request;
        if (rest.empty() && !server.WaitForRequest(connection, first)) return;
        incoming = ReadRequest(connection.channel, rest, request);
        if (incoming != Incoming::Request) break;
        if (!serve(request, rest)) return;
    }
    if (incoming == Incoming::Malformed) {
        LoggedRequest entry = BeginEntry(connection, log);
        entry.violation = "no whole HTTP request";
        log.Add(std::move(entry));
    }
    connection.channel.Close();
}

LoggedRequest BeginEntry(const Connection& connection, const RequestLog& log)
{
    LoggedRequest entry;
    entry.connection = connection.number;
    entry.proxy = connection.proxy;
    entry.tls = connection.channel.IsTls();
    entry.resumed = connection.channel.IsResumed();
    entry.time = log.Now();
    return entry;
}

LoggedRequest BeginEntry(const Connection& connection, const RequestLog& log, const HttpRequest& request)
{
    LoggedRequest entry = BeginEntry(connection, log);
    entry.method = request.method;
    entry.target = request.target;
    entry.headers = request.headers;
    for (auto& [name, value] : entry.headers) {
        if (name == "proxy-authorization") value = value.substr(0, value.find(' ') + 1) + "***";
    }
    return entry;
}

}  // namespace simulator
