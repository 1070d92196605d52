#include "Movie.h"

#include <algorithm>
#include <cstdio>
#include <cstdlib>

#include "LastLine.h"
#include "Text.h"

using namespace ae::stagecraft;

Movie::Movie(MovieOptions options, std::string text, const std::vector<ExtensionClass>& classes, StopRequest& stop)
    : m_Options(std::move(options)), m_Text(std::move(text)), m_Stop(stop), m_Extensions(m_Engine, *this, classes)
{
    DefineGlobals();
    DefineFlashVars();
}

bool Movie::Run()
{
    const auto period = std::chrono::duration_cast<Timers::Clock::duration>(
        std::chrono::duration<double>(1 / m_Options.ticksPerSecond));
    BreakTimer breakTimer;
    m_Stop.SetBreakTimer(&breakTimer);
    m_Engine.SetRunning(true);

    const bool succeeded = m_Stop.Raised() || m_Engine.RunProgram(m_Text, m_Options.path);
    auto next = Timers::Clock::now() + period;
    while (succeeded && !Ended() && !Idle()) {
        if (m_Stop.WaitUntil(next)) break;
        Tick();
        next = std::max(next + period, Timers::Clock::now());
    }

    m_Engine.SetRunning(false);
    m_Stop.SetBreakTimer(nullptr);
    if (!m_Engine.Alive()) {
        LastLine::ScriptError();
        fprintf(stderr, "script error: did not return after a stop request and was broken off (%s)\n",
                m_Options.path.c_str());
    }
    return succeeded && m_Engine.Alive();
}

void Movie::Tick()
{
    m_Extensions.Update([this] { return Ended(); });
    m_Timers.RunDue(Timers::Clock::now(), [this](const ASValue& function, const ASValueArray& arguments) {
        if (!Ended()) m_Engine.CallFunction(function, arguments);
    });
}

// ---- The movie's globals

void Movie::DefineGlobals()
{
    const auto argument = [](NativeCall& call, size_t index) {
        return index < call.arguments.size() ? call.arguments[index] : ASValue();
    };

    m_Engine.DefineGlobal("trace", [=](NativeCall& call) {
        AEString text;
        m_Engine.ToText(argument(call, 0), text);
        // One call, so that lines of other threads do not come between.
        printf("%s\n", text.c_str());
        fflush(stdout);
    });
    m_Engine.DefineGlobal("quit", [=](NativeCall&) { EndMovie(); });
    m_Engine.DefineGlobal("getenv", [=](NativeCall& call) {
        AEString name;
        if (m_Engine.ToText(argument(call, 0), name)) call.result = ASValue::String(getenv(name.c_str()));
    });

    DefineTimer("setTimeout", false);
    DefineTimer("setInterval", true);
    for (const char* pName : {"clearTimeout", "clearInterval"}) {
        m_Engine.DefineGlobal(pName, [=](NativeCall& call) {
            const ASValue number = argument(call, 0);
            if (number.GetType() == ASValue::kNumber) m_Timers.Remove(ASToUint32(number.GetNumber()));
        });
    }
}

void Movie::DefineTimer(const char* pName, bool repeats)
{
    m_Engine.DefineGlobal(pName, [=](NativeCall& call) {
        if (call.arguments.empty() || !m_Engine.IsFunction(call.arguments[0])) {
            call.error = std::string(pName) + ": the first argument is not a function";
            return;
        }
        const double delay = call.arguments.size() > 1 ? m_Engine.ToNumber(call.arguments[1]) : 0;
        ASValueArray extra;
        for (size_t i = 2; i < call.arguments.size(); ++i) {
            extra.Append(call.arguments[i]);
        }
        call.result =
            ASValue::Number(m_Timers.Add(Timers::Clock::now(), delay, repeats, call.arguments[0], std::move(extra)));
    });
}

void Movie::DefineFlashVars()
{
    m_Engine.Execute([](duk_context* pContext) {
        duk_push_object(pContext);
        duk_put_global_string(pContext, "flashvars");
    });
    const std::string& pairs = m_Options.flashVars;
    for (size_t at = 0; at < pairs.size();) {
        const size_t end = std::min(pairs.find('&', at), pairs.size());
        const std::string pair = pairs.substr(at, end - at);
        at = end + 1;
        const size_t equals = std::min(pair.find('='), pair.size());
        const std::string name = PercentDecode(pair.substr(0, equals));
        const std::string value = equals < pair.size() ? PercentDecode(pair.substr(equals + 1)) : "";
        if (name.empty()) continue;
        m_Engine.Execute([&](duk_context* pContext) {
            duk_get_global_string(pContext, "flashvars");
            ScriptEngine::PushText(pContext, name.data(), name.size());
            ScriptEngine::PushText(pContext, value.data(), value.size());
            duk_def_prop(pContext, -3, DUK_DEFPROP_HAVE_VALUE | DUK_DEFPROP_SET_WEC);
        });
    }
}
