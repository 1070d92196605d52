// Reads the requests of a connection, one after the other.
#pragma once

#include <functional>
#include <string>

#include "Http.h"
#include "RequestLog.h"
#include "Server.h"

namespace simulator {

/// Answers a request. `rest` is what has come behind it already. False when no further request may follow.
using ServeRequest = std::function<bool(const HttpRequest& request, std::string& rest)>;

/// Serves them to the connection's end. What is no request is noted in the log.
void ServeRequests(Server& server, Connection& connection, RequestLog& log, const ServeRequest& serve);

/// An entry with what is known of a request before it is looked at.
LoggedRequest BeginEntry(const Connection& connection, const RequestLog& log);
LoggedRequest BeginEntry(const Connection& connection, const RequestLog& log, const HttpRequest& request);

}  // namespace simulator
