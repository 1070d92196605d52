// Says on the console what killed the process: there is no debugger on a player.
#pragma once

#include <signal.h>

/// What the handler does after the report of a fatal signal: true gives the signal back to the action from before
/// start-up, which leaves a core file where those are enabled; false stops the process for inspection.
extern volatile bool _EN_CORE_DUMP;

/// Installs the handlers, for all threads. Once, first thing in the process, main thread.
void zv_dbg_init();

/// The handler. Runs on the thread that took the signal. First writes out what standard output and the log file still
/// hold. Neither allocates nor waits for what the interrupted code may hold; with _EN_CORE_DUMP it ends within seconds
/// also when the console takes nothing. The stack overflow of a thread is reported when that has a SignalStack.
void sighandler(int signal, siginfo_t* info, void* context);

/// Prints process, thread and registers of the interrupted code.
void show_regs(sigcontext* registers);

/// Prints the callers of this function.
void dump_stack();
