// The kernel and the library's three entry points.
#include <cstdio>
#include <cstdlib>
#include <cstring>
#include <memory>
#include <mutex>
#include <new>

#include "Runtime.h"
#include "stagecraft/IAEKernel.h"

namespace {

class KernelMutex final : public IAEKernel::Mutex {
public:
    void Lock() override { m_Mutex.lock(); }
    void Unlock() override { m_Mutex.unlock(); }

private:
    std::mutex m_Mutex;
};

class Kernel final : public IAEKernel {
public:
    void AssertionFailed(const char* pExpression, const char* pFile, int line, const char* pFunction) override
    {
        fprintf(stderr, "usage fault: %s, file %s, line %d, function %s\n", pExpression, pFile, line, pFunction);
        abort();
    }
    Mutex* CreateMutex() override { return new (std::nothrow) KernelMutex; }
    void DestroyMutex(Mutex* pMutex) override { delete static_cast<KernelMutex*>(pMutex); }
};

bool s_initialized = false;
std::unique_ptr<Runtime> s_runtime;

bool IsStagecraft(const char* pModuleName)
{
    return pModuleName && strcmp(pModuleName, IAEMODULE_STAGECRAFT) == 0;
}

}  // namespace

#define EXPORTED extern "C" __attribute__((visibility("default")))

EXPORTED IAEKernel* IAEModule_IAEKernel_InitializeKernel(int, const char* const*)
{
    static Kernel kernel;
    s_initialized = true;
    return &kernel;
}

EXPORTED void* IAEModule_IAEKernel_LoadModule(const char* pModuleName)
{
    if (!s_initialized || !IsStagecraft(pModuleName)) return nullptr;
    if (!s_runtime) s_runtime = std::make_unique<Runtime>();
    return static_cast<ae::stagecraft::IStagecraft*>(s_runtime.get());
}

EXPORTED void IAEModule_IAEKernel_UnloadModule(const char* pModuleName)
{
    if (IsStagecraft(pModuleName)) s_runtime.reset();
}
