// "/control/...": faults, log and clock, for people and scripts.
#pragma once

#include "Faults.h"
#include "Http.h"
#include "RequestLog.h"
#include "SimulatedClock.h"

namespace simulator {

HttpResponse AnswerControl(const HttpRequest& request, Faults& faults, RequestLog& log, SimulatedClock& clock);

}  // namespace simulator
