#include "CrashHandler.h"

#include <execinfo.h>
#include <stdint.h>
#include <stdio.h>
#include <stdlib.h>
#include <string.h>
#include <sys/prctl.h>
#include <termios.h>
#include <ucontext.h>
#include <unistd.h>

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
    printf("pc : [<%08lx>]    lr : [<%08lx>]    psr: %08lx\nsp : %08lx  ip : %08lx  fp : %08lx\n", r.arm_pc, r.arm_lr,
           r.arm_cpsr, r.arm_sp, r.arm_ip, r.arm_fp);
    printf("r10: %08lx  r9 : %08lx  r8 : %08lx\n", r.arm_r10, r.arm_r9, r.arm_r8);
    printf("r7 : %08lx  r6 : %08lx  r5 : %08lx  r4 : %08lx\n", r.arm_r7, r.arm_r6, r.arm_r5, r.arm_r4);
    printf("r3 : %08lx  r2 : %08lx  r1 : %08lx  r0 : %08lx\n", r.arm_r3, r.arm_r2, r.arm_r1, r.arm_r0);
}
#elif defined(__aarch64__)
unsigned long ProgramCounter(const sigcontext& r)
{
    return r.pc;
}
void PrintRegisters(const sigcontext& r)
{
    const auto x = [&](int n) { return static_cast<unsigned long>(r.regs[n]); };
    printf("pc : [<%016lx>]    lr : [<%016lx>]    pstate: %08lx\nsp : %016lx  fp : %016lx\n", ProgramCounter(r), x(30),
           static_cast<unsigned long>(r.pstate), static_cast<unsigned long>(r.sp), x(29));
    printf("x28: %016lx\n", x(28));
    for (int n = 27; n > 0; n -= 4) {
        printf("x%-2d: %016lx  x%-2d: %016lx  x%-2d: %016lx  x%-2d: %016lx\n", n, x(n), n - 1, x(n - 1), n - 2,
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
    printf("pc : [<%016lx>]    flags: %08lx\nsp : %016lx  bp : %016lx\n", hex(r.rip), hex(r.eflags), hex(r.rsp),
           hex(r.rbp));
    printf("r15: %016lx  r14: %016lx  r13: %016lx  r12: %016lx\n", hex(r.r15), hex(r.r14), hex(r.r13), hex(r.r12));
    printf("r11: %016lx  r10: %016lx  r9 : %016lx  r8 : %016lx\n", hex(r.r11), hex(r.r10), hex(r.r9), hex(r.r8));
    printf("di : %016lx  si : %016lx\n", hex(r.rdi), hex(r.rsi));
    printf("dx : %016lx  cx : %016lx  bx : %016lx  ax : %016lx\n", hex(r.rdx), hex(r.rcx), hex(r.rbx), hex(r.rax));
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
    fflush(stdout);
    tcdrain(STDOUT_FILENO);
}

void PrintName(const char* name)
{
    printf("\n%s\n\n", name);
}

void PrintInstruction(const sigcontext& registers)
{
    const unsigned long pc = ProgramCounter(registers);
    uint32_t instruction;
    memcpy(&instruction, PointerTo(pc), sizeof(instruction));
    printf("\tpc: %p, inst: 0x%08lx\n", PointerTo(pc), static_cast<unsigned long>(instruction));
}

// Asked to end: the next one of its kind takes the action from before start-up.
void GiveBack(int signal, const char* name, const struct sigaction& old)
{
    PrintName(name);
    printf("Using default signal handler.\n");
    DrainConsole();
    sigaction(signal, &old, nullptr);
}

// All fatal signals get the action that SIGSEGV had.
void EndFatal(int signal)
{
    if (_EN_CORE_DUMP) {
        printf("Using default signal handler.\n");
        DrainConsole();
        sigaction(signal, &old_segv, nullptr);
        return;
    }
    for (;;) {
        pause();
    }
}

// A stack overflow can be reported on a stack of its own only. A sanitizer may have provided one.
void ProvideSignalStack()
{
    static char stack[1 << 16];
    stack_t current;
    if (sigaltstack(nullptr, &current) != 0 || !(current.ss_flags & SS_DISABLE)) return;
    stack_t own = {};
    own.ss_sp = stack;
    own.ss_size = sizeof(stack);
    sigaltstack(&own, nullptr);
}

}  // namespace

void show_regs(sigcontext* registers)
{
    char name[20] = {};
    prctl(PR_GET_NAME, name);
    printf("\nPid: %d, comm: %20s\n", static_cast<int>(getpid()), name);
    PrintRegisters(*registers);
}

__attribute__((noinline)) void dump_stack()
{
    void* frames[32];
    const int count = backtrace(frames, 32);
    char** symbols = backtrace_symbols(frames, count);
    if (!symbols) return;
    printf("backtrace:\n");
    for (int i = 1; i < count; ++i) {
        printf("%s\n", symbols[i]);
    }
    free(symbols);
}

void sighandler(int signal, siginfo_t* info, void* context)
{
    // The kernel's own name for the machine part of the context.
    sigcontext* registers = reinterpret_cast<sigcontext*>(&static_cast<ucontext_t*>(context)->uc_mcontext);
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
            printf("\tpc: %p, addr: %p\n", PointerTo(ProgramCounter(*registers)), info->si_addr);
            show_regs(registers);
            break;
        default:
            return;
    }
    DrainConsole();
    EndFatal(signal);
}

void zv_dbg_init()
{
    ProvideSignalStack();
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
