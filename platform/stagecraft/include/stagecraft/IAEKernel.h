// The runtime's kernel, and the three entry points by which a host reaches the runtime library.
//
// The library is "libIAEKernel.so". A host opens it with dlopen and resolves the entry points with dlsym; it links
// against nothing of it, and the library must not need any symbol of the host. What crosses the border are the abstract
// classes of these headers and their header-only values.
#pragma once

class IAEKernel {
public:
    // A mutex that is not recursive. Any thread may lock it; the thread that locked it must unlock it.
    class Mutex {
    public:
        virtual void Lock() = 0;  // blocks until the mutex is free
        virtual void Unlock() = 0;

    protected:
        virtual ~Mutex() {}
    };

    // ---- Start-up glue, carried in the host. Main thread.

    // Opens the library and initialises its kernel. false: the reason was printed to the error stream.
    static bool InitializeAEKernel(int argc, const char* const* argv);
    // Closes the library: nothing that came from it may be used any more.
    static void UninitializeAEKernel();
    // Null before InitializeAEKernel succeeded and after UninitializeAEKernel. Any thread between the two.
    static IAEKernel* GetKernel();

    // ---- Implemented by the runtime. Any thread.

    // A usage fault: the caller broke a rule of an interface (a null pointer where none is allowed). Must print the
    // failed expression, file, line and function as one line on the error stream and abort the process; never returns.
    virtual void AssertionFailed(const char* pExpression, const char* pFile, int line, const char* pFunction) = 0;

    // A new unlocked mutex, or null when memory is short. Ends with DestroyMutex, in any case before the kernel does.
    virtual Mutex* CreateMutex() = 0;
    // The mutex must be unlocked. Null is allowed and does nothing.
    virtual void DestroyMutex(Mutex* pMutex) = 0;

protected:
    virtual ~IAEKernel() {}
};

// Reports a usage fault unless the expression holds. The kernel must be initialised.
#define AE_USAGE_CHECK(expression)       \
    ((expression) ? static_cast<void>(0) \
                  : IAEKernel::GetKernel()->AssertionFailed(#expression, __FILE__, __LINE__, __func__))

// ---- Entry points. The library must export them with C linkage under exactly the names below; all are called on the
// main thread.

#define IAEMODULE_LIBRARY "libIAEKernel.so"
#define IAEMODULE_INITIALIZE_KERNEL "IAEModule_IAEKernel_InitializeKernel"
#define IAEMODULE_LOAD_MODULE "IAEModule_IAEKernel_LoadModule"
#define IAEMODULE_UNLOAD_MODULE "IAEModule_IAEKernel_UnloadModule"

// The name under which the runtime interface (ae::stagecraft::IStagecraft) is loaded.
#define IAEMODULE_STAGECRAFT "IStagecraft"

extern "C" {
// Makes the kernel ready and returns it; null on failure. The vector is only read during the call. The kernel is owned
// by the library and lives until the library is closed; further calls return the same kernel.
typedef IAEKernel* (*IAEModule_InitializeKernelFunction)(int argc, const char* const* argv);

// The interface of the module with that name as a pointer to its interface class ("IStagecraft": IStagecraft*); null
// for an unknown or null name, and before the kernel was initialised. A module exists once: loading it again returns
// the same pointer.
typedef void* (*IAEModule_LoadModuleFunction)(const char* pModuleName);

// Ends the module; its interface pointer and what came from it must not be used any more. A name that is not loaded,
// unknown or null does nothing. Every stage-window set must have been destroyed before.
typedef void (*IAEModule_UnloadModuleFunction)(const char* pModuleName);
}
