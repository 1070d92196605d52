// Right answers as other toolkits make them.
#pragma once

#include "Faults.h"
#include "Http.h"

namespace simulator {

/// The answer, whose body is a SOAP 1.1 envelope of ours, in the form that the fault names; as it is for the other
/// kinds.
HttpResponse Reshaped(HttpResponse response, const Fault& fault);

}  // namespace simulator
