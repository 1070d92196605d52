// What the fuzz targets share. A target is one TestInput in one file; under the fuzzer it gets inputs without end, in
// the other builds those that are kept in seeds/.
#pragma once

#include <stdio.h>
#include <stdlib.h>

#include <string>
#include <string_view>

void TestInput(std::string_view input);

/// Ends the run when a property does not hold.
inline void Require(bool holds, const char* what)
{
    if (holds) return;
    fprintf(stderr, "does not hold: %s\n", what);
    abort();
}

/// Takes the first line off the text. Targets of several kinds of input name the kind there.
inline std::string TakeLine(std::string_view& text)
{
    const size_t end = text.find('\n');
    std::string line(text.substr(0, end));
    text.remove_prefix(end == std::string_view::npos ? text.size() : end + 1);
    return line;
}
