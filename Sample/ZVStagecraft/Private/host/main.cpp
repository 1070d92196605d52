// zv_stagecraft: the storefront's interface as one process of the player. Its last argument chooses the variant, 0
// to 5.
#include <malloc.h>
#include <stdlib.h>

#include "CrashHandler.h"
#include "Host.h"
#include "HostConsole.h"
#include "IpcChannel.h"
#include "player/Drm.h"

namespace {

#define ZV_FILES(folder, tag)                                                                              \
    "configurationFile=/misc/zorvane/" folder tag "credentials.xml&settingsFile=/misc/zorvane/" folder tag \
    "preference.xml"

constexpr int kUITypes = 6;
constexpr int kGenericUIType = 5;

const char* const kFlashVars[kUITypes] = {
    ZV_FILES("north/", "alpha") "&defaultCountryID=1&defaultRegionCode=00",
    ZV_FILES("south/", "alpha") "&defaultCountryID=41&defaultRegionCode=00",
    ZV_FILES("", "beta"),
    ZV_FILES("", "gamma"),
    ZV_FILES("", "delta"),
    ZV_FILES("", "gen"),
};

const char* const kMovies[kUITypes] = {
    "/usr/share/zorvane/zvcesdk2_alpha.swf", "/usr/share/zorvane/zvcesdk2_alpha.swf",
    "/usr/share/zorvane/zvcesdk2_beta.swf",  "/usr/share/zorvane/zvcesdk2_gamma.swf",
    "/usr/share/zorvane/zvcesdk2_delta.swf", "/usr/share/zorvane/zvcesdk2_gen.swf",
};

// The type is whatever the last argument says, the program's own name included; what has no row is shown as the generic
// variant.
size_t RowOf(int uiType)
{
    return static_cast<size_t>(uiType >= 0 && uiType < kUITypes ? uiType : kGenericUIType);
}

int RunInterface(int uiType, const char* flashVars)
{
    const char* vector[] = {"stagecraft",
                            "--bgalpha",
                            "0",
                            "--astrace",
                            "--outputdims",
                            "1280,720",
                            "--keymap",
                            "/usr/local/bin/zorvane/keymap15.xml",
                            "--flashvars",
                            flashVars ? flashVars : kFlashVars[RowOf(uiType)],
                            kMovies[RowOf(uiType)]};
    const int result = Ipriv_drm_Init();
    if (result != 0) {
        HostPrint("\n[ZV_FLASH] Ipriv_drm_Init fail.ret = %d \n", result);
        return -1;
    }
    HostPrint("\n[ZV_FLASH] Ipriv_drm_Init OK.");
    zv_stagecraft_ipc_init();
    start_zv_stagecraft_ipc_listen_thread();
    main_zv_stagecraft(sizeof(vector) / sizeof(*vector), vector);
    WaitForIpcListenThread();
    return 0;
}

}  // namespace

int main(int argc, char** argv)
{
    zv_dbg_init();
    FillStandardStreams();
#ifdef M_ARENA_MAX
    // Every call is a thread of its own: heaps for threads would each keep what was freed in them. They wait for the
    // network, not for each other's allocations.
    mallopt(M_ARENA_MAX, 1);
#endif
    const char* coreDump = getenv("ZV_CORE_DUMP");
    _EN_CORE_DUMP = coreDump && coreDump[0] == '1' && coreDump[1] == '\0';

    const char* flashVars = getenv("ZV_FLASHVARS");
    if (flashVars) HostPrint("** %s **\n", flashVars);
    const int uiType = (argc > 0 ? argv[argc - 1][0] : '\0') - '0';
    HostPrint("[ZV_FLASH]ZV UI type = %d \n", uiType);
    return RunInterface(uiType, flashVars);
}
