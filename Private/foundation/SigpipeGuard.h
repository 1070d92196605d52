#pragma once

#include <signal.h>

/// While one exists, a connection that the peer has reset does not kill the process: SIGPIPE is blocked in the calling
/// thread and taken off it afterwards. The process's own handling of the signal stays as it is.
class SigpipeGuard {
public:
    SigpipeGuard();
    ~SigpipeGuard();
    SigpipeGuard(const SigpipeGuard&) = delete;
    SigpipeGuard& operator=(const SigpipeGuard&) = delete;

private:
    sigset_t m_Before;
    bool m_WasPending;
};
