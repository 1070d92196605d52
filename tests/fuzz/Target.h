// What the fuzz targets share. A target is one TestInput in one file; under the fuzzer it gets inputs without end, in
// the other builds those that are kept in seeds/.
#pragma once

#include "Require.h"
#include "Text.h"

void TestInput(std::string_view input);
