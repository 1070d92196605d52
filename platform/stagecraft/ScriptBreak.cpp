#include "ScriptBreak.h"

#include <duktape.h>
#include <link.h>
#include <sys/syscall.h>
#include <ucontext.h>
#include <unistd.h>

#include <atomic>
#include <cstdint>

namespace {

constexpr std::chrono::milliseconds kTryAgain{20};

// Read by the signal's handler, on the thread that writes it.
ScriptEntry* volatile s_pEntry = nullptr;

// The engine's code, as the dynamic linker mapped it.
struct CodeRange {
    uintptr_t begin = 0;
    uintptr_t end = 0;
};
CodeRange s_engineCode;

int FindEngineCode(dl_phdr_info* pInfo, size_t, void*)
{
    const auto known = reinterpret_cast<uintptr_t>(&duk_create_heap);
    for (int i = 0; i < pInfo->dlpi_phnum; ++i) {
        const ElfW(Phdr)& segment = pInfo->dlpi_phdr[i];
        const uintptr_t begin = pInfo->dlpi_addr + segment.p_vaddr;
        if (segment.p_type == PT_LOAD && (segment.p_flags & PF_X) && begin <= known &&
            known < begin + segment.p_memsz) {
            s_engineCode.begin = begin;
            s_engineCode.end = begin + segment.p_memsz;
            return 1;
        }
    }
    return 0;
}

uintptr_t InterruptedAt(const void* pContext)
{
    const mcontext_t& machine = static_cast<const ucontext_t*>(pContext)->uc_mcontext;
#if defined(__x86_64__)
    return static_cast<uintptr_t>(machine.gregs[REG_RIP]);
#elif defined(__aarch64__)
    return machine.pc;
#elif defined(__arm__)
    return machine.arm_pc;
#else
    (void)machine;
    return 0;
#endif
}

void OnBreakSignal(int, siginfo_t*, void* pContext)
{
    ScriptEntry* pEntry = s_pEntry;
    const uintptr_t at = InterruptedAt(pContext);
    if (pEntry && s_engineCode.begin <= at && at < s_engineCode.end) siglongjmp(pEntry->env, 1);
}

int BreakSignal()
{
    return SIGRTMIN + 5;
}

}  // namespace

bool EnterScript(void (*function)(void*), void* pData)
{
    ScriptEntry entry;
    entry.pOuter = s_pEntry;
    // The mask is not saved: the handler runs with SA_NODEFER, and saving it would be a system call for every
    // operation.
    if (sigsetjmp(entry.env, 0) != 0) {
        s_pEntry = entry.pOuter;
        return false;
    }
    s_pEntry = &entry;
    std::atomic_signal_fence(std::memory_order_seq_cst);
    function(pData);
    std::atomic_signal_fence(std::memory_order_seq_cst);
    s_pEntry = entry.pOuter;
    return true;
}

ScriptEntry* EnterNative()
{
    ScriptEntry* pEntry = s_pEntry;
    s_pEntry = nullptr;
    return pEntry;
}

void LeaveNative(ScriptEntry* pEntry, bool broken)
{
    s_pEntry = pEntry;
    if (broken && pEntry) siglongjmp(pEntry->env, 1);
}

BreakTimer::BreakTimer()
{
    if (!s_engineCode.end) dl_iterate_phdr(FindEngineCode, nullptr);

    struct sigaction action {};
    action.sa_sigaction = OnBreakSignal;
    action.sa_flags = SA_SIGINFO | SA_RESTART | SA_NODEFER;
    sigemptyset(&action.sa_mask);
    sigaction(BreakSignal(), &action, &m_Previous);

    sigevent event{};
    event.sigev_notify = SIGEV_THREAD_ID;
    event.sigev_signo = BreakSignal();
    event._sigev_un._tid = static_cast<pid_t>(syscall(SYS_gettid));
    m_Created = timer_create(CLOCK_MONOTONIC, &event, &m_Timer) == 0;
}

BreakTimer::~BreakTimer()
{
    if (m_Created) timer_delete(m_Timer);
    sigaction(BreakSignal(), &m_Previous, nullptr);
}

bool BreakTimer::Start(std::chrono::milliseconds delay)
{
    const auto toTimespec = [](std::chrono::milliseconds time) {
        return timespec{static_cast<time_t>(time.count() / 1000), static_cast<long>(time.count() % 1000 * 1000000)};
    };
    const itimerspec when{toTimespec(kTryAgain), toTimespec(delay)};
    return m_Created && timer_settime(m_Timer, 0, &when, nullptr) == 0;
}
