#include "Control.h"

#include <algorithm>
#include <sstream>

namespace simulator {

namespace {

void Refuse(HttpResponse& response, const std::string& reason)
{
    response.status = 400;
    response.body += reason + "\n";
}

void AddFaults(const std::string& text, Faults& faults, HttpResponse& response)
{
    std::istringstream lines(text);
    for (std::string line, error; std::getline(lines, line);) {
        if (!line.empty() && !faults.Add(line, error)) Refuse(response, error);
    }
}

void SetClock(const std::string& text, SimulatedClock& clock, HttpResponse& response)
{
    long long seconds = 0;
    if (!ReadSeconds(text, seconds)) return Refuse(response, "\"" + text + "\" is no number of seconds");
    clock.SetOffset(seconds);
}

// A line that names what to do; behind it the bytes to write.
void ActOnIdle(const std::string& text, Server& server, HttpResponse& response)
{
    static const std::pair<const char*, IdleAction> kActions[] = {{"write", IdleAction::Write},
                                                                  {"close", IdleAction::Close},
                                                                  {"reset", IdleAction::Reset},
                                                                  {"silence", IdleAction::Silence},
                                                                  {"ticket", IdleAction::Ticket}};
    const size_t end = std::min(text.find('\n'), text.size());
    const std::string bytes = text.substr(std::min(end + 1, text.size()));
    for (const auto& [name, action] : kActions) {
        if (Trimmed(text.substr(0, end)) != name) continue;
        response.body = std::to_string(server.ActOnIdle(action, bytes.empty() ? kTimeoutAnswer : bytes)) + "\n";
        return;
    }
    Refuse(response, "write, close, reset, silence or ticket expected");
}

}  // namespace

HttpResponse AnswerControl(const HttpRequest& request, const Controls& controls)
{
    HttpResponse response;
    const std::string what = request.method + " " + request.Path();
    if (what == "POST /control/faults") {
        AddFaults(request.body, controls.faults, response);
    } else if (what == "GET /control/faults") {
        response.body = controls.faults.Pending();
    } else if (what == "DELETE /control/faults") {
        controls.faults.Clear();
    } else if (what == "GET /control/log") {
        response.contentType = "application/x-ndjson";
        response.body = controls.log.Json();
    } else if (what == "DELETE /control/log") {
        controls.log.Clear();
    } else if (what == "GET /control/clock") {
        response.body = std::to_string(controls.clock.Offset()) + "\n";
    } else if (what == "POST /control/clock") {
        SetClock(request.body, controls.clock, response);
    } else if (what == "POST /control/idle") {
        ActOnIdle(request.body, controls.server, response);
    } else {
        response.status = 404;
        response.body = "not found";
    }
    return response;
}

}  // namespace simulator
