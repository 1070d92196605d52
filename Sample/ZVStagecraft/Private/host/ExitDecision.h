// How the process ends: because its movie has ended (active exit), or because the player system asked for it (requested
// close). The main thread and the listen thread both ask here, and nowhere else, so that they never differ, and the
// player system gets one of two messages:
//
//   FINALIZE      the movie has ended by itself. From then on this answers a request, too: the two have crossed.
//   UNINIT_RET    at the end of everything, to a request that came before FINALIZE was on its way, however late.
//
// Neither goes out when the queue broke before.
#pragma once

#include "ZVMutex.h"

class ExitDecision {
public:
    /// The one of the process. Lives as long as it: the listen thread can outlive main.
    static ExitDecision& Get();

    // ---- Listen thread

    /// No further message is received.
    void StopListening();
    bool Listens() const;

    // ---- Any thread

    /// Sets or takes back that the player system wants the close.
    void SetRequested(bool requested);
    bool IsRequested() const;

    // ---- Main thread

    /// The movie is over. Whether it ended by itself: false once the close was requested.
    bool ChooseActiveExit();
    /// To be called before FINALIZE is sent. false when it must not be: the close was requested after all, or nobody
    /// listens to the player system any more.
    bool BeginFinalize();
    /// FINALIZE could not be sent: the player system knows nothing yet.
    void FinalizeFailed();
    /// Asked when all is released: whether UNINIT_RET is due. So it is without any active exit.
    bool NeedsRelease() const;

private:
    enum class State {
        Undecided,
        Active,     // chosen; a request still overrules it
        Finalized,  // told to the player system
    };

    mutable ZVMutex m_Mutex;
    State m_State ZV_GUARDED_BY(m_Mutex) = State::Undecided;
    bool m_Requested ZV_GUARDED_BY(m_Mutex) = false;
    bool m_Listens ZV_GUARDED_BY(m_Mutex) = true;
};
