#include "CrashHandler.h"

#include <dlfcn.h>
#include <errno.h>
#include <execinfo.h>
#include <link.h>
#include <stdint.h>
#include <string.h>
#include <sys/prctl.h>
#include <termios.h>
#include <ucontext.h>
#include <unistd.h>

#include <new>

#include "CrashConsole.h"
#include "SignalStack.h"
#include "ZV_LogImpl.h"

volatile bool _EN_CORE_DUMP = false;

namespace {

struct sigaction old_int, old_ill, old_term, old_fpe, old_abrt, old_segv, old_pipe;

// What the report needs of the processor: where it was, and the lines that show its registers.
#if defined(__arm__)
unsigned long ProgramCounter(const sigcontext& r)
{
    return r.arm_pc;
}
void PrintRegisters(const sigcontext& r)
{
    CrashPrint("pc : [<%08lx>]    lr : [<%08lx>]    psr: %08lx\nsp : %08lx  ip : %08lx  fp : %08lx\n", r.arm_pc,
               r.arm_lr, r.arm_cpsr, r.arm_sp, r.arm_ip, r.arm_fp);
    CrashPrint("r10: %08lx  r9 : %08lx  r8 : %08lx\n", r.arm_r10, r.arm_r9, r.arm_r8);
    CrashPrint("r7 : %08lx  r6 : %08lx  r5 : %08lx  r4 : %08lx\n", r.arm_r7, r.arm_r6, r.arm_r5, r.arm_r4);
    CrashPrint("r3 : %08lx  r2 : %08lx  r1 : %08lx  r0 : %08lx\n", r.arm_r3, r.arm_r2, r.arm_r1, r.arm_r0);
}
#elif defined(__aarch64__)
unsigned long ProgramCounter(const sigcontext& r)
{
    return r.pc;
}
void PrintRegisters(const sigcontext& r)
{
    const auto x = [&](int n) { return static_cast<unsigned long>(r.regs[n]); };
    CrashPrint("pc : [<%016lx>]    lr : [<%016lx>]    pstate: %08lx\nsp : %016lx  fp : %016lx\n", ProgramCounter(r),
               x(30), static_cast<unsigned long>(r.pstate), static_cast<unsigned long>(r.sp), x(29));
    CrashPrint("x28: %016lx\n", x(28));
    for (int n = 27; n > 0; n -= 4) {
        CrashPrint("x%-2d: %016lx  x%-2d: %016lx  x%-2d: %016lx  x%-2d: %016lx\n", n, x(n), n - 1, x(n - 1), n - 2,
                   x(n - 2), n - 3, x(n - 3));
    }
}
#elif defined(__x86_64__)
unsigned long ProgramCounter(const sigcontext& r)
{
    return r.rip;
}
void PrintRegisters(const sigcontext& r)
{
    // Some C libraries declare the fields as long long.
    const auto hex = [](unsigned long value) { return value; };
    CrashPrint("pc : [<%016lx>]    flags: %08lx\nsp : %016lx  bp : %016lx\n", hex(r.rip), hex(r.eflags), hex(r.rsp),
               hex(r.rbp));
    CrashPrint("r15: %016lx  r14: %016lx  r13: %016lx  r12: %016lx\n", hex(r.r15), hex(r.r14), hex(r.r13), hex(r.r12));
    CrashPrint("r11: %016lx  r10: %016lx  r9 : %016lx  r8 : %016lx\n", hex(r.r11), hex(r.r10), hex(r.r9), hex(r.r8));
    CrashPrint("di : %016lx  si : %016lx\n", hex(r.rdi), hex(r.rsi));
    CrashPrint("dx : %016lx  cx : %016lx  bx : %016lx  ax : %016lx\n", hex(r.rdx), hex(r.rcx), hex(r.rbx), hex(r.rax));
}
#else
#error "tell the crash handler the registers of this processor"
#endif

void* PointerTo(unsigned long address)
{
    return reinterpret_cast<void*>(address);
}

void DrainConsole()
{
    tcdrain(STDOUT_FILENO);
}

void PrintName(const char* name)
{
    CrashPrint("\n%s\n\n", name);
}

void PrintInstruction(const sigcontext& registers)
{
    const unsigned long pc = ProgramCounter(registers);
    uint32_t instruction;
    memcpy(&instruction, PointerTo(pc), sizeof(instruction));
    CrashPrint("\tpc: %p, inst: 0x%08lx\n", PointerTo(pc), static_cast<unsigned long>(instruction));
}

// Asked to end: the next one of its kind takes the action from before start-up.
void GiveBack(int signal, const char* name, const struct sigaction& old)
{
    PrintName(name);
    CrashPrint("Using default signal handler.\n");
    DrainConsole();
    sigaction(signal, &old, nullptr);
}

// With a core dump the report has this many seconds, whatever it meets: a console that takes nothing, a lock of the
// loader that nobody will free.
constexpr unsigned kMostSeconds = 5;
volatile int s_reported = 0;  // the signal

void Unblock(int signal)
{
    sigset_t signals;
    sigemptyset(&signals);
    sigaddset(&signals, signal);
    pthread_sigmask(SIG_UNBLOCK, &signals, nullptr);
}

void OnTimeout(int)
{
    const int signal = s_reported;
    sigaction(signal, &old_segv, nullptr);
    Unblock(signal);
    raise(signal);
    _exit(128 + signal);  // the action was to go on
}

void LimitTime(int signal)
{
    s_reported = signal;
    struct sigaction action = {};
    sigemptyset(&action.sa_mask);
    action.sa_handler = OnTimeout;
    sigaction(SIGALRM, &action, nullptr);
    Unblock(SIGALRM);
    alarm(kMostSeconds);
}

// All fatal signals get the action that SIGSEGV had.
void EndFatal(int signal)
{
    if (_EN_CORE_DUMP) {
        CrashPrint("Using default signal handler.\n");
        DrainConsole();
        sigaction(signal, &old_segv, nullptr);
        alarm(0);
        return;
    }
    for (;;) {
        pause();
    }
}

bool IsFatal(int signal)
{
    return signal == SIGILL || signal == SIGABRT || signal == SIGFPE || signal == SIGSEGV;
}

// As backtrace_symbols writes it, without its memory.
void PrintFrame(void* address)
{
    Dl_info symbol;
    link_map* object = nullptr;
    if (!dladdr1(address, &symbol, reinterpret_cast<void**>(&object), RTLD_DL_LINKMAP) || !symbol.dli_fname ||
        !*symbol.dli_fname) {
        CrashPrint("[%p]\n", address);
        return;
    }
    const auto at = reinterpret_cast<uintptr_t>(address);
    const uintptr_t start = symbol.dli_sname ? reinterpret_cast<uintptr_t>(symbol.dli_saddr) : object->l_addr;
    CrashPrint("%s(%s%s0x%lx) [%p]\n", symbol.dli_fname, symbol.dli_sname ? symbol.dli_sname : "",
               at < start ? "-" : "+", static_cast<unsigned long>(at < start ? start - at : at - start), address);
}

void Report(int signal, const siginfo_t& info, sigcontext* registers)
{
    switch (signal) {
        case SIGINT:
            return GiveBack(signal, "Interrupt from keyboard", old_int);
        case SIGTERM:
            return GiveBack(signal, "Termination signal", old_term);
        case SIGPIPE:
            return GiveBack(signal, " SIGPIPE signal", old_pipe);
        case SIGILL:
        case SIGFPE:
            PrintName(signal == SIGILL ? "Illegal Instruction" : "Floating point exception");
            PrintInstruction(*registers);
            show_regs(registers);
            dump_stack();
            break;
        case SIGABRT:
            PrintName(" Abort signal");
            show_regs(registers);
            dump_stack();
            break;
        case SIGSEGV:
            PrintName("Invalid memory reference");
            CrashPrint("\tpc: %p, addr: %p\n", PointerTo(ProgramCounter(*registers)), info.si_addr);
            show_regs(registers);
            break;
        default:
            return;
    }
    DrainConsole();
    EndFatal(signal);
}

}  // namespace

