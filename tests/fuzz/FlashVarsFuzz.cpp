// The flash variables, as a movie sees them.
#include "ScriptRun.h"
#include "Target.h"

extern "C" int LLVMFuzzerTestOneInput(const uint8_t* data, size_t size)
{
    const std::string text(AsText(data, size).substr(0, AsText(data, size).find('\0')));
    RunScript(
        "var names = Object.keys(flashvars);\n"
        "if (Object.getPrototypeOf(flashvars) !== Object.prototype) throw new Error('prototype');\n"
        "names.forEach(function (name) {\n"
        "    if (name === '' || typeof flashvars[name] !== 'string') throw new Error('no text');\n"
        "});\n"
        "if (Object.keys(JSON.parse(JSON.stringify(flashvars))).length !== names.length) throw new Error('names');\n",
        text);
    return 0;
}
