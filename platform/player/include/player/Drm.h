// The player's content-protection library: started before the movie, stopped after it. Main thread only.
#pragma once

extern "C" {
// 0 for success, else the library's own error number. May block for as long as the hardware needs. On failure nothing
// is left to terminate.
int Ipriv_drm_Init(void);

// 0 for success, else the library's own error number; the library counts as stopped either way. Must be harmless when
// the library is not running.
int Ipriv_drm_Terminate(void);
}
