#pragma once

#include <string>

std::string Base64(const std::string& bytes);
/// Empty when the text is none.
std::string Unbase64(const std::string& text);
