#pragma once

#include <string>

namespace simulator {

std::string Base64(const std::string& bytes);
/// Empty when the text is none.
std::string Unbase64(const std::string& text);

}  // namespace simulator
