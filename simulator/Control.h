// "/control/...": faults, log, clock and kept connections, for people and scripts.
#pragma once

#include "Faults.h"
#include "Http.h"
#include "RequestLog.h"
#include "Server.h"
#include "SimulatedClock.h"

namespace simulator {

/// What is controlled.
struct Controls {
    Faults& faults;
    RequestLog& log;
    SimulatedClock& clock;
    Server& server;
};
HttpResponse AnswerControl(const HttpRequest& request, const Controls& controls);

}  // namespace simulator
