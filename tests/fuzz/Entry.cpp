// Where the fuzzer comes in.
#include <stddef.h>
#include <stdint.h>

#include "Target.h"

extern "C" int LLVMFuzzerTestOneInput(const uint8_t* data, size_t size)
{
    TestInput(std::string_view(reinterpret_cast<const char*>(data), size));
    return 0;
}
