// The form of a request's envelope: what every element of it may have, wherever it stands and whatever it says.
#pragma once

#include <string>

#include "XmlNode.h"

namespace simulator {

/// Empty when the message has the form: one header and one body in their order and with nothing beside them; text only
/// where text belongs, and children only elsewhere; no xsi:type but that of the element. Else what is wrong. What the
/// header and the body hold, and in which order, is left to others.
std::string CheckForm(const Document& message);

}  // namespace simulator
