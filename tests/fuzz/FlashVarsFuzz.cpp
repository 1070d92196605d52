// The flash variables, as a movie sees them.
#include "ScriptRun.h"
#include "Target.h"

void TestInput(std::string_view input)
{
    const std::string text(input.substr(0, input.find('\0')));
    RunScript(
        "var names = Object.keys(flashvars);\n"
        "if (Object.getPrototypeOf(flashvars) !== Object.prototype) throw new Error('prototype');\n"
        "names.forEach(function (name) {\n"
        "    if (name === '' || typeof flashvars[name] !== 'string') throw new Error('no text');\n"
        "});\n"
        "if (Object.keys(JSON.parse(JSON.stringify(flashvars))).length !== names.length) throw new Error('names');\n",
        text);
}
