// Inputs that are kept for tests.
#pragma once

#include <string>
#include <string_view>

/// Takes the first line off the text. Inputs of several kinds name the kind there.
inline std::string TakeLine(std::string_view& text)
{
    const size_t end = text.find('\n');
    std::string line(text.substr(0, end));
    text.remove_prefix(end == std::string_view::npos ? text.size() : end + 1);
    return line;
}
