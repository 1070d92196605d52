#include "SignalStack.h"

#include <signal.h>
#include <sys/mman.h>

namespace {

constexpr size_t kSize = 1 << 16;  // reserved; memory is taken when it is used

}  // namespace

SignalStack::SignalStack()
{
    stack_t current;
    if (sigaltstack(nullptr, &current) != 0 || !(current.ss_flags & SS_DISABLE)) return;
    void* memory = mmap(nullptr, kSize, PROT_READ | PROT_WRITE, MAP_PRIVATE | MAP_ANONYMOUS, -1, 0);
    if (memory == MAP_FAILED) return;
    m_Memory = memory;
    stack_t own = {};
    own.ss_sp = memory;
    own.ss_size = kSize;
    sigaltstack(&own, nullptr);
}

SignalStack::~SignalStack()
{
    if (!m_Memory) return;
    stack_t none = {};
    none.ss_flags = SS_DISABLE;
    sigaltstack(&none, nullptr);
    munmap(m_Memory, kSize);
}
