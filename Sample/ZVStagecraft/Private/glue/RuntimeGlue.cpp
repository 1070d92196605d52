// The runtime's start-up glue: opens its library and finds the entry points. Main thread, except GetKernel.
#include <dlfcn.h>
#include <stdio.h>

#include "stagecraft/IAEKernel.h"
#include "stagecraft/IStagecraft.h"

namespace {

void* s_library = nullptr;
IAEKernel* s_kernel = nullptr;
IAEModule_LoadModuleFunction s_loadModule = nullptr;
IAEModule_UnloadModuleFunction s_unloadModule = nullptr;

bool Fail(const char* reason)
{
    fprintf(stderr, "Failed to load %s: %s\n", IAEMODULE_LIBRARY, reason);
    IAEKernel::UninitializeAEKernel();
    return false;
}

template <class Function>
bool Resolve(const char* name, Function& function)
{
    function = reinterpret_cast<Function>(dlsym(s_library, name));
    return function || Fail(dlerror());
}

}  // namespace

bool IAEKernel::InitializeAEKernel(int argc, const char* const* argv)
{
    if (s_kernel) return true;
    s_library = dlopen(IAEMODULE_LIBRARY, RTLD_NOW | RTLD_GLOBAL);
    if (!s_library) return Fail(dlerror());

    IAEModule_InitializeKernelFunction initialize = nullptr;
    if (!Resolve(IAEMODULE_LOAD_MODULE, s_loadModule) || !Resolve(IAEMODULE_INITIALIZE_KERNEL, initialize) ||
        !Resolve(IAEMODULE_UNLOAD_MODULE, s_unloadModule)) {
        return false;
    }
    s_kernel = initialize(argc, argv);
    return s_kernel || Fail("its kernel did not start");
}

void IAEKernel::UninitializeAEKernel()
{
    s_kernel = nullptr;
    s_loadModule = nullptr;
    s_unloadModule = nullptr;
    if (s_library) dlclose(s_library);
    s_library = nullptr;
}

IAEKernel* IAEKernel::GetKernel()
{
    return s_kernel;
}

namespace ae {
namespace stagecraft {

IStagecraft* IStagecraft::InitializeStagecraftLibrary(int argc, const char* const* argv)
{
    if (!IAEKernel::InitializeAEKernel(argc, argv)) return nullptr;
    return static_cast<IStagecraft*>(s_loadModule(IAEMODULE_STAGECRAFT));
}

void IStagecraft::UninitializeStagecraftLibrary()
{
    if (s_unloadModule) s_unloadModule(IAEMODULE_STAGECRAFT);
    IAEKernel::UninitializeAEKernel();
}

}  // namespace stagecraft
}  // namespace ae
