#include "Control.h"

#include <sstream>

namespace simulator {

HttpResponse AnswerControl(const HttpRequest& request, Faults& faults, RequestLog& log, SimulatedClock& clock)
{
    HttpResponse response;
    const std::string what = request.method + " " + request.Path();
    if (what == "POST /control/faults") {
        std::istringstream lines(request.body);
        for (std::string line, error; std::getline(lines, line);) {
            if (line.empty() || faults.Add(line, error)) continue;
            response.status = 400;
            response.body += error + "\n";
        }
    } else if (what == "GET /control/faults") {
        response.body = faults.Pending();
    } else if (what == "DELETE /control/faults") {
        faults.Clear();
    } else if (what == "GET /control/log") {
        response.contentType = "application/x-ndjson";
        response.body = log.Json();
    } else if (what == "DELETE /control/log") {
        log.Clear();
    } else if (what == "GET /control/clock") {
        response.body = std::to_string(clock.Offset()) + "\n";
    } else if (what == "POST /control/clock") {
        long long seconds = 0;
        if (ReadSeconds(request.body, seconds)) {
            clock.SetOffset(seconds);
        } else {
            response.status = 400;
            response.body = "\"" + request.body + "\" is no number of seconds\n";
        }
    } else {
        response.status = 404;
        response.body = "not found";
    }
    return response;
}

}  // namespace simulator
