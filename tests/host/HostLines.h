// What the host prints, as the sequences of its two threads.
#pragma once

#include "Process.h"

// Main thread, up to the runtime.
inline Lines StartLines(const std::string& uiType = "5")
{
    return {"[ZV_FLASH]ZV UI type = " + uiType + " ",
            "",
            "[ZV_FLASH] Ipriv_drm_Init OK.",
            "[ZV_FLASH] zv_stagecraft_ipc_init enter ",
            "<ZV_FLASH>,start_zv_stagecraft_ipc_listen_thread enter ",
            "<ZV_FLASH>,start_zv_app_ipc_listen_thread create ok! "};
}

inline Lines MovieLines(const Lines& traces = {})
{
    return Lines{"[ZV_FLASH]Start ZV FLASH Now "} + traces + Lines{"[ZV_FLASH] ZV FLASH Run Over! "};
}

inline Lines ExitLines()
{
    return {"<ZV_FLASH> exit_zv_stagecraft enter! ", "<ZV_FLASH> exit_zv_stagecraft leave! "};
}

// Main thread, when the exit is the movie's own, up to what depends on the listen thread.
inline Lines FinalizeLines()
{
    return Lines{"[ZV_FLASH] zv_stagecraft_finalize_proc calling! Active Exit ",
                 "[ZV_FLASH]Call----> zv_stagecraft_finalize_proc "} +
           ExitLines() + Lines{"[ZV_FLASH] stop_zv_app_ipc_listen_thread Enter! "};
}

inline Lines ActiveExitLines()
{
    return FinalizeLines() + Lines{"[ZV_FLASH] STOP: send FINALIZE msg to BDP ", "[ZV_FLASH] ZV FLASH Run End "};
}

inline Lines ReleaseLines()
{
    return {"[ZV_FLASH] ZV FLASH Run End ", "[ZV_FLASH] Not active exit, release resource ",
            "[ZV_FLASH]Call----> zv_stagecraft_exit_by_bdp_release "};
}

// Listen thread: each message as it is received.
inline Lines ListenLines(const std::vector<Lines>& messages)
{
    Lines lines = {"<ZV_FLASH> Calling -------> _zv_stagecraft_ipc_listen_thread_main, 0"};
    for (const Lines& message : messages) {
        lines = lines + Lines{"[ZV_FLASH] IPC enter "} + message;
    }
    return lines + Lines{"<ZV_FLASH> ipc listener thread main has exit!"};
}

inline Lines InitMessage()
{
    return {"[ZV_FLASH] IPC get 1 ", "[ZV_FLASH] NETWORK_MSG_STUB_INIT !"};
}
inline Lines UninitMessage()
{
    return Lines{"[ZV_FLASH] IPC get 3 ", "[ZV_FLASH] NETWORK_MSG_STUB_UNINIT !",
                 "[ZV_FLASH]Call----> zv_stagecraft_uninit_proc "} +
           ExitLines();
}
inline Lines DoneMessage()
{
    return {"[ZV_FLASH] IPC get 6 ",
            "[ZV_FLASH] listener thread main,zv_app_recv_ipc_msg() NETWORK_MSG_STUB_FINALIZE_DONE!"};
}
inline Lines NetworkErrorMessage()
{
    return {"[ZV_FLASH] IPC get 7 ",
            "[ZV_FLASH] listener thread main,zv_app_recv_ipc_msg() NETWORK_MSG_STUB_FINALIZE_NETWORK_ERROR!"};
}
inline Lines ReceiveFailure(int error)
{
    return Lines{"[ZV_FLASH]listener thread main, zv_app_recv_ipc_msg() failed! ERR =" + std::to_string(error) +
                     " ,Release flash resource ",
                 "[ZV_FLASH]Call----> zv_stagecraft_uninit_proc "} +
           ExitLines();
}

// Movies.
constexpr char kRunsOn[] = "trace('running'); setInterval(function () {}, 10);";
constexpr char kEndsAtOnce[] = "trace('hello');";
