#include "Movie.h"

#include <algorithm>
#include <cstdio>
#include <cstdlib>

#include "LastLine.h"
#include "Text.h"

using namespace ae::stagecraft;

Movie::Movie(MovieOptions options, std::string text, const std::vector<ExtensionClass>& classes, StopRequest& stop)
    : m_options(std::move(options)), m_text(std::move(text)), m_stop(stop), m_extensions(m_engine, *this, classes)
{
    DefineGlobals();
    DefineFlashVars();
}

bool Movie::Run()
{
    const auto period = std::chrono::duration_cast<Timers::Clock::duration>(
        std::chrono::duration<double>(1 / m_options.ticksPerSecond));
    BreakTimer breakTimer;
    m_stop.SetBreakTimer(&breakTimer);
    m_engine.SetRunning(true);

    const bool succeeded = m_stop.Raised() || m_engine.RunProgram(m_text, m_options.path);
    auto next = Timers::Clock::now() + period;
    while (succeeded && !Ended() && !Idle()) {
        if (m_stop.WaitUntil(next)) break;
        Tick();
        next = std::max(next + period, Timers::Clock::now());
    }

    m_engine.SetRunning(false);
    m_stop.SetBreakTimer(nullptr);
    if (!m_engine.Alive()) {
        LastLine::ScriptError();
        fprintf(stderr, "script error: did not return after a stop request and was broken off (%s)\n",
                m_options.path.c_str());
    }
    return succeeded && m_engine.Alive();
}

void Movie::Tick()
{
    m_extensions.Update([this] { return Ended(); });
    m_timers.RunDue(Timers::Clock::now(), [this](const ASValue& function, const ASValueArray& arguments) {
        if (!Ended()) m_engine.CallFunction(function, arguments);
    });
}

// ---- The movie's globals

void Movie::DefineGlobals()
{
    const auto argument = [](NativeCall& call, size_t index) {
        return index < call.arguments.size() ? call.arguments[index] : ASValue();
    };

    m_engine.DefineGlobal("trace", [=](NativeCall& call) {
        AEString text;
        m_engine.ToText(argument(call, 0), text);
        // One call, so that lines of other threads do not come between.
        printf("%s\n", text.c_str());
        fflush(stdout);
    });
    m_engine.DefineGlobal("quit", [=](NativeCall&) { EndMovie(); });
    m_engine.DefineGlobal("getenv", [=](NativeCall& call) {
        AEString name;
        if (m_engine.ToText(argument(call, 0), name)) call.result = ASValue::String(getenv(name.c_str()));
    });

    DefineTimer("setTimeout", false);
    DefineTimer("setInterval", true);
    for (const char* pName : {"clearTimeout", "clearInterval"}) {
        m_engine.DefineGlobal(pName, [=](NativeCall& call) {
            const ASValue number = argument(call, 0);
            if (number.GetType() == ASValue::kNumber) m_timers.Remove(ASToUint32(number.GetNumber()));
        });
    }
}

void Movie::DefineTimer(const char* pName, bool repeats)
{
    m_engine.DefineGlobal(pName, [=](NativeCall& call) {
        if (call.arguments.empty() || !m_engine.IsFunction(call.arguments[0])) {
            call.error = std::string(pName) + ": the first argument is not a function";
            return;
        }
        const double delay = call.arguments.size() > 1 ? m_engine.ToNumber(call.arguments[1]) : 0;
        ASValueArray extra;
        for (size_t i = 2; i < call.arguments.size(); ++i) {
            extra.Append(call.arguments[i]);
        }
        call.result =
            ASValue::Number(m_timers.Add(Timers::Clock::now(), delay, repeats, call.arguments[0], std::move(extra)));
    });
}

void Movie::DefineFlashVars()
{
    m_engine.Execute([](duk_context* pContext) {
        duk_push_object(pContext);
        duk_put_global_string(pContext, "flashvars");
    });
    const std::string& pairs = m_options.flashVars;
    for (size_t at = 0; at < pairs.size();) {
        const size_t end = std::min(pairs.find('&', at), pairs.size());
        const std::string pair = pairs.substr(at, end - at);
        at = end + 1;
        const size_t equals = std::min(pair.find('='), pair.size());
        const std::string name = PercentDecode(pair.substr(0, equals));
        const std::string value = equals < pair.size() ? PercentDecode(pair.substr(equals + 1)) : "";
        if (name.empty()) continue;
        m_engine.Execute([&](duk_context* pContext) {
            duk_get_global_string(pContext, "flashvars");
            ScriptEngine::PushText(pContext, name.data(), name.size());
            ScriptEngine::PushText(pContext, value.data(), value.size());
            duk_def_prop(pContext, -3, DUK_DEFPROP_HAVE_VALUE | DUK_DEFPROP_SET_WEC);
        });
    }
}
