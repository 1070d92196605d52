// What is asked without SOAP: discovery, box art, clock, bandwidth file.
#pragma once

#include <ctime>
#include <string>

#include "Database.h"
#include "Faults.h"
#include "Http.h"
#include "RequestLog.h"

namespace simulator {

/// The name under which a path's faults and log entries stand; empty for a path that is none of these.
std::string PlainServiceName(const std::string& path);

/// Answers one of them, at the time given; box art of the database's titles. `fault` has already been chosen.
HttpResponse AnswerPlain(const std::string& service, const HttpRequest& request, Database& database, int environment,
                         time_t now, const Fault& fault, LoggedRequest& log);

/// A picture of that many pixels' width for the title; the same one every time.
std::string MakeBoxArt(const std::string& prefix, int width);

}  // namespace simulator
