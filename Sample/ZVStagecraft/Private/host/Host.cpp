#include "Host.h"

#include <stdio.h>

#include "ExitDecision.h"
#include "HostConsole.h"
#include "IpcChannel.h"
#include "ZVCfgLibAE.h"
#include "ZVMutex.h"
#include "ZVWSLibAE.h"
#include "player/Drm.h"
#include "player/ZVPlayerLibAE.h"
#include "stagecraft/IStagecraft.h"

using ae::stagecraft::IStagecraft;
using ae::stagecraft::StageWindow;

namespace {

// The runtime while its movie can be asked to end. The mutex is held over every request, so that none reaches a runtime
// that is being unloaded.
ZVMutex s_mutex;
IStagecraft* s_runtime ZV_GUARDED_BY(s_mutex) = nullptr;
bool s_exitWanted ZV_GUARDED_BY(s_mutex) = false;

// The player's remote control sends the key and its release.
void RequestStop(IStagecraft& runtime)
{
    runtime.SendRequest(IStagecraft::kRequestStop);
    runtime.SendRequest(IStagecraft::kRequestStop);
}

// Null withdraws it. A close that came before is handed to the runtime now.
void Publish(IStagecraft* runtime)
{
    const ZVMutexLock lock(s_mutex);
    s_runtime = runtime;
    if (runtime && s_exitWanted) RequestStop(*runtime);
}

template <class Class>
void Register(IStagecraft& runtime)
{
    const AEError error = runtime.RegisterExtensionClass<Class>();
    if (error != AEError_OK) {
        fprintf(stderr, "zv_stagecraft: the class %s was not registered: %s\n", Class::GetClassName(),
                error.m_errorName);
    }
}

void RegisterExtensionClasses(IStagecraft& runtime)
{
    Register<ZVWSLibAE>(runtime);
    Register<ZVCfgLibAE>(runtime);
    Register<ZVPlayerLibAE>(runtime);
}

void StopDrm()
{
    const int result = Ipriv_drm_Terminate();
    if (result != 0) HostPrint("\n[ZV_FLASH] Ipriv_drm_Terminate fail.ret = %d \n", result);
}

// From the stage-window set's creation to its end.
void RunMovie(IStagecraft& runtime, int argc, const char** argv)
{
    AEArray<StageWindow*> windows(8);
    if (runtime.CreateAndConfigureStageWindowSet(windows, argc, argv, 1) != AEError_OK) {
        HostPrint("[ZV_FLASH]CreateAndConfigureStageWindowSet fail ");
    } else {
        HostPrint("[ZV_FLASH]Start ZV FLASH Now ");
        Publish(&runtime);
        runtime.RunStageWindowSet(windows);
        HostPrint("[ZV_FLASH] ZV FLASH Run Over! ");
    }
    StopDrm();
    if (ExitDecision::Get().ChooseActiveExit()) {
        HostPrint("[ZV_FLASH] zv_stagecraft_finalize_proc calling! Active Exit ");
        zv_stagecraft_finalize_proc();
    }
    runtime.DestroyStageWindowSet(windows);
}

}  // namespace

int main_zv_stagecraft(int argc, const char** argv)
{
    IStagecraft* runtime = IStagecraft::InitializeStagecraftLibrary(argc, argv);
    if (runtime) {
        RegisterExtensionClasses(*runtime);
        RunMovie(*runtime, argc, argv);
    }
    Publish(nullptr);
    IStagecraft::UninitializeStagecraftLibrary();
    HostPrint("[ZV_FLASH] ZV FLASH Run End ");
    if (ExitDecision::Get().NeedsRelease()) {
        HostPrint("[ZV_FLASH] Not active exit, release resource ");
        zv_stagecraft_exit_by_bdp_release();
    }
    return 0;
}

int exit_zv_stagecraft()
{
    HostPrint("<ZV_FLASH> exit_zv_stagecraft enter! ");
    {
        const ZVMutexLock lock(s_mutex);
        s_exitWanted = true;
        if (s_runtime) RequestStop(*s_runtime);
    }
    HostPrint("<ZV_FLASH> exit_zv_stagecraft leave! ");
    return 0;
}
