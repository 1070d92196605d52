// The runtime kernel's mutex with the annotations that let Clang check who may touch what.
#pragma once

#include "ZVMutex.h"
#include "stagecraft/IAEKernel.h"

class ZV_THREAD_ATTRIBUTE(capability("mutex")) KernelMutex {
public:
    KernelMutex() : m_Mutex(IAEKernel::GetKernel()->CreateMutex()) { AE_USAGE_CHECK(m_Mutex != nullptr); }
    ~KernelMutex() { IAEKernel::GetKernel()->DestroyMutex(m_Mutex); }
    KernelMutex(const KernelMutex&) = delete;
    KernelMutex& operator=(const KernelMutex&) = delete;

    void lock() ZV_THREAD_ATTRIBUTE(acquire_capability()) { m_Mutex->Lock(); }
    void unlock() ZV_THREAD_ATTRIBUTE(release_capability()) { m_Mutex->Unlock(); }

private:
    IAEKernel::Mutex* m_Mutex;
};

using KernelLock = ZVScopedLock<KernelMutex>;
