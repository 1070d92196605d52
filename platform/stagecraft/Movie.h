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

    void EndMovie() override { m_Ended = true; }

    // Blocks until the movie has ended. false when a script error at the top level ended it, and when script code had
    // to be broken off.
    bool Run();

private:
    bool Ended() const { return m_Ended || !m_Engine.Alive() || m_Stop.Raised(); }
    bool Idle() const { return m_Timers.empty() && !m_Extensions.HasUpdates(); }
    void DefineGlobals();
    void DefineFlashVars();
    void DefineTimer(const char* pName, bool repeats);
    void Tick();

    const MovieOptions m_Options;
    const std::string m_Text;
    StopRequest& m_Stop;
    bool m_Ended = false;
    // The order counts: values of the timers go before the instances, both before the engine.
    ScriptEngine m_Engine;
    Extensions m_Extensions;
    Timers m_Timers;
};
