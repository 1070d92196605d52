#include "SigpipeGuard.h"

#include <errno.h>
#include <time.h>

SigpipeGuard::SigpipeGuard()
{
    sigset_t pipe, pending;
    sigemptyset(&pipe);
    sigaddset(&pipe, SIGPIPE);
    sigpending(&pending);
    m_WasPending = sigismember(&pending, SIGPIPE) == 1;
    pthread_sigmask(SIG_BLOCK, &pipe, &m_Before);
}

SigpipeGuard::~SigpipeGuard()
{
    if (!m_WasPending) {
        sigset_t pipe;
        sigemptyset(&pipe);
        sigaddset(&pipe, SIGPIPE);
        const timespec now = {0, 0};
        while (sigtimedwait(&pipe, nullptr, &now) == -1 && errno == EINTR) {
        }
    }
    pthread_sigmask(SIG_SETMASK, &m_Before, nullptr);
}
