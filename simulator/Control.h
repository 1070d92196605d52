// "/control/...": faults and log, for people and scripts.
#pragma once

#include "Faults.h"
#include "Http.h"
#include "RequestLog.h"

namespace simulator {

HttpResponse AnswerControl(const HttpRequest& request, Faults& faults, RequestLog& log);

}  // namespace simulator
