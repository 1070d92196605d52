// One movie: its window, script, timers and extension instances, and the ticks that drive them. Main thread only.
//
// The stop request is read between the calls into the script; RunStageWindowSet's contract says what ends a movie.
#pragma once

#include <memory>
#include <string>
#include <vector>

#include "Extensions.h"
#include "ScriptEngine.h"
#include "StopRequest.h"
#include "Timers.h"

// What the argument vector and the environment say.
struct MovieOptions {
    std::string path;
    std::string flashVars;  // "name=value&name=value", percent-encoded
    double ticksPerSecond = 30;
};

class Movie final : public ae::stagecraft::StageWindow {
public:
    Movie(MovieOptions options, std::string text, const std::vector<ExtensionClass>& classes, StopRequest& stop);

    void EndMovie() override { m_ended = true; }

    // Blocks until the movie has ended. false when a script error at the top level ended it, and when script code had
    // to be broken off.
    bool Run();

private:
    bool Ended() const { return m_ended || !m_engine.Alive() || m_stop.Raised(); }
    bool Idle() const { return m_timers.empty() && !m_extensions.HasUpdates(); }
    void DefineGlobals();
    void DefineFlashVars();
    void DefineTimer(const char* pName, bool repeats);
    void Tick();

    const MovieOptions m_options;
    const std::string m_text;
    StopRequest& m_stop;
    bool m_ended = false;
    // The order counts: values of the timers go before the instances, both before the engine.
    ScriptEngine m_engine;
    Extensions m_extensions;
    Timers m_timers;
};