void show_regs(sigcontext* registers)
{
    char name[20] = {};
    prctl(PR_GET_NAME, name);
    CrashPrint("\nPid: %d, comm: %20s\n", static_cast<int>(getpid()), name);
    PrintRegisters(*registers);
}

__attribute__((noinline)) void dump_stack()
{
    void* frames[32];
    const int count = backtrace(frames, 32);
    CrashPrint("backtrace:\n");
    for (int i = 1; i < count; ++i)
        PrintFrame(frames[i]);
}

void sighandler(int signal, siginfo_t* info, void* context)
{
    const int error = errno;  // the interrupted code's
    const bool isFatal = IsFatal(signal);
    if (isFatal && _EN_CORE_DUMP) LimitTime(signal);
    CrashFlush();
    ZV_Log::FlushInHandler(isFatal);
    // The kernel's own name for the machine part of the context.
    Report(signal, *info, reinterpret_cast<sigcontext*>(&static_cast<ucontext_t*>(context)->uc_mcontext));
    errno = error;
}

void zv_dbg_init()
{
    alignas(SignalStack) static char s_stack[sizeof(SignalStack)];
    new (s_stack) SignalStack;  // main thread's, and never destructed: to its end
    void* frame;
    backtrace(&frame, 1);  // its first call loads a library, which a handler had better not
    struct sigaction action = {};
    sigemptyset(&action.sa_mask);
    action.sa_sigaction = sighandler;
    action.sa_flags = SA_SIGINFO;
    const auto install = [&](int signal, struct sigaction& old) { return sigaction(signal, &action, &old) == 0; };

    if (!install(SIGINT, old_int) || !install(SIGILL, old_ill) || !install(SIGTERM, old_term) ||
        !install(SIGFPE, old_fpe) || !install(SIGABRT, old_abrt)) {
        return;
    }
    action.sa_flags |= SA_ONSTACK;
    if (!install(SIGSEGV, old_segv)) return;
    action.sa_handler = SIG_IGN;
    install(SIGPIPE, old_pipe);
}
