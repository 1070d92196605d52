// Breaking off script code that does not return.
//
// The packaged script engine has no hook by which running script code could be told to stop. So the calls into the
// engine are made through EnterScript, and a signal to the main thread jumps back out of the innermost of them. The
// jump is made only when the signal found the thread in the engine's own code (never in the C library, whose locks
// would stay held, and never in native code that the script called, whose objects would not be destroyed). What the
// engine held is then in an unknown state: its context must never be used again, its memory is freed block by block.
//
// Threads: one main thread; BreakTimer::Start may be called from any thread.
#pragma once

#include <setjmp.h>
#include <signal.h>
#include <time.h>

#include <chrono>

// A call into the engine that is under way.
struct ScriptEntry {
    sigjmp_buf env;
    ScriptEntry* pOuter;
};

// Runs the function, which must do nothing but call the engine. false when it was broken off.
bool EnterScript(void (*function)(void*), void* pData);

// While native code runs that script called, nothing is broken off. Leave continues the interrupted call into the
// engine, or breaks it off when `broken` (an inner call was): then it does not return, and the frames between must hold
// nothing that has to be destroyed.
ScriptEntry* EnterNative();
void LeaveNative(ScriptEntry* pEntry, bool broken);

// Sends the breaking signal to the thread that made this object, once the delay is over and then again and again: a try
// fails when the signal finds the thread elsewhere. Never breaks anything off on processors other than x86-64, ARM and
// AArch64.
class BreakTimer {
public:
    BreakTimer();   // installs the signal's handler
    ~BreakTimer();  // stops the signals and puts the previous handler back; on the thread that made the object
    BreakTimer(const BreakTimer&) = delete;
    BreakTimer& operator=(const BreakTimer&) = delete;

    // Any thread. false when the system gave no timer.
    bool Start(std::chrono::milliseconds delay);

private:
    timer_t m_Timer{};
    bool m_Created = false;
    struct sigaction m_Previous {};
};
